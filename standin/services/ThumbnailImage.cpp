// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/ThumbnailImage.h"

#include "standin/services/BitmapFont.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace standin {

using namespace Velmark;

namespace {

constexpr int BytesPerPixel = 4;
constexpr uint8 Ground[BytesPerPixel] = {0x58, 0x48, 0x38, 0xff}; ///< a dark blue
constexpr uint8 Ink[BytesPerPixel] = {0xff, 0xff, 0xff, 0xff};

/// From one character to the next, and from one line to the next.
constexpr int Advance = BitmapFont::Width + 1;
constexpr int LineAdvance = BitmapFont::Height + 2;

std::size_t byteOffset(int x, int y, int width)
{
    return (static_cast<std::size_t>(y) * static_cast<std::size_t>(width) + static_cast<std::size_t>(x)) *
           BytesPerPixel;
}

/// How large the lines can be drawn.
int scaleOf(std::size_t lines, std::size_t longest, int width, int height)
{
    const auto fits = [](int space, std::size_t units) {
        return static_cast<int>(static_cast<std::size_t>(space) / std::max(units, std::size_t{1}));
    };
    return std::max(1, std::min(fits(width, longest * Advance), fits(height, lines * LineAdvance)));
}

/// The paragraph in lines of at most so many characters, parted at spaces where there are some.
void appendWrapped(std::vector<std::u16string>& lines, std::u16string_view paragraph, std::size_t columns)
{
    while (paragraph.size() > columns) {
        const std::size_t space = paragraph.rfind(u' ', columns);
        const bool hasSpace = space != std::u16string_view::npos && space > 0;
        lines.emplace_back(paragraph.substr(0, hasSpace ? space : columns));
        paragraph.remove_prefix(hasSpace ? space + 1 : columns);
    }
    lines.emplace_back(paragraph);
}

} // namespace

ThumbnailImage::ThumbnailImage(int width, int height, std::vector<uint8> pixels)
    : m_width(width), m_height(height), m_pixels(std::move(pixels))
{
}

ThumbnailImage::ThumbnailImage(int width, int height, const std::vector<std::u16string>& lines)
    : m_width(width), m_height(height), m_pixels(byteOffset(0, height, width))
{
    for (std::size_t offset = 0; offset < m_pixels.size(); offset += BytesPerPixel)
        std::copy_n(Ground, BytesPerPixel, m_pixels.begin() + static_cast<std::ptrdiff_t>(offset));
    std::size_t longest = 1;
    for (const std::u16string& line : lines)
        longest = std::max(longest, line.size());
    const int scale = scaleOf(lines.size(), longest, width, height);
    const int step = LineAdvance * scale;
    int top = (height - static_cast<int>(lines.size()) * step) / 2 + scale;
    for (const std::u16string& line : lines) {
        drawLine(line, top, scale);
        top += step;
    }
}

bool ThumbnailImage::isSize(const int32 size[2])
{
    const auto fits = [](int32 side) { return side >= 1 && side <= LongestSide; };
    return size && fits(size[0]) && fits(size[1]);
}

std::vector<std::u16string> ThumbnailImage::linesOf(const std::vector<std::u16string>& paragraphs, int width,
                                                    int height)
{
    constexpr int LargestScale = 8;
    std::vector<std::u16string> lines;
    for (int scale = LargestScale; scale > 0; --scale) {
        lines.clear();
        const int columns = std::max(1, width / (Advance * scale));
        for (const std::u16string& paragraph : paragraphs)
            appendWrapped(lines, paragraph, static_cast<std::size_t>(columns));
        if (std::ssize(lines) * LineAdvance * scale <= height)
            break;
    }
    return lines;
}

int32 ThumbnailImage::getSize(int32 size[2])
{
    if (!size)
        return ResultFalse;
    size[0] = m_width;
    size[1] = m_height;
    return ResultOk;
}

int32 ThumbnailImage::read(void* pixels, int32 stride, const int32 rect[4], int32 /*reserved*/)
{
    if (!pixels || !rect)
        return ResultFalse;
    const int32 left = rect[0];
    const int32 top = rect[1];
    const int32 right = rect[2];
    const int32 bottom = rect[3];
    const bool isWithin =
        left >= 0 && left <= right && right <= m_width && top >= 0 && top <= bottom && bottom <= m_height;
    if (!isWithin || stride / BytesPerPixel < right - left)
        return ResultFalse;
    auto* row = static_cast<uint8*>(pixels);
    for (int y = top; y < bottom; ++y, row += stride) {
        const auto source = m_pixels.begin() + static_cast<std::ptrdiff_t>(byteOffset(left, y, m_width));
        std::copy_n(source, (right - left) * BytesPerPixel, row);
    }
    return ResultOk;
}

void ThumbnailImage::drawLine(std::u16string_view text, int top, int scale)
{
    // What doesn't fit even at the smallest scale is cut off at its end.
    text = text.substr(0, static_cast<std::size_t>(std::max(1, m_width / (Advance * scale))));
    int left = (m_width - static_cast<int>(text.size()) * Advance * scale) / 2;
    for (const char16_t character : text) {
        for (int column = 0; column < BitmapFont::Width; ++column) {
            for (int row = 0; row < BitmapFont::Height; ++row) {
                if (BitmapFont::isSet(character, column, row))
                    fill(left + column * scale, top + row * scale, scale);
            }
        }
        left += Advance * scale;
    }
}

void ThumbnailImage::fill(int left, int top, int size)
{
    for (int y = std::max(top, 0); y < std::min(top + size, m_height); ++y) {
        for (int x = std::max(left, 0); x < std::min(left + size, m_width); ++x)
            std::copy_n(Ink, BytesPerPixel, m_pixels.begin() + static_cast<std::ptrdiff_t>(byteOffset(x, y, m_width)));
    }
}

} // namespace standin
