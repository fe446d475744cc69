// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/ApplyListing.h"

#include "app/console/Columns.h"
#include "app/console/Printable.h"
#include "app/console/Wording.h"
#include "app/edl/ScreenTimecode.h"
#include "app/notes/SoundWording.h"
#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/time/Timecode.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>
#include <ostream>
#include <string>
#include <vector>

namespace cadrel::app {

using standin::Track;

namespace {

std::string secondsText(double seconds)
{
    std::array<char, 32> text{};
    std::snprintf(text.data(), text.size(), "%.1f s", seconds);
    return text.data();
}

std::string nameOf(const Placement& placement)
{
    const std::u16string& name = placement.name.empty() && placement.clip ? placement.clip->name() : placement.name;
    const std::string text =
        printableName(name, placement.isMarker() ? MostCharactersOfAMarker : MostCharactersOfAName);
    return placement.part.empty() ? text : text + " (in " + printableName(placement.part) + ")";
}

/// "moved, trimmed by 00:00:00:18 at the end".
std::string inWords(const Fate& fate, const ProjectClock& clock)
{
    std::vector<std::string> words;
    if (fate.isLost())
        words.emplace_back("fell out");
    if (fate.isMoved)
        words.emplace_back("moved");
    std::string trimmed;
    const auto trim = [&](double seconds, const char* where) {
        if (seconds > 0.0)
            trimmed += (trimmed.empty() ? "trimmed by " : " and ") + clock.exactLength(seconds) + where;
    };
    trim(fate.lostAtStart, " at the start");
    trim(fate.lostBetween, " in the middle");
    trim(fate.lostAtEnd, " at the end");
    if (!trimmed.empty())
        words.push_back(trimmed);
    if (fate.isSplit)
        words.emplace_back("split");
    if (fate.isDoubled)
        words.emplace_back("doubled");
    return joined(words);
}

/// In the order of the columns of the moves.
const Columns::Row MoveTitles{"was in", "was out", "now in", "now out", "shift", "clip or marker", "became"};

/// A row for each piece, or one for what is lost.
std::vector<Columns::Row> rowsOf(const Fate& fate, const ProjectClock& clock)
{
    const auto isInstant = [](const Placement& placement) { return placement.kind == Placement::Kind::Point; };
    const auto endOf = [&](const Placement& placement) {
        return isInstant(placement) ? std::string() : clock.exactTimecode(placement.end);
    };
    Columns::Row row{clock.exactTimecode(fate.before.start),
                     endOf(fate.before),
                     "",
                     "",
                     "",
                     nameOf(fate.before),
                     inWords(fate, clock)};
    std::vector<Columns::Row> rows;
    for (const Piece& piece : fate.pieces) {
        row[2] = clock.exactTimecode(piece.now.start);
        row[3] = endOf(piece.now);
        row[4] = std::abs(piece.shift) > standin::SameInstant
                     ? std::string(piece.shift > 0.0 ? "+" : "").append(clock.exactLength(piece.shift))
                     : std::string();
        rows.push_back(row);
        // The rows after the first are about the same clip.
        row[0].clear();
        row[1].clear();
        row[6].clear();
    }
    if (rows.empty())
        rows.push_back(row);
    return rows;
}

Columns::Row rowOfNew(const Placement& placement, const ProjectClock& clock)
{
    return {"",   "", clock.exactTimecode(placement.start), clock.exactTimecode(placement.end), "", nameOf(placement),
            "new"};
}

std::string pathOf(const Track& track)
{
    std::vector<std::string> facts{Track::wordOf(track.kind())};
    for (const Track* const folder : foldersAround(track))
        facts.push_back("in " + printableName(folder->name()));
    if (track.isLocked())
        facts.emplace_back("locked");
    return printableName(track.name()) + " (" + joined(facts) + ")";
}

std::string eventText(const core::EventBase& event)
{
    std::array<char, 8> number{};
    std::snprintf(number.data(), number.size(), "%03u", event.eventNumber());
    const core::Framerate framerate = core::Timecode::framerate();
    return std::string(number.data()) + "  " + onScreen(event.dstIn().toString(), framerate) + "  " +
           onScreen(event.dstOut().toString(), framerate) + "  " +
           toPrintable(event.rollName(), MostCharactersOfAName).text;
}

/// Of more there is a count; the JSON has all.
constexpr std::size_t MostLinesOfAKind = 10;

std::string restText(std::size_t count)
{
    return count <= MostLinesOfAKind
               ? std::string()
               : "            and " + std::to_string(count - MostLinesOfAKind) + " more; --json lists them all\n";
}

} // namespace

void ApplyListing::printTotals(std::ostream& out) const
{
    const core::DataModel& model = m_facts.model;
    const std::string rate = m_clock.rateInWords() + ", as the project has it";
    out << "Project     " << toPrintable(m_facts.projectName).text << '\n';
    if (m_facts.generation)
        out << m_facts.generation->cutsText(rate) << m_facts.generation->changeText();
    else
        out << "Frame rate  " << rate << '\n'
            << "Change EDL  " << describeEvents(model.changeEdl(), m_facts.changeNames, countOf(m_facts.changeUnread))
            << '\n';
    if (m_facts.settings)
        out << m_facts.settings->text("Settings    ");
    if (!m_facts.matchText.empty())
        out << "Match       " << m_facts.matchText << '\n';
    if (m_facts.isRunNeeded)
        out << "Applied     " << counted(m_facts.appliedCount, "event") << " in " << secondsText(m_facts.seconds)
            << '\n';
    else if (m_facts.isHeldBack)
        out << "Applied     nothing, since all that would change lies outside of the stretch that may change\n";
    else
        out << "Applied     nothing, since no track has to change\n";
    printPassedOver(out);
    printLost(out);

    printClips(out);
    printStaying(out);
    printWritten(out);
}

void ApplyListing::printPassedOver(std::ostream& out) const
{
    if (m_facts.passedOver.empty())
        return;
    out << "Passed over " << counted(m_facts.passedOver.size(), "event") << '\n';
    const std::size_t shown = std::min(m_facts.passedOver.size(), MostLinesOfAKind);
    for (std::size_t index = 0; index < shown; ++index) {
        const PassedOver& passed = m_facts.passedOver[index];
        out << "            " << eventText(*passed.event) << ": " << passed.reason << '\n';
    }
    out << restText(m_facts.passedOver.size());
}

void ApplyListing::printLost(std::ostream& out) const
{
    const auto timeText = [this](double seconds) { return m_clock.exactTimecode(seconds - m_facts.timeOrigin); };
    const char* title = "Lost        ";
    const char* const why = m_facts.generation ? ", for want of room\n" : ", which the change EDL carries nowhere\n";
    const std::size_t shown = std::min(m_facts.lost.size(), MostLinesOfAKind);
    for (std::size_t index = 0; index < shown; ++index) {
        const core::SecondsRange& range = m_facts.lost[index];
        out << title << timeText(range.start) << " - " << timeText(range.end) << why;
        title = "            ";
    }
    out << restText(m_facts.lost.size());
}

void ApplyListing::printClips(std::ostream& out) const
{
    core::SoundCount clips;
    core::SoundCount markers;
    for (const TrackComparison* const track : m_facts.userTracks())
        (track->track->kind() == Track::Kind::Marker ? markers : clips) += countOf(*track);
    out << "Clips       " << inWords(clips) << '\n';
    if (markers.all + markers.added > 0)
        out << "Own markers " << inWords(markers) << '\n';
    std::vector<std::string> marked;
    for (const TrackComparison* const track : m_facts.markedTracks())
        marked.push_back(std::to_string(track->added.size()) + " " + printableName(track->track->name()));
    out << "New markers " << (marked.empty() ? "none" : joined(marked)) << '\n';
}

void ApplyListing::printStaying(std::ostream& out) const
{
    const char* title = "Stays       ";
    for (const std::string& what : m_facts.staying) {
        out << title << toPrintable(what).text << '\n';
        title = "            ";
    }
}

void ApplyListing::printWritten(std::ostream& out) const
{
    std::vector<std::string> written;
    for (const std::string& file : {m_facts.written, m_facts.notesFile, m_facts.jsonFile}) {
        if (!file.empty())
            written.push_back(toPrintable(file).text);
    }
    if (m_facts.written.empty())
        written.emplace_back("no project; give -o PROJECT.stage or --in-place");
    out << "Written     " << joined(written) << '\n';
    for (const auto* const backups : {&m_facts.projectBackups, &m_facts.notesBackups, &m_facts.reportBackups}) {
        for (const std::string& backup : *backups)
            out << "Backup      " << toPrintable(backup).text << '\n';
    }
}

void ApplyListing::printTrackTotals(std::ostream& out) const
{
    const auto rowOf = [](const TrackComparison& track) {
        const auto cell = [](std::size_t number) { return number == 0 ? std::string() : std::to_string(number); };
        const core::SoundCount count = countOf(track);
        return Columns::Row{pathOf(*track.track), cell(count.all),     cell(count.stay),
                            cell(count.moved),    cell(count.trimmed), cell(count.split),
                            cell(count.doubled),  cell(count.lost),    cell(count.added)};
    };
    Columns columns({"track", "holds", "stay", "moved", "trimmed", "split", "doubled", "fell out", "new"},
                    {1, 2, 3, 4, 5, 6, 7, 8});
    for (const TrackComparison* const track : m_facts.userTracks())
        columns.measure(rowOf(*track));
    out << columns.titleLine() << '\n';
    for (const TrackComparison* const track : m_facts.userTracks())
        out << columns.lineOf(rowOf(*track)) << '\n';
}

void ApplyListing::printMoves(std::ostream& out) const
{
    const auto visitMoves = [this](const TrackComparison& track, auto visit) {
        for (const Fate& fate : track.fates) {
            if (fate.stays())
                continue;
            for (const Columns::Row& row : rowsOf(fate, m_clock))
                visit(row);
        }
        for (const Placement& placement : track.added)
            visit(rowOfNew(placement, m_clock));
    };
    Columns columns(MoveTitles);
    for (const TrackComparison* const track : m_facts.userTracks())
        visitMoves(*track, [&](const Columns::Row& row) { columns.measure(row); });

    printTrackTotals(out);
    for (const TrackComparison* const track : m_facts.userTracks()) {
        if (countOf(*track).stay == track->fates.size() && track->added.empty())
            continue;
        out << '\n' << pathOf(*track->track) << "\n  " << columns.titleLine() << '\n';
        visitMoves(*track, [&](const Columns::Row& row) { out << "  " << columns.lineOf(row) << '\n'; });
    }
}

void ApplyListing::printMarkers(std::ostream& out) const
{
    const auto rowOf = [this](const Placement& marker) {
        return Columns::Row{m_clock.exactTimecode(marker.start), m_clock.exactTimecode(marker.end),
                            m_clock.exactLength(marker.length()), printableName(marker.name, MostCharactersOfAMarker)};
    };
    Columns columns({"in", "out", "length", "marker"});
    for (const TrackComparison* const track : m_facts.markedTracks()) {
        for (const Placement& marker : track->added)
            columns.measure(rowOf(marker));
    }
    const char* separator = "";
    for (const TrackComparison* const track : m_facts.markedTracks()) {
        out << separator << printableName(track->track->name()) << ", " << counted(track->added.size(), "marker")
            << "\n  " << columns.titleLine() << '\n';
        separator = "\n";
        for (const Placement& marker : track->added)
            out << "  " << columns.lineOf(rowOf(marker)) << '\n';
    }
}

} // namespace cadrel::app
