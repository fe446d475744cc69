// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/video/Av.h"
#include "standin/video/FrameClock.h"

#include <cstddef>
#include <cstdint>
#include <deque>

namespace standin {

/// Decoded pictures, one right after the other as they come on the screen. Times are in ticks of the video.
class PictureRun {
public:
    bool isEmpty() const { return m_pictures.empty(); }
    /// The times of the first and of the last picture; there has to be one.
    std::int64_t start() const;
    std::int64_t last() const;
    /// How much memory the pictures take.
    std::size_t bytes() const { return m_bytes; }
    std::size_t size() const { return m_pictures.size(); }
    /// Whether the file has no picture after the last one.
    bool isAtEnd() const { return m_isAtEnd; }
    bool isLast(const AVFrame& picture) const { return !isEmpty() && m_pictures.back().get() == &picture; }

    /// What is on the screen at the frame; null when these pictures don't tell.
    const AVFrame* find(std::uint32_t frame, const FrameClock& clock) const;

    void add(AvOwner<AVFrame> picture);
    void setAtEnd() { m_isAtEnd = true; }
    void dropFirst();
    /// Lets go of those that come before that time, but for the last of all.
    void dropBefore(std::int64_t ticks);
    void clear();

private:
    std::deque<AvOwner<AVFrame>> m_pictures;
    std::size_t m_bytes = 0;
    bool m_isAtEnd = false;
};

} // namespace standin
