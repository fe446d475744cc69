// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <regex>
#include <string>
#include <vector>

namespace cadrel::tests {

/// An event as it stands in the text of an EDL. Timecodes are frame counts at 24 frames a second.
struct WrittenEvent {
    int number = 0;
    std::string roll;
    std::string clip;
    int srcIn = 0;
    int srcOut = 0;
    int dstIn = 0;
    int dstOut = 0;
    std::string transition; ///< "C", "D", "W001"
    int duration = 0;       ///< of the transition
    double speed = 1.0;     ///< as its motion line says
    std::string file;
};

/// How a test tells one material from another.
struct FrameRules {
    bool byClip = false;
    std::regex
        version; ///< its first and second group are a name without its version; a name that doesn't match has none
};

/// What a frame of a cut shows.
struct PictureFrame {
    std::string what;    ///< the material
    std::string version; ///< its name with the version
    double source = 0.0;
    double speed = 1.0;
    const WrittenEvent* event = nullptr; ///< null in a gap

    /// Sources of retimed shots may be a frame apart, since cuts are at whole frames.
    bool looksLike(const PictureFrame& other) const;
};

struct FrameReel {
    int timecode = 0; ///< of its first frame
    std::vector<PictureFrame> frames;
};

/// A cut, frame by frame, read from the text of its EDLs in a way of its own: picture at 24 frames a second, in order, without
/// overlaps. Throws std::runtime_error for what it can't read.
class EdlFrames {
public:
    EdlFrames(const std::vector<std::string>& files, const FrameRules& rules);
    EdlFrames(const EdlFrames&) = delete;
    EdlFrames& operator=(const EdlFrames&) = delete;

    const std::vector<WrittenEvent>& events() const { return m_events; }
    /// A reel begins after a minute without picture.
    const std::vector<FrameReel>& reels() const { return m_reels; }
    int length() const;
    /// Of a frame of the programme, counted without what lies between the reels.
    const PictureFrame& at(int frame) const;
    int timecodeOf(int frame) const;
    /// Throws std::out_of_range for a place without a frame.
    int frameAt(int timecode) const;
    /// The place of the reel that starts there. Throws std::out_of_range.
    std::size_t reelAt(int timecode) const;
    /// The first frame of a reel.
    int startOf(std::size_t reel) const;

private:
    void readFile(const std::string& file);
    PictureFrame frameOf(std::size_t event, int frame, const FrameRules& rules) const;

    std::vector<WrittenEvent> m_events;
    std::vector<FrameReel> m_reels;
};

constexpr int FramesASecond = 24;

int framesOfTimecode(const std::string& timecode);
std::string timecodeOfFrames(int frames);
/// With its sign; a blank before zero.
std::string signedTimecode(int frames);

} // namespace cadrel::tests
