// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>

namespace standin {

/// An exact number, as the rates and time bases of videos are. Both parts are above 0 and below 2^31, unless it says otherwise.
struct Ratio {
    std::int64_t numerator = 1;
    std::int64_t denominator = 1;

    double value() const { return static_cast<double>(numerator) / static_cast<double>(denominator); }

    friend bool operator==(const Ratio&, const Ratio&) = default;
};

/// The rate that is meant by a number: 24, 25 and other whole ones as they are, 23.976, 29.97, 59.94 and their like as the
/// exact multiple of 1000/1001. Others to a millionth. The number is from 1 to 1000.
Ratio exactRate(double framesPerSecond);

/// Which pictures of a video stand at which frames of a project. A picture has a time in ticks of the video's time base. At a
/// frame, that picture is on the screen which was the last to come before the middle of the frame:
///
///     pictures   |-- 0 --|-- 1 --|-- 2 --|-- 3 --|-- 4 --|
///     frames     |---- 0 ----|---- 1 ----|---- 2 ----|
///     middle           ^           ^           ^            shows the pictures 0, 2 and 3
class FrameClock {
public:
    /// `origin` is the time of the first picture.
    FrameClock(Ratio rate, Ratio timeBase, std::int64_t origin) : m_rate(rate), m_timeBase(timeBase), m_origin(origin)
    {
    }

    /// Whether a picture of that time comes before the middle of the frame.
    bool isBeforeMiddle(std::int64_t ticks, std::uint32_t frame) const;
    /// The last tick for which that holds.
    std::int64_t lastTickOf(std::uint32_t frame) const;
    /// How many frames have their middle before `end`.
    std::uint32_t frameCount(std::int64_t end) const;

private:
    Ratio m_rate;
    Ratio m_timeBase;
    std::int64_t m_origin;
};

} // namespace standin
