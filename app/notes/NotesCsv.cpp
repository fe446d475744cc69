// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/Printable.h"
#include "app/notes/NotesText.h"
#include "app/notes/NotesWording.h"
#include "app/notes/SoundWording.h"
#include "core/edl/EventBase.h"

#include <algorithm>
#include <array>
#include <optional>
#include <string>

namespace cadrel::app {

using core::NoteEntry;
using core::NoteStep;
using core::PictureChange;
using core::StepAction;

namespace {

constexpr std::string_view ByteOrderMark = "\xEF\xBB\xBF";
constexpr std::string_view LineEnd = "\r\n";
constexpr std::string_view Titles = "step,reel,action,at,from,delete,insert,move,delete_frames,insert_frames,"
                                    "move_frames,length_change_frames,offset_frames,kinds,roll,clip,old_in,new_in,"
                                    "changes,at_feet,from_feet,at_reel,from_reel,rate,source_in";
constexpr std::size_t TitleCount = 25;
constexpr std::string_view SoundTitles = ",scenes,sound_trimmed,sound_split,sound_doubled,sound_fell_out,sound_new,"
                                         "sound_moved,sound_tracks,automation_jumps,sound";

std::string inQuotes(const std::string& text)
{
    if (text.find_first_of(",\"\r\n") == std::string::npos)
        return text;
    std::string quoted = "\"";
    for (const char letter : text)
        quoted += letter == '"' ? std::string("\"\"") : std::string(1, letter);
    return quoted + "\"";
}

/// A text of the cut, which no spreadsheet may take for a formula.
std::string asText(const std::string& text)
{
    // The last four are those of a Japanese keyboard, which some programs take for the same.
    constexpr std::array<std::string_view, 10> Starts{"=", "+", "-", "@", "\t", "\r", "＝", "＋", "－", "＠"};
    const bool looksLikeFormula =
        std::any_of(Starts.begin(), Starts.end(), [&text](std::string_view start) { return text.starts_with(start); });
    return inQuotes(looksLikeFormula ? "'" + text : text);
}

class CsvForm {
public:
    explicit CsvForm(const NotesDocument& document) : m_document(document), m_words(document) {}

    std::string rowOf(const NoteEntry& entry, std::size_t reel) const
    {
        const NoteStep& step = *entry.step();
        const bool hasOrigin = step.action == StepAction::Move || step.action == StepAction::MoveReel;
        const PictureChange& largest = NotesWording::largestChange(entry);
        const core::EventBase* const shot = largest.newShot != nullptr ? largest.newShot : largest.oldShot;
        const auto time = [this](std::int32_t frames) { return frames == 0 ? "" : m_words.plainTimecode(frames); };
        const auto& notes = m_document.notes;
        const std::optional<core::Timecode> source = notes.sourceOf(largest);
        const std::array<std::string, TitleCount> cells{
            std::to_string(entry.number),
            std::to_string(reel + 1),
            std::string(wordOf(step.action)),
            m_words.plainTimecode(step.place.timecode()),
            hasOrigin ? m_words.plainTimecode(step.from.timecode()) : "",
            time(step.removed),
            time(step.inserted.length),
            time(step.moved),
            std::to_string(step.removed),
            std::to_string(step.inserted.length),
            std::to_string(step.moved),
            std::to_string(entry.lengthChange),
            std::to_string(entry.runningOffset),
            kindsOf(step),
            shot == nullptr ? "" : asText(toPrintable(shot->rollName()).text),
            shot == nullptr ? "" : asText(toPrintable(shot->clipName()).text),
            largest.inOld ? m_words.plainTimecode(notes.oldTimecode(largest.inOld->start)) : "",
            largest.inNew ? m_words.plainTimecode(notes.newTimecode(largest.inNew->start)) : "",
            asText(changesOf(step)),
            NotesWording::feet(step.place.frame),
            hasOrigin ? NotesWording::feet(step.from.frame) : "",
            std::to_string(step.place.reel + 1),
            hasOrigin ? std::to_string(step.from.reel + 1) : "",
            m_document.rate,
            source ? source->toString() : ""};
        std::string row;
        for (const std::string& cell : cells)
            row.append(row.empty() ? "" : ",").append(cell);
        if (const core::StepSound* const sound = m_words.soundOf(entry))
            row += soundCells(*sound);
        return row.append(LineEnd);
    }

    /// A row without a step.
    std::string elsewhereRow() const
    {
        const core::StepSound& sound = m_document.sound->notes.elsewhere();
        return sound.isEmpty() ? ""
                               : ",,elsewhere" + std::string(TitleCount - 3, ',') + soundCells(sound).append(LineEnd);
    }

private:
    std::string soundCells(const core::StepSound& sound) const
    {
        using core::SoundChangeKind;
        const SoundWording words(*m_document.sound);
        const auto number = [](std::size_t count) { return std::to_string(count); };
        std::string tracks;
        for (const std::size_t track : sound.tracks)
            tracks += (tracks.empty() ? "" : ", ") + toPrintable(m_document.sound->tracks.at(track).name).text;
        std::string lines;
        for (const SoundLine& line : words.lines(sound))
            lines += concatenated({lines.empty() ? "" : "; ", line.name, " at ", line.time, ": ", line.whatAndMore()});
        if (const std::string rest = SoundWording::rest(sound); !rest.empty())
            lines.append("; ").append(rest);
        const std::array<std::string, 10> cells{
            asText(SoundWording::scenes(sound)),
            number(sound.count(SoundChangeKind::HeadTrimmed) + sound.count(SoundChangeKind::TailTrimmed)),
            number(sound.count(SoundChangeKind::Split)),
            number(sound.count(SoundChangeKind::Doubled)),
            number(sound.count(SoundChangeKind::FellOut)),
            number(sound.count(SoundChangeKind::Added)),
            number(sound.movedClips),
            asText(tracks),
            number(sound.jumps.size()),
            asText(lines)};
        std::string row;
        for (const std::string& cell : cells)
            row.append(",").append(cell);
        return row;
    }

    static std::string kindsOf(const NoteStep& step)
    {
        std::string kinds;
        for (const PictureChange& change : step.changes)
            kinds.append(kinds.empty() ? "" : " ").append(wordOf(change.kind));
        return kinds;
    }

    std::string changesOf(const NoteStep& step) const
    {
        std::string text;
        for (const PictureChange& change : step.changes) {
            const ChangeWords words = m_words.describe(change);
            text += concatenated(
                {text.empty() ? "" : "; ", words.shot, ": ", words.what, words.more.empty() ? "" : ", ", words.more});
        }
        return text;
    }

    const NotesDocument& m_document;
    NotesWording m_words;
};

} // namespace

void writeNotesCsv(const NotesDocument& document, const NotesSink& sink)
{
    const CsvForm form(document);
    sink(std::string(ByteOrderMark)
             .append(Titles)
             .append(document.sound == nullptr ? std::string_view() : SoundTitles)
             .append(LineEnd));
    for (std::size_t reel = 0; reel < document.notes.reels().size(); ++reel) {
        for (const NoteEntry& entry : document.notes.reels()[reel].entries) {
            if (entry.step() != nullptr)
                sink(form.rowOf(entry, reel));
        }
    }
    if (document.sound != nullptr)
        sink(form.elsewhereRow());
}

} // namespace cadrel::app
