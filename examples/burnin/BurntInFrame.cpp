// SPDX-License-Identifier: GPL-3.0-or-later

#include "examples/burnin/BurntInFrame.h"

#include "standin/services/BitmapFont.h"

#include <algorithm>
#include <cmath>

namespace cadrel::examples {

using standin::BitmapFont;

namespace {

constexpr std::uint8_t Black = 16;
constexpr std::uint8_t White = 235;
constexpr std::uint8_t NoColour = 128;
/// From one character to the next, in pixels of the font.
constexpr int Advance = BitmapFont::Width + 1;
constexpr int LineHeight = BitmapFont::Height + 2;

} // namespace

VideoColour colourOf(std::size_t number)
{
    // Neighbours in the list of numbers get hues that are far from each other.
    constexpr double GoldenAngle = 2.399963;
    constexpr double Strength = 56.0;
    constexpr std::uint8_t Lumas[] = {80, 112, 96, 64, 128};
    const double angle = static_cast<double>(number % 1000) * GoldenAngle;
    const auto difference = [](double part) {
        return static_cast<std::uint8_t>(std::lround(NoColour + Strength * part));
    };
    return {Lumas[number % std::size(Lumas)], difference(std::cos(angle)), difference(std::sin(angle))};
}

BurntInFrame::BurntInFrame(int width, int height)
    : m_width(width), m_height(height),
      m_bytes(static_cast<std::size_t>(width) * static_cast<std::size_t>(height) * 3 / 2)
{
    fill({});
}

void BurntInFrame::fill(VideoColour colour)
{
    const auto lumas = m_bytes.begin() + static_cast<std::ptrdiff_t>(m_width) * m_height;
    const auto blues = lumas + (m_bytes.end() - lumas) / 2;
    std::fill(m_bytes.begin(), lumas, colour.luma);
    std::fill(lumas, blues, colour.blueDifference);
    std::fill(blues, m_bytes.end(), colour.redDifference);
}

void BurntInFrame::mix(const BurntInFrame& other, double share)
{
    const int parts = static_cast<int>(std::lround(256 * share));
    std::transform(m_bytes.begin(), m_bytes.end(), other.m_bytes.begin(), m_bytes.begin(), [parts](int mine, int its) {
        return static_cast<std::uint8_t>((mine * (256 - parts) + its * parts) / 256);
    });
}

void BurntInFrame::wipe(const BurntInFrame& other, double share)
{
    const int half = static_cast<int>(std::lround(m_width * share / 2.0));
    auto row = m_bytes.begin();
    auto otherRow = other.m_bytes.begin();
    const auto copyRows = [&](int rows, int length, int wiped) {
        for (int y = 0; y < rows; ++y, row += length, otherRow += length)
            std::copy_n(otherRow, wiped, row);
    };
    copyRows(m_height, m_width, 2 * half);
    copyRows(m_height, m_width / 2, half); // both planes of colour, with half the rows each
}

void BurntInFrame::write(int line, std::string_view text)
{
    const int lineTop = static_cast<int>(m_height * BarsTop) * line / Lines;
    const int nextTop = static_cast<int>(m_height * BarsTop) * (line + 1) / Lines;
    text = text.substr(0, static_cast<std::size_t>(m_width / Advance));
    const int length = static_cast<int>(text.size()) * Advance;
    if (length == 0)
        return;
    const int scale = std::max(1, std::min((m_width - 2) / length, (nextTop - lineTop) / LineHeight));
    const int left = (m_width - length * scale) / 2;
    const int top = lineTop + (nextTop - lineTop - BitmapFont::Height * scale) / 2;
    fillRectangle(left - scale, top - scale, left + length * scale, top + (BitmapFont::Height + 1) * scale, Black);
    for (std::size_t index = 0; index < text.size(); ++index) {
        const int x = left + static_cast<int>(index) * Advance * scale;
        for (int column = 0; column < BitmapFont::Width; ++column) {
            for (int row = 0; row < BitmapFont::Height; ++row) {
                if (BitmapFont::isSet(static_cast<unsigned char>(text[index]), column, row))
                    fillRectangle(x + column * scale, top + row * scale, x + (column + 1) * scale,
                                  top + (row + 1) * scale, White);
            }
        }
    }
}

void BurntInFrame::drawBars(std::uint16_t number)
{
    const int top = static_cast<int>(m_height * BarsTop);
    for (int bar = 0; bar < Bars; ++bar) {
        const bool isSet = (number >> (Bars - 1 - bar) & 1) != 0;
        fillRectangle(m_width * bar / Bars, top, m_width * (bar + 1) / Bars, m_height, isSet ? White : Black);
    }
    // No colour runs into the bars.
    const std::size_t lumas = static_cast<std::size_t>(m_width) * static_cast<std::size_t>(m_height);
    const auto halfRow = static_cast<std::size_t>(m_width / 2);
    for (int row = top / 2; row < m_height / 2; ++row) {
        for (const std::size_t plane : {lumas, lumas * 5 / 4})
            std::fill_n(m_bytes.begin() + static_cast<std::ptrdiff_t>(plane + static_cast<std::size_t>(row) * halfRow),
                        halfRow, NoColour);
    }
}

void BurntInFrame::fillRectangle(int left, int top, int right, int bottom, std::uint8_t value)
{
    left = std::max(left, 0);
    right = std::min(right, m_width);
    for (int y = std::max(top, 0); y < std::min(bottom, m_height) && left < right; ++y)
        std::fill_n(&luma(left, y), right - left, value);
}

std::uint8_t& BurntInFrame::luma(int x, int y)
{
    return m_bytes[static_cast<std::size_t>(y) * static_cast<std::size_t>(m_width) + static_cast<std::size_t>(x)];
}

} // namespace cadrel::examples
