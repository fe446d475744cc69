// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/video/FrameClock.h"
#include "standin/video/PictureDrawing.h"
#include "standin/video/PictureReader.h"
#include "standin/video/PictureRun.h"

#include <cstdint>
#include <filesystem>
#include <optional>

namespace standin {

/// The pictures of a video by the frames of a project. Frame 0 is where its first picture comes. The decoder stays open, so
/// that a frame close after the last one is there soon. For one who goes back step by step, it reads ahead what comes before:
///
///                                    <-- the frames that are asked for
///     key picture            |--------- run ---------|
///          |--- left out ---|- earlier -|
///                              --> a little with each step
///
/// A frame far from the last one takes as long as the decoder takes for the pictures since the key picture, without those on
/// which no other depends. Nothing less shows the same picture.
///
/// For one thread at a time. All operations may throw VideoError.
class VideoFile {
public:
    explicit VideoFile(const std::filesystem::path& file, Deadline deadline);

    /// Of the file itself.
    Ratio rate() const { return m_reader.rate(); }
    /// How many frames of a project of that rate it has; at least one.
    std::uint32_t frameCount(Ratio rate) const;
    /// What is on the screen at a frame of a project of that rate, fitted into the box. A frame that took too long goes on where
    /// it was when it is asked for again.
    Picture picture(std::uint32_t frame, Ratio rate, PictureSize box, Deadline deadline);

private:
    FrameClock clockOf(Ratio rate) const { return {rate, m_reader.timeBase(), m_origin}; }
    const AVFrame& pictureAt(std::uint32_t frame, const FrameClock& clock);
    /// Has the run show the frame, if it isn't broken there.
    void reach(std::uint32_t frame, const FrameClock& clock);
    bool isNear(std::uint32_t frame, const FrameClock& clock) const;
    /// These are false when the run doesn't show the frame then.
    bool goOn(std::uint32_t frame, const FrameClock& clock);
    bool takeEarlier(std::uint32_t frame, const FrameClock& clock);
    void seekTo(std::uint32_t frame, const FrameClock& clock);
    /// Begins the run at a picture that comes at that time or before. Pictures before the second time may be left out.
    void begin(PictureRun& run, std::int64_t ticks, std::int64_t leaveOutBefore);
    /// Sets the reader before the frame. False when it is at the start of the file then.
    bool seekBack(std::int64_t ticks);
    /// Reads until the run tells what is on the screen at that time.
    void readUpTo(PictureRun& run, std::int64_t ticks);
    bool readNext(PictureRun& run);
    void dropLeftOut(PictureRun& run) const;
    bool hasLeftOutTheRightOne(std::uint32_t frame, const FrameClock& clock) const;
    /// From which time on no picture is left out, when the one at `ticks` is wanted.
    std::int64_t wholeFrom(std::int64_t ticks) const;
    void readEarlier();
    bool isEarlierRead() const { return !m_earlier.isEmpty() && m_earlier.last() >= m_run.start(); }
    void giveUp(VideoError::Reason reason);
    void forgetRun();

    PictureReader m_reader;
    PictureDrawing m_drawing;
    Orientation m_orientation;
    std::int64_t m_origin = 0;   ///< the time of the first picture, in ticks
    std::int64_t m_end = 0;      ///< where the last picture ends
    PictureRun m_run;            ///< the pictures around the last frame
    PictureRun m_earlier;        ///< those that come before the run; empty while they aren't read
    bool m_readsEarlier = false; ///< that is where the reader is, and not after the run
    bool m_goesBack = false;
    std::optional<std::int64_t> m_lastWanted; ///< the time of the last frame
    std::optional<std::int64_t> m_onTheWayTo; ///< the time of a frame that took too long
};

} // namespace standin
