// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/project/ProjectJson.h"

#include "app/edl/GenerationReport.h"
#include "standin/base/AttributeList.h"
#include "standin/base/Utf16.h"
#include "standin/project/ProjectForm.h"

#include <utility>

namespace cadrel::app {

using nlohmann::ordered_json;
using standin::Attribute;
using standin::AttributeList;
using standin::AutomationPoint;
using standin::ClipEvent;
using standin::MediaClip;
using standin::Node;
using standin::toUtf8;
using standin::Track;

namespace {

constexpr int Schema = 1;

std::string textOf(const ordered_json& value)
{
    return value.dump(-1, ' ', false, ordered_json::error_handler_t::replace);
}

/// An object without its closing brace, to be gone on with.
std::string openTextOf(const ordered_json& object)
{
    std::string text = textOf(object);
    text.pop_back();
    return text;
}

/// Of binary values the sizes alone: {"CaDrData": {"bytes": 1234}}.
ordered_json toJson(const Attribute& attribute)
{
    if (const auto* integer = std::get_if<Velmark::int64>(&attribute.value))
        return *integer;
    if (const auto* text = std::get_if<std::string>(&attribute.value))
        return *text;
    ordered_json values = ordered_json::object();
    if (const auto* list =
            dynamic_cast<const AttributeList*>(std::get<Velmark::Counted<Velmark::FUnknown>>(attribute.value).get())) {
        for (const auto& [key, bytes] : list->values())
            values[key] = {{"bytes", bytes.size()}};
    }
    return values;
}

ordered_json attributesOf(const Node& node)
{
    ordered_json attributes = ordered_json::object();
    for (const auto& [key, attribute] : node.attributes()) {
        if (!key.starts_with(standin::ProjectForm::KeyPrefix))
            attributes[key] = toJson(attribute);
    }
    return attributes;
}

const char* kindOf(const MediaClip& clip)
{
    return clip.kind() == MediaClip::Kind::Video ? Velmark::TypeWord::Video : Velmark::TypeWord::Audio;
}

} // namespace

ProjectJson::ProjectJson(standin::Project& project, const ProjectClock& clock, const StoredModel& stored, Sink sink)
    : m_project(project), m_clock(clock), m_stored(stored), m_sink(std::move(sink))
{
}

/// Null without one.
ordered_json ProjectJson::lastRun() const
{
    if (m_stored.isUnreadable())
        return {{"unreadable", m_stored.fault()}};
    if (!m_stored.model())
        return nullptr;
    const core::DataModel& model = *m_stored.model();
    const auto list = [](const core::EventList& events) { return describeEventsAsJson(events, edlFilesOf(events)); };
    return {{"old", list(model.oldEdl())},
            {"new", list(model.newEdl())},
            {"change", list(model.changeEdl())},
            {"settings", settingsIn(model, m_project, m_clock).toJson()}};
}

void ProjectJson::write(const std::string& fileName, const Tracks& tracks) const
{
    const Velmark::FrameRateInfo rate = m_project.frameRate();
    using Flag = Velmark::FrameRateInfo::Flag;
    const ordered_json facts{
        {"schema", Schema},
        {"file", fileName},
        {"name", toUtf8(m_project.name())},
        {"frameRate",
         {{"label", m_clock.rateLabel()},
          {"framesPerSecond", rate.framesPerSecond},
          {"dropFrame", (rate.flags & Flag::DropFrame) != 0},
          {"pulledDown", (rate.flags & Flag::PulledDown) != 0}}},
        {"timeOrigin", {{"seconds", m_project.timeOrigin()}, {"timecode", m_clock.timecode(0.0)}}},
        {"end", time(m_project.getEnd(nullptr))},
        {"locators", range(m_project.locatorLeft(), m_project.locatorRight())},
        {"cycle", range(m_project.cycleLeft(), m_project.cycleRight())},
        {"position", time(m_project.position().getValue())},
        {"attributes", attributesOf(m_project)},
        {"lastRun", lastRun()},
    };
    m_sink("{\n");
    for (const auto& [key, value] : facts.items())
        m_sink(textOf(key) + ": " + textOf(value) + ",\n");
    m_sink("\"pool\": [");
    const char* separator = "\n";
    for (const auto& [number, clip] : m_project.pool().clips()) {
        m_sink(separator + textOf({{"number", number},
                                   {"kind", kindOf(*clip)},
                                   {"name", toUtf8(clip->name())},
                                   {"file", toUtf8(clip->path())},
                                   {"length", length(clip->seconds())}}));
        separator = ",\n";
    }
    m_sink("\n],\n\"tracks\": [");
    separator = "\n";
    for (const Track* track : tracks) {
        m_sink(separator);
        writeTrack(*track);
        separator = ",\n";
    }
    m_sink("\n]\n}\n");
}

void ProjectJson::writeTrack(const Track& track) const
{
    ordered_json folders = ordered_json::array();
    for (const Track* folder : foldersAround(track))
        folders.push_back(toUtf8(folder->name()));
    m_sink(openTextOf({{"name", toUtf8(track.name())},
                       {"kind", Track::wordOf(track.kind())},
                       {"folders", std::move(folders)},
                       {"locked", track.isLocked()},
                       {"selected", track.selected()},
                       {"attributes", attributesOf(track)}}) +
           ", \"events\": [");
    if (!track.isFolder())
        writeEvents(track, 0.0, 0);
    m_sink("], \"automation\": [");
    const char* separator = "\n";
    for (const auto& [number, curve] : track.curves()) {
        if (curve->childCount() == 0)
            continue;
        m_sink(separator);
        writeCurve(*curve);
        separator = ",\n";
    }
    m_sink("]}");
}

void ProjectJson::writeEvents(const standin::Container& container, double start, std::size_t depth) const
{
    const char* separator = "\n";
    visitEvents(container, start, depth, [&](const PlacedEvent& placed) {
        m_sink(separator);
        separator = ",\n";
        const ordered_json facts = factsOf(placed);
        if (!dynamic_cast<const standin::Part*>(&placed.event)) {
            m_sink(textOf(facts));
            return;
        }
        m_sink(openTextOf(facts) + ", \"events\": [");
        writeEvents(placed.event, placed.start, depth + 1);
        m_sink("]}");
    });
}

void ProjectJson::writeCurve(const standin::Envelope& curve) const
{
    m_sink(openTextOf({{"curve", curve.number()}, {"name", nameOfCurve(curve.number())}}) + ", \"points\": [");
    const char* separator = "\n";
    for (const Node* point = curve.firstChild(); point; point = curve.childBehind(*point)) {
        ordered_json facts = time(point->start());
        facts["value"] = static_cast<const AutomationPoint*>(point)->value();
        m_sink(separator + textOf(facts));
        separator = ",\n";
    }
    m_sink("]}");
}

ordered_json ProjectJson::time(double seconds) const
{
    return {{"seconds", seconds}, {"timecode", m_clock.timecode(seconds)}};
}

ordered_json ProjectJson::length(double seconds) const
{
    return {{"seconds", seconds}, {"timecode", m_clock.length(seconds)}};
}

ordered_json ProjectJson::range(standin::Parameter& left, standin::Parameter& right) const
{
    return {{"left", time(left.getValue())}, {"right", time(right.getValue())}};
}

ordered_json ProjectJson::factsOf(const PlacedEvent& placed) const
{
    ordered_json facts{{"kind", kindOf(placed.event)},
                       {"name", toUtf8(placed.event.name())},
                       {"start", time(placed.start)},
                       {"end", time(placed.end)},
                       {"length", length(placed.event.length())}};
    if (const auto* clipEvent = dynamic_cast<const ClipEvent*>(&placed.event)) {
        const MediaClip* clip = clipEvent->clip();
        facts["clip"] =
            clip ? ordered_json{{"number", clip->number()}, {"name", toUtf8(clip->name())}} : ordered_json();
        facts["sourceOffset"] = length(clipEvent->sourceOffset());
    }
    facts["selected"] = placed.event.selected();
    facts["attributes"] = attributesOf(placed.event);
    return facts;
}

} // namespace cadrel::app
