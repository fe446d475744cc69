// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/notes/NotesDocument.h"

#include <string>
#include <string_view>
#include <vector>

namespace cadrel::app {

/// The word for a SoundChangeKind in files for other programs.
std::string_view wordOf(core::SoundChangeKind kind);

/// "300: 20 stay, 250 moved, 30 trimmed".
std::string inWords(const core::SoundCount& count);

/// One thing that happened to the sound, in printable words.
struct SoundLine {
    std::string what; ///< "split, -00:00:00:20"
    std::string time; ///< where the clip began in the old programme; of a jump, where it is in the new one
    std::string name; ///< "DIA 1: 42A-3 Maren"
    std::string more; ///< "now at 03:13:05:15"; mostly empty

    /// All that happened: "once more, now at 03:13:05:15".
    std::string whatAndMore() const { return more.empty() ? what : what + ", " + more; }
};

/// Says in words what happened to the sound at a step.
class SoundWording {
public:
    /// Of more there is a count.
    static constexpr std::size_t MostLines = 30;
    static constexpr std::string_view ElsewhereTitle = "Sound that changed where no picture did";

    explicit SoundWording(const SoundDocument& document) : m_document(document) {}

    /// "42 Lock house kitchen, 43 Stair"; empty for none.
    static std::string scenes(const core::StepSound& sound);
    /// "3 trimmed, 2 split, on DIA 1, FX 2; 1 automation jump"; empty for none.
    std::string summary(const core::StepSound& sound) const;
    /// The same with a number in place of the names of the tracks.
    static std::string shortSummary(const core::StepSound& sound);
    /// At most MostLines.
    std::vector<SoundLine> lines(const core::StepSound& sound) const;
    /// "and 12 more, which the JSON lists"; empty for none.
    static std::string rest(const core::StepSound& sound);
    /// What is told of all of the sound, a line each.
    std::vector<std::string> totals() const;

private:
    std::string whatOf(const core::SoundChange& change) const;
    std::string timecode(double seconds) const;
    std::string trackList(const std::vector<std::size_t>& tracks) const;

    const SoundDocument& m_document;
};

} // namespace cadrel::app
