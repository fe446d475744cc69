// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>
#include <vector>

namespace cadrel::examples {

/// A colour of video levels.
struct VideoColour {
    std::uint8_t luma = 16;
    std::uint8_t blueDifference = 128;
    std::uint8_t redDifference = 128;
};

/// Colours that can be told apart, by a number.
VideoColour colourOf(std::size_t number);

/// A frame of video that says which it is: lines of text for people and, in its lower quarter, 16 vertical bars for programs.
/// Each bar is a bit of the frame's number, the highest on the left, white for 1. Its pixels are planar 4:2:0.
class BurntInFrame {
public:
    static constexpr int Bars = 16;
    /// Above this part of the height there are no bars.
    static constexpr double BarsTop = 0.75;

    /// Both sides are even.
    BurntInFrame(int width, int height);

    int width() const { return m_width; }
    int height() const { return m_height; }
    void fill(VideoColour colour);
    /// Takes over `share`, from 0 to 1, of the other frame, which has the same size.
    void mix(const BurntInFrame& other, double share);
    /// Takes over the left part of the other frame.
    void wipe(const BurntInFrame& other, double share);
    /// White on black, as large as it fits into the width. Lines count from the top, and `Lines` of them fit.
    static constexpr int Lines = 5;
    void write(int line, std::string_view text);
    void drawBars(std::uint16_t number);

    std::span<const std::uint8_t> bytes() const { return m_bytes; }

private:
    void fillRectangle(int left, int top, int right, int bottom, std::uint8_t luma);
    std::uint8_t& luma(int x, int y);

    int m_width;
    int m_height;
    std::vector<std::uint8_t> m_bytes;
};

} // namespace cadrel::examples
