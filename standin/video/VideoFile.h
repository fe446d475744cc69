// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/video/FrameClock.h"
#include "standin/video/PictureDrawing.h"
#include "standin/video/PictureReader.h"

#include <cstdint>
#include <deque>
#include <filesystem>

namespace standin {

/// The pictures of a video by the frames of a project. Frame 0 is where its first picture comes. The decoder stays open, so
/// that a frame close after the last one is there soon. For one thread at a time. All operations may throw VideoError.
class VideoFile {
public:
    explicit VideoFile(const std::filesystem::path& file, Deadline deadline);

    /// Of the file itself.
    Ratio rate() const { return m_reader.rate(); }
    /// How many frames of a project of that rate it has; at least one.
    std::uint32_t frameCount(Ratio rate) const;
    /// What is on the screen at a frame of a project of that rate, fitted into the box.
    Picture picture(std::uint32_t frame, Ratio rate, PictureSize box, Deadline deadline);

private:
    FrameClock clockOf(Ratio rate) const { return {rate, m_reader.timeBase(), m_origin}; }
    const AVFrame& pictureAt(std::uint32_t frame, const FrameClock& clock);
    /// What the run tells is on the screen at the frame; null when that isn't known.
    const AVFrame* findInRun(std::uint32_t frame, const FrameClock& clock) const;
    bool isNear(std::uint32_t frame, const FrameClock& clock) const;
    void goForward(std::uint32_t frame, const FrameClock& clock);
    void seekTo(std::uint32_t frame, const FrameClock& clock);
    /// Sets the reader before the frame. False when it is at the start of the file then.
    bool seekBack(std::int64_t ticks);
    bool hasLeftOutTheRightOne(std::uint32_t frame, const FrameClock& clock) const;
    void dropBefore(std::int64_t ticks);
    bool readNext();
    void forgetRun();

    PictureReader m_reader;
    PictureDrawing m_drawing;
    Orientation m_orientation;
    std::int64_t m_origin = 0;          ///< the time of the first picture, in ticks
    std::int64_t m_end = 0;             ///< where the last picture ends
    std::deque<AvOwner<AVFrame>> m_run; ///< decoded pictures, one right after the other
    bool m_runsToTheEnd = false;        ///< no picture comes after them
};

} // namespace standin
