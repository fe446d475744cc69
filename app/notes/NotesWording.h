// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/notes/NotesDocument.h"

#include <cstdint>
#include <initializer_list>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::app {

/// The words for a ChangeKind, a StepAction and a PictureDoubt in files for other programs.
std::string_view wordOf(core::ChangeKind kind);
std::string_view wordOf(core::StepAction action);
std::string_view wordOf(core::PictureDoubt doubt);

/// The texts one after the other.
std::string concatenated(std::initializer_list<std::string_view> texts);

/// What a change does, and to which shot.
struct ChangeWords {
    std::string what; ///< "tail -20 frames"
    std::string shot; ///< "42A-3 MAREN MCU"
    std::string more; ///< "roll A012C007, source 10:00:00:00"; mostly empty
};

/// Says in words what stands in the notes.
class NotesWording {
public:
    explicit NotesWording(const NotesDocument& document) : m_document(document) {}

    /// Of a frame count. It begins anew after 24 hours, which a reel may reach on its way to a shorter one. Drop-frame shows
    /// in a ";".
    std::string timecode(std::int32_t frames) const;
    /// The same for other programs, always with ":".
    std::string plainTimecode(std::int32_t frames) const;
    /// A length with its sign.
    std::string change(std::int32_t frames) const;
    /// The same for a column: zero has a blank in place of a sign.
    std::string changeInColumn(std::int32_t frames) const;
    /// For a column: by how much later a kept stretch stands now, and of any other row what the reel has gained so far.
    /// Empty for a stretch from another reel.
    std::string offsetInColumn(const core::NoteEntry& entry, std::size_t reel) const;
    /// 35 mm feet and frames, 16 frames a foot: "12+05". The first frame of a reel is 0+00.
    static std::string feet(std::int32_t frames);

    /// The timecode of `placeOf`.
    std::string timeOf(const core::NoteEntry& entry, std::size_t reel) const;
    /// Where a row stands in the programme as it is then. Of a move to further on it is where the picture is taken from, and
    /// of a reel that is moved as a whole where it began until then.
    core::WorkPlace placeOf(const core::NoteEntry& entry, std::size_t reel) const;
    /// "delete 00:00:01:00"; at the other end of a move "moved 00:00:30:00 to reel 8, step 40".
    std::string action(const core::NoteEntry& entry) const;
    ChangeWords describe(const core::PictureChange& change) const;
    /// The change of a step that stands for it where there is room for one.
    static const core::PictureChange& largestChange(const core::NoteEntry& entry);
    /// Feet and frames of the row, counted inclusively: "delete 12+05 through 13+04"; empty for a row that is no step. A
    /// move between reels names them, as each has feet of its own.
    std::string inFeet(const core::NoteEntry& entry) const;
    /// "Reel 1, 03:00:00:00, began at 03:10:00:00, moved by step 2".
    std::string reelTitle(std::size_t reel) const;
    /// Where it begins in the new cut, or in the old one where it is gone.
    std::string reelStart(std::size_t reel) const;
    /// "00:15:30:21 before, 00:15:07:20 after, -00:00:23:01".
    std::string reelLengths(std::size_t reel) const;
    /// What was healed, joined, doubted and passed over, a line each.
    std::vector<std::string> remarks() const;
    /// What the files of a cut call it, or their names where they don't; of many titles the first and the last.
    std::string cutTitle(bool isNew) const;
    /// "REEL 3 V07 to REEL 3 V12"; empty where no file has a title.
    std::string titles() const;
    /// "REEL 3 V07 to REEL 3 V12", or the names of the files where the titles don't tell the cuts apart.
    std::string bothCuts() const;
    /// The names of the files of a cut; of many the first and the last.
    std::string cutName(bool isNew) const;
    /// How many steps a reel has.
    std::size_t stepsOf(std::size_t reel) const;
    /// The shot of the largest change of a step, and how many more shots it changes: "42A-3 MAREN MCU and 2 more".
    std::string shotsOf(const core::NoteEntry& entry) const;
    /// Where there are no steps. Also whether anything was passed over in one of the cuts alone.
    std::string nothingHasChanged() const;
    /// How the steps and the lines below them are meant; empty where nothing needs to be explained.
    std::string order() const;
    /// The settings in force, a line for each place that they are from: "Settings given: --simplify 12".
    std::vector<std::string> settings() const;
    /// The names of the files of a cut, its number of events and of flawed ones.
    std::string cutText(bool isNew) const;

    /// The clip's name, or the roll's where it has none; "no picture" for a gap.
    static std::string nameOf(const core::EventBase* shot);

    /// What a run has done to the sound at a step; null where the notes are only about the picture.
    const core::StepSound* soundOf(const core::NoteEntry& entry) const;

    const NotesDocument& document() const { return m_document; }

private:
    std::string versionName(const core::EventBase* shot) const;
    std::string materialOf(const core::PictureChange& change) const;
    ChangeWords retimeWords(const core::PictureChange& change) const;
    static std::string transitionText(const core::PictureChange& change);
    std::string speedText(const core::EventBase& was, const core::EventBase& now) const;
    std::string ownSpeedText(const core::EventBase* shot) const;
    std::string formerVersion(const core::PictureChange& change) const;
    static std::string asideText(const core::PictureChange& change);
    std::string reelFate(std::size_t reel) const;
    std::string wholeReel(const core::NoteStep& step) const;
    std::multiset<std::string> passedOver(bool isNew) const;
    bool hasSteps() const;
    bool movesReels() const;
    /// The name of a file; with its cut where both have a file of that name.
    std::string fileOf(const std::string& file, bool isNew) const;
    void addDoubts(bool isNew, std::vector<std::string>& lines) const;
    void addUnread(bool isNew, std::vector<std::string>& lines) const;

    const NotesDocument& m_document;
};

} // namespace cadrel::app
