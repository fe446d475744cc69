// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/notes/SoundWording.h"

#include "app/console/Printable.h"
#include "app/console/Wording.h"

#include <algorithm>
#include <array>
#include <initializer_list>
#include <utility>

namespace cadrel::app {

using core::AutomationJump;
using core::SoundChange;
using core::SoundChangeKind;
using core::StepSound;

namespace {

constexpr std::array<std::string_view, 6> KindWords{"head-trimmed", "tail-trimmed", "split",
                                                    "doubled",      "fell-out",     "added"};
static_assert(static_cast<std::size_t>(SoundChangeKind::Added) + 1 == KindWords.size());

/// So many tracks or scenes are named.
constexpr std::size_t MostNames = 4;
constexpr std::size_t MostCharactersOfATrack = 24;
constexpr std::size_t MostCharactersOfAScene = 40;
constexpr std::size_t MostCharactersOfAClip = 40;
/// Of the tracks of a jump, as many are named as have room in so many columns.
constexpr std::size_t MostColumnsOfAJump = 60;

/// "a, b, c and 2 more"; `names` are the first of `count`.
std::string listOf(const std::vector<std::string>& names, std::size_t count)
{
    const std::size_t more = count - names.size();
    return joined(names) + (more == 0 ? "" : " and " + std::to_string(more) + " more");
}

std::string nameOf(const std::string& utf8, std::size_t mostCharacters)
{
    return utf8.empty() ? "(no name)" : toPrintable(utf8, mostCharacters).text;
}

/// "a, b and 2 more"; one is named however long it is.
std::string fittingList(const std::vector<std::string>& names)
{
    std::vector<std::string> shown;
    std::size_t columns = 0;
    for (const std::string& name : names) {
        const std::string text = nameOf(name, MostCharactersOfATrack);
        columns += (shown.empty() ? 0 : 2) + toPrintable(text).width;
        if (!shown.empty() && columns > MostColumnsOfAJump)
            break;
        shown.push_back(text);
    }
    return listOf(shown, names.size());
}

/// "3 trimmed, 2 split": those that aren't 0.
std::string numbersText(std::initializer_list<std::pair<std::size_t, const char*>> numbers)
{
    std::vector<std::string> parts;
    for (const auto& [number, what] : numbers) {
        if (number > 0)
            parts.push_back(std::to_string(number) + " " + what);
    }
    return joined(parts);
}

/// ": 20 stay, 250 moved"; empty for none.
std::string fatesText(const core::SoundCount& count)
{
    const std::string text = numbersText({{count.stay, "stay"},
                                          {count.moved, "moved"},
                                          {count.trimmed, "trimmed"},
                                          {count.split, "split"},
                                          {count.doubled, "doubled"},
                                          {count.lost, "fell out"},
                                          {count.added, "new"}});
    return text.empty() ? text : ": " + text;
}

/// `tracks` says on which.
std::string summaryText(const StepSound& sound, const std::string& tracks)
{
    std::string text =
        numbersText({{sound.count(SoundChangeKind::HeadTrimmed) + sound.count(SoundChangeKind::TailTrimmed), "trimmed"},
                     {sound.count(SoundChangeKind::Split), "split"},
                     {sound.count(SoundChangeKind::Doubled), "doubled"},
                     {sound.count(SoundChangeKind::FellOut), "fell out"},
                     {sound.count(SoundChangeKind::Added), "new"},
                     {sound.movedClips, "moved along"}});
    if (!sound.tracks.empty())
        text += ", on " + tracks;
    if (!sound.jumps.empty())
        text += (text.empty() ? "" : "; ") + counted(sound.jumps.size(), "automation jump");
    return text;
}

} // namespace

std::string_view wordOf(SoundChangeKind kind)
{
    return KindWords.at(static_cast<std::size_t>(kind));
}

std::string inWords(const core::SoundCount& count)
{
    return std::to_string(count.all) + fatesText(count);
}

std::string SoundWording::scenes(const StepSound& sound)
{
    std::vector<std::string> names;
    for (const std::string& scene : sound.scenes) {
        if (names.size() < MostNames)
            names.push_back(nameOf(scene, MostCharactersOfAScene));
    }
    return listOf(names, sound.scenes.size());
}

std::string SoundWording::summary(const StepSound& sound) const
{
    return summaryText(sound, trackList(sound.tracks));
}

std::string SoundWording::shortSummary(const StepSound& sound)
{
    return summaryText(sound, counted(sound.tracks.size(), "track"));
}

std::string SoundWording::trackList(const std::vector<std::size_t>& tracks) const
{
    std::vector<std::string> names;
    for (std::size_t index = 0; index < std::min(tracks.size(), MostNames); ++index)
        names.push_back(nameOf(m_document.tracks.at(tracks[index]).name, MostCharactersOfATrack));
    return listOf(names, tracks.size());
}

std::vector<SoundLine> SoundWording::lines(const StepSound& sound) const
{
    std::vector<SoundLine> lines;
    for (const SoundChange& change : sound.changes) {
        if (lines.size() == MostLines)
            return lines;
        const std::string part = change.part.empty() ? "" : " (in " + nameOf(change.part, MostCharactersOfAClip) + ")";
        const double time = change.kind == SoundChangeKind::Added ? change.now->start : change.was.start;
        lines.push_back({whatOf(change), timecode(time),
                         nameOf(m_document.tracks.at(change.track).name, MostCharactersOfATrack) + ": " +
                             nameOf(change.name, MostCharactersOfAClip) + part,
                         change.kind == SoundChangeKind::Doubled ? "now at " + timecode(change.now->start) : ""});
    }
    for (const AutomationJump& jump : sound.jumps) {
        if (lines.size() == MostLines)
            return lines;
        lines.push_back({"automation jumps", timecode(jump.place.start), fittingList(jump.tracks), {}});
    }
    return lines;
}

std::string SoundWording::rest(const StepSound& sound)
{
    const std::size_t count = sound.changes.size() + sound.jumps.size();
    return count <= MostLines ? "" : "and " + std::to_string(count - MostLines) + " more, which the JSON lists";
}

std::vector<std::string> SoundWording::totals() const
{
    std::vector<std::string> lines;
    lines.push_back(toPrintable(m_document.projectName).text + ", " + counted(m_document.clips.all, "clip") +
                    fatesText(m_document.clips));
    if (m_document.markers.all + m_document.markers.added > 0)
        lines.push_back(counted(m_document.markers.all, "own marker") +
                        (m_document.scenes ? " besides the scenes" : "") + fatesText(m_document.markers));
    return lines;
}

std::string SoundWording::whatOf(const SoundChange& change) const
{
    const double lost = change.lost.end - change.lost.start;
    const std::string length = m_document.clock.exactLength(lost);
    switch (change.kind) {
    case SoundChangeKind::HeadTrimmed:
        return "head -" + length;
    case SoundChangeKind::TailTrimmed:
        return "tail -" + length;
    case SoundChangeKind::Split:
        return lost > core::SameInstant ? "split, -" + length : "split";
    case SoundChangeKind::Doubled:
        return "once more";
    case SoundChangeKind::FellOut:
        return lost > core::SameInstant ? "fell out, " + length : "fell out";
    case SoundChangeKind::Added:
        break;
    }
    return "new";
}

std::string SoundWording::timecode(double seconds) const
{
    return m_document.clock.exactTimecode(seconds - m_document.clock.origin());
}

} // namespace cadrel::app
