// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace cadrel::examples {

/// Frames of a roll in a cut, and the lines that come with them.
struct Shot {
    std::string roll;
    int srcIn = 0;
    int length = 0;                 ///< in the programme
    int sourceLength = 0;           ///< another than `length` where the shot is retimed
    std::vector<std::string> notes; ///< what stands below the event: its motion line, its names, its remarks
    int dissolve = 0;               ///< into the shot, in frames; 0 for a cut
};

/// A programme without gaps, as the text of an EDL at 24 frames a second. The timecodes of the shots follow from their
/// lengths, so shots can be changed, taken out and put in as an editor does.
class CutText {
public:
    explicit CutText(int start) : m_start(start) {}

    /// Reads an EDL of plain cuts that follow each other. Throws std::runtime_error for another.
    static CutText read(const std::filesystem::path& file);
    /// The name of the file is the title, too.
    void write(const std::filesystem::path& file) const;

    std::vector<Shot>& shots() { return m_shots; }
    const std::vector<Shot>& shots() const { return m_shots; }

    // Shots are named by their places; frames that a trim takes from a shot are positive.

    void trimHead(std::size_t shot, int frames);
    void trimTail(std::size_t shot, int frames);
    void lift(std::size_t first, std::size_t count);
    void insert(std::size_t place, const std::vector<Shot>& shots);
    /// `place` is counted in the cut as it is before.
    void move(std::size_t first, std::size_t count, std::size_t place);
    /// A dissolve around the cut to a shot, of so many frames.
    void dissolveTo(std::size_t shot, int frames);

private:
    int m_start; ///< in frames
    std::vector<Shot> m_shots;
};

constexpr int FramesPerSecond = 24;

std::string timecodeOf(int frames);
int framesOf(const std::string& timecode);
/// A shot at its own speed with a clip name.
Shot shotOf(const std::string& roll, const std::string& clip, int srcIn, int length);

} // namespace cadrel::examples
