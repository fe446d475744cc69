// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/project/ProjectListing.h"

#include "app/console/Printable.h"
#include "app/console/Wording.h"
#include "app/edl/GenerationReport.h"
#include "host/track/TrackRole.h"
#include "standin/base/AttributeList.h"
#include "standin/base/Utf16.h"
#include "standin/project/ProjectForm.h"
#include "util/StringUtil.h"
#include "velmark/Attributes.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstdio>
#include <map>
#include <optional>
#include <ostream>

namespace cadrel::app {

using host::TrackRole;
using standin::Attribute;
using standin::AttributeList;
using standin::AutomationPoint;
using standin::ClipEvent;
using standin::Event;
using standin::MediaClip;
using standin::Node;
using standin::toUtf8;
using standin::Track;
using util::StringUtil;
using Velmark::AttributeKey;

namespace {

constexpr std::size_t MostCharactersOfAValue = 120;
/// Deeper levels aren't indented any further.
constexpr std::size_t DeepestIndentation = 8;
/// For a curve with more points, only the first and the last are shown.
constexpr std::size_t MostPoints = 8;
constexpr std::size_t FirstPoints = 4;
constexpr std::size_t LastPoints = 2;

constexpr std::string_view Bold = "\033[1m";
constexpr std::string_view Red = "\033[31m";
constexpr std::string_view Green = "\033[32m";
constexpr std::string_view Plain = "\033[0m";

const Columns::Row EventTitles{"kind", "in", "out", "length", "name", "clip", "from"};
const Columns::Row MarkerTitles{"kind", "in", "out", "length", "name", "", ""};

constexpr std::size_t NameColumn = 4;
constexpr std::size_t ClipColumn = 5;
constexpr std::size_t SourceColumn = 6;

bool isMarker(const Event& event)
{
    return dynamic_cast<const standin::Marker*>(&event) != nullptr;
}

std::string indentation(std::size_t depth)
{
    return std::string(2 * std::min(depth, DeepestIndentation), ' ');
}

std::string textOf(const Attribute& attribute)
{
    if (const auto* integer = std::get_if<Velmark::int64>(&attribute.value))
        return std::to_string(*integer);
    if (const auto* text = std::get_if<std::string>(&attribute.value))
        return quoted(toPrintable(*text, MostCharactersOfAValue).text);
    std::vector<std::string> values;
    if (const auto* list =
            dynamic_cast<const AttributeList*>(std::get<Velmark::Counted<Velmark::FUnknown>>(attribute.value).get())) {
        for (const auto& [key, bytes] : list->values())
            values.push_back(toPrintable(key, MostCharactersOfAName).text + " of " + counted(bytes.size(), "byte"));
    }
    return std::string("(") + joined(values) + ")";
}

/// What a role of a track means; empty for a number that means nothing.
std::string roleInWords(Velmark::int64 stored)
{
    const auto role = static_cast<std::int32_t>(stored & ~Velmark::int64{TrackRole::OwnVideo});
    if (role < TrackRole::Destination || role > TrackRole::OldVideo)
        return {};
    const std::string own = role == stored ? "" : ", with a video of your own";
    return "Cadrel's track: " + StringUtil::toUtf8(TrackRole::nameOf(role)) + own;
}

/// What an attribute of Cadrel's own says to people, which may be nothing; null for another.
std::optional<std::string> meaningOf(const std::string& key, const Attribute& attribute)
{
    if (key.starts_with(standin::ProjectForm::KeyPrefix))
        return std::string();
    if (key == AttributeKey::Storage || key == AttributeKey::StorageChecksum || key == AttributeKey::EventUserId ||
        key == AttributeKey::SessionEnd || key == AttributeKey::SessionCutEnd)
        return std::string();
    const auto* const number = std::get_if<Velmark::int64>(&attribute.value);
    const auto* const text = std::get_if<std::string>(&attribute.value);
    if (key == AttributeKey::Reel && text)
        return "reel " + toPrintable(*text, MostCharactersOfAValue).text;
    if (key == AttributeKey::LockState && number)
        return std::string(*number == 1 ? "held locked for a preview" : "");
    const bool isRole =
        key == AttributeKey::MarkerType || key == AttributeKey::VideoType || key == AttributeKey::FolderType;
    if (isRole && number && !roleInWords(*number).empty())
        return roleInWords(*number);
    return std::nullopt;
}

std::vector<std::string> attributesOf(const Node& node)
{
    std::vector<std::string> texts;
    for (const auto& [key, attribute] : node.attributes()) {
        const std::optional<std::string> meaning = meaningOf(key, attribute);
        if (!meaning)
            texts.push_back(toPrintable(key, MostCharactersOfAName).text + " " + textOf(attribute));
        else if (!meaning->empty())
            texts.push_back(*meaning);
    }
    return texts;
}

std::string textOf(double value)
{
    std::array<char, 16> text{};
    std::snprintf(text.data(), text.size(), "%.3f", value);
    return text.data();
}

/// "volume 38, pan 4".
std::string automationOf(const Track& track)
{
    std::vector<std::string> curves;
    for (const auto& [number, curve] : track.curves()) {
        if (curve->childCount() > 0)
            curves.push_back(nameOfCurve(number) + " " + std::to_string(curve->childCount()));
    }
    return joined(curves);
}

/// "24: 13 audio, 1 video, 10 folder".
std::string kindsOf(const Tracks& tracks)
{
    std::map<Track::Kind, std::size_t> counts;
    for (const Track* track : tracks)
        ++counts[track->kind()];
    std::vector<std::string> kinds;
    for (const auto& [kind, count] : counts)
        kinds.push_back(std::to_string(count) + " " + Track::wordOf(kind));
    return std::to_string(tracks.size()) + (kinds.empty() ? "" : ": ") + joined(kinds);
}

/// "96 clips: 95 audio, 1 video".
std::string kindsOf(const standin::MediaPool& pool)
{
    const std::size_t count = pool.clips().size();
    const auto videos =
        static_cast<std::size_t>(std::count_if(pool.clips().begin(), pool.clips().end(), [](const auto& clip) {
            return clip.second->kind() == MediaClip::Kind::Video;
        }));
    return counted(count, "clip") + ": " + std::to_string(count - videos) + " audio, " + std::to_string(videos) +
           " video";
}

std::string stateOf(const Track& track, const std::string& locked, const std::string& selected)
{
    std::vector<std::string> states;
    if (track.isLocked())
        states.push_back(locked);
    if (track.selected())
        states.push_back(selected);
    return joined(states);
}

} // namespace

ProjectListing::ProjectListing(standin::Project& project, const ProjectClock& clock, const StoredModel& stored,
                               bool colour)
    : m_project(project), m_clock(clock), m_stored(stored), m_colour(colour)
{
}

void ProjectListing::printFacts(std::ostream& out, const std::string& fileName) const
{
    const auto range = [this](standin::Parameter& left, standin::Parameter& right) {
        return m_clock.exactTimecode(left.getValue()) + " - " + m_clock.exactTimecode(right.getValue());
    };
    const Tracks tracks = tracksOf(m_project);
    ContentCount content;
    double contentEnd = 0.0;
    for (const Track* track : tracks) {
        content += countContent(*track);
        contentEnd = std::max(contentEnd, track->lastEnd());
    }

    out << "Project      " << toPrintable(fileName).text << '\n';
    if (!m_project.name().empty())
        out << "Name         " << printableName(m_project.name()) << '\n';
    out << "Frame rate   " << m_clock.rateInWords() << '\n';
    out << "Time origin  " << m_clock.exactTimecode(0.0) << '\n';
    out << "End          " << m_clock.exactTimecode(m_project.getEnd(nullptr)) << ", content to "
        << m_clock.exactTimecode(contentEnd) << '\n';
    out << "Locators     " << range(m_project.locatorLeft(), m_project.locatorRight()) << '\n';
    out << "Cycle        " << range(m_project.cycleLeft(), m_project.cycleRight()) << '\n';
    out << "Position     " << m_clock.exactTimecode(m_project.position().getValue()) << '\n';
    out << "Tracks       " << kindsOf(tracks) << '\n';
    out << "Content      " << counted(content.clips, "clip") << ", " << counted(content.parts, "part") << ", "
        << counted(content.markers, "marker") << ", " << counted(content.points, "automation point") << '\n';
    out << "Pool         " << kindsOf(m_project.pool()) << '\n';
    const char* title = "Attributes   ";
    for (const std::string& attribute : attributesOf(m_project)) {
        out << title << attribute << '\n';
        title = "             ";
    }
    printStored(out);
}

void ProjectListing::printStored(std::ostream& out) const
{
    if (m_stored.isUnreadable())
        out << "Last run     " << m_stored.fault() << '\n';
    if (!m_stored.model())
        return;
    const core::DataModel& model = *m_stored.model();
    const auto printList = [&out](const char* title, const core::EventList& events) {
        out << title << (events.isEmpty() ? "none" : describeEvents(events, edlFilesOf(events))) << '\n';
    };
    printList("Old cut      ", model.oldEdl());
    printList("New cut      ", model.newEdl());
    printList("Change EDL   ", model.changeEdl());
    out << settingsIn(model, m_project, m_clock).text("Settings     ");
}

void ProjectListing::printTree(std::ostream& out) const
{
    const Tracks tracks = tracksOf(m_project);
    const auto rowOf = [](const Track& track) {
        const std::size_t events = countContent(track).events();
        return Columns::Row{indentation(foldersAround(track).size()) + printableName(track.name()),
                            Track::wordOf(track.kind()), stateOf(track, "locked", "selected"),
                            events == 0 ? std::string() : std::to_string(events), automationOf(track)};
    };
    Columns columns({"track", "kind", "state", "events", "automation"}, {3});
    for (const Track* track : tracks)
        columns.measure(rowOf(*track));
    out << columns.titleLine() << '\n';
    for (const Track* track : tracks)
        out << columns.lineOf(rowOf(*track)) << '\n';
}

void ProjectListing::printContent(std::ostream& out, const Tracks& tracks) const
{
    Columns columns(EventTitles);
    const auto measure = [&](const PlacedEvent& placed) {
        Columns::Row row = rowOf(placed);
        if (isMarker(placed.event))
            row[NameColumn].clear();
        columns.measure(row);
    };
    for (const Track* track : tracks) {
        if (!track->isFolder())
            visitAllEvents(*track, 0.0, 0, measure);
    }
    const char* separator = "";
    for (const Track* track : tracks) {
        // The tree tells all of a folder that has no attributes.
        if (track->isFolder() && track->attributes().empty() && tracks.size() > 1)
            continue;
        out << separator;
        separator = "\n";
        printHeading(out, *track);
        if (!track->isFolder())
            printEvents(out, *track, columns);
        for (const auto& [number, curve] : track->curves()) {
            if (curve->childCount() > 0)
                printCurve(out, *curve);
        }
    }
}

void ProjectListing::printHeading(std::ostream& out, const Track& track) const
{
    std::vector<std::string> facts{Track::wordOf(track.kind())};
    for (const Track* folder : foldersAround(track))
        facts.push_back(std::string("in ") + printableName(folder->name()));
    const std::string state = stateOf(track, inColour(Red, "locked"), inColour(Green, "selected"));
    if (!state.empty())
        facts.push_back(state);
    out << inColour(Bold, printableName(track.name())) << " (" << joined(facts) << ")\n";
    for (const std::string& attribute : attributesOf(track))
        out << "  " << attribute << '\n';
}

void ProjectListing::printEvents(std::ostream& out, const Track& track, const Columns& columns) const
{
    if (track.childCount() == 0) {
        out << "  empty\n";
        return;
    }
    out << "  " << columns.lineOf(track.hasAutomation() ? EventTitles : MarkerTitles) << '\n';
    const auto print = [&](const PlacedEvent& placed) {
        out << "  " << columns.lineOf(rowOf(placed)) << '\n';
        std::vector<std::string> facts = attributesOf(placed.event);
        if (placed.event.selected())
            facts.insert(facts.begin(), "selected");
        if (!facts.empty())
            out << "    " << indentation(placed.depth) << joined(facts) << '\n';
    };
    visitAllEvents(track, 0.0, 0, print);
}

void ProjectListing::printCurve(std::ostream& out, standin::Envelope& curve) const
{
    const auto textOfPoint = [this](const Node& point) {
        return m_clock.exactTimecode(point.start()) + " " + textOf(static_cast<const AutomationPoint&>(point).value());
    };
    const std::size_t count = curve.childCount();
    const bool isLong = count > MostPoints;
    std::vector<std::string> points;
    const Node* point = curve.firstChild();
    for (std::size_t index = 0; point && index < (isLong ? FirstPoints : count); ++index) {
        points.push_back(textOfPoint(*point));
        point = curve.childBehind(*point);
    }
    if (isLong) {
        points.push_back(std::string("... ") + std::to_string(count - FirstPoints - LastPoints) + " more ...");
        point = curve.lastChild();
        for (std::size_t index = 1; index < LastPoints; ++index)
            point = curve.childBefore(*point);
        for (; point; point = curve.childBehind(*point))
            points.push_back(textOfPoint(*point));
    }
    out << "  " << nameOfCurve(curve.number()) << ", " << counted(count, "point") << ": " << joined(points) << '\n';
}

void ProjectListing::printPool(std::ostream& out) const
{
    const auto rowOf = [this](const MediaClip& clip) {
        return Columns::Row{printableName(clip.name()),
                            clip.kind() == MediaClip::Kind::Video ? Velmark::TypeWord::Video : Velmark::TypeWord::Audio,
                            m_clock.exactLength(clip.seconds()), toPrintable(toUtf8(clip.path())).text};
    };
    Columns columns({"clip", "kind", "length", "file"});
    for (const auto& [number, clip] : m_project.pool().clips())
        columns.measure(rowOf(*clip));
    out << columns.titleLine() << '\n';
    for (const auto& [number, clip] : m_project.pool().clips())
        out << columns.lineOf(rowOf(*clip)) << '\n';
}

Columns::Row ProjectListing::rowOf(const PlacedEvent& placed) const
{
    const Event& event = placed.event;
    const auto* clipEvent = dynamic_cast<const ClipEvent*>(&event);
    const bool isInstant = event.length() == 0.0;
    Columns::Row row{indentation(placed.depth) + kindOf(event),
                     m_clock.exactTimecode(placed.start),
                     isInstant ? "" : m_clock.exactTimecode(placed.end),
                     isInstant ? "" : m_clock.exactLength(event.length()),
                     printableName(event.name(), isMarker(event) ? MostCharactersOfAMarker : MostCharactersOfAName),
                     "",
                     ""};
    if (clipEvent) {
        row[ClipColumn] = clipEvent->clip() ? printableName(clipEvent->clip()->name()) : "(no clip)";
        row[SourceColumn] = m_clock.exactLength(clipEvent->sourceOffset());
    }
    return row;
}

std::string ProjectListing::inColour(std::string_view colour, const std::string& text) const
{
    return m_colour ? std::string(colour) + text + std::string(Plain) : text;
}

} // namespace cadrel::app
