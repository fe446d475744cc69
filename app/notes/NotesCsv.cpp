// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/notes/NotesText.h"
#include "app/notes/NotesWording.h"
#include "core/edl/EventBase.h"

#include <array>
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
                                    "changes,at_feet,from_feet";

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
    const bool looksLikeFormula = !text.empty() && std::string_view("=+-@\t\r").find(text.front()) != std::string::npos;
    return inQuotes(looksLikeFormula ? "'" + text : text);
}

class CsvForm {
public:
    explicit CsvForm(const NotesDocument& document) : m_document(document), m_words(document) {}

    std::string rowOf(const NoteEntry& entry, std::size_t reel) const
    {
        const NoteStep& step = *entry.step();
        const bool isMove = step.action == StepAction::Move;
        const PictureChange& first = step.changes.front();
        const core::EventBase* const shot = first.newShot != nullptr ? first.newShot : first.oldShot;
        const auto time = [this](std::int32_t frames) { return frames == 0 ? "" : m_words.plainTimecode(frames); };
        const auto& notes = m_document.notes;
        const std::array<std::string, 21> cells{
            std::to_string(entry.number),
            std::to_string(reel + 1),
            std::string(wordOf(step.action)),
            m_words.plainTimecode(notes.timecodeOf(step.place)),
            isMove ? m_words.plainTimecode(notes.timecodeOf(step.from)) : "",
            time(step.removed),
            time(step.inserted.length),
            time(step.moved),
            std::to_string(step.removed),
            std::to_string(step.inserted.length),
            std::to_string(step.moved),
            std::to_string(entry.lengthChange),
            std::to_string(entry.runningOffset),
            kindsOf(step),
            shot == nullptr ? "" : asText(shot->rollName()),
            shot == nullptr ? "" : asText(shot->clipName()),
            first.inOld ? m_words.plainTimecode(notes.oldTimecode(first.inOld->start)) : "",
            first.inNew ? m_words.plainTimecode(notes.newTimecode(first.inNew->start)) : "",
            asText(changesOf(step)),
            NotesWording::feet(step.place.frame),
            isMove ? NotesWording::feet(step.from.frame) : ""};
        std::string row;
        for (const std::string& cell : cells)
            row.append(row.empty() ? "" : ",").append(cell);
        return row.append(LineEnd);
    }

private:
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
    sink(std::string(ByteOrderMark).append(Titles).append(LineEnd));
    for (std::size_t reel = 0; reel < document.notes.reels().size(); ++reel) {
        for (const NoteEntry& entry : document.notes.reels()[reel].entries) {
            if (entry.step() != nullptr)
                sink(form.rowOf(entry, reel));
        }
    }
}

} // namespace cadrel::app
