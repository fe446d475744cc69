// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/base/Utf16.h"

#include <cstddef>
#include <cstdint>

namespace standin {

namespace {

constexpr std::uint32_t FirstHigh = 0xD800;
constexpr std::uint32_t FirstLow = 0xDC00;
constexpr std::uint32_t LastLow = 0xDFFF;
constexpr std::uint32_t FirstPaired = 0x10000;

/// With the bytes that follow the first one, which has the marks of their number.
void appendBytes(std::string& text, std::uint32_t character, std::uint32_t marks, unsigned following)
{
    text += static_cast<char>(marks | character >> (6 * following));
    while (following-- > 0)
        text += static_cast<char>(0x80U | (character >> (6 * following) & 0x3FU));
}

void append(std::string& text, std::uint32_t character)
{
    if (character < 0x80)
        text += static_cast<char>(character);
    else if (character < 0x800)
        appendBytes(text, character, 0xC0, 1);
    else if (character < FirstPaired)
        appendBytes(text, character, 0xE0, 2);
    else
        appendBytes(text, character, 0xF0, 3);
}

} // namespace

std::string toUtf8(std::u16string_view text)
{
    std::string utf8;
    utf8.reserve(text.size());
    for (std::size_t index = 0; index < text.size(); ++index) {
        std::uint32_t character = text[index];
        if (character >= FirstHigh && character <= LastLow)
            character = FirstPaired + ((character - FirstHigh) << 10U) + (text[++index] - FirstLow);
        append(utf8, character);
    }
    return utf8;
}

std::u16string toUtf16(std::string_view text)
{
    std::u16string utf16;
    utf16.reserve(text.size());
    for (std::size_t index = 0; index < text.size();) {
        const auto first = static_cast<std::uint8_t>(text[index++]);
        const int following = first >= 0xF0 ? 3 : first >= 0xE0 ? 2 : first >= 0xC0 ? 1 : 0;
        std::uint32_t character = following == 0 ? first : first & (0x3FU >> following);
        for (int count = 0; count < following; ++count)
            character = character << 6U | (static_cast<std::uint8_t>(text[index++]) & 0x3FU);
        if (character < FirstPaired) {
            utf16 += static_cast<char16_t>(character);
        } else {
            utf16 += static_cast<char16_t>(FirstHigh + ((character - FirstPaired) >> 10U));
            utf16 += static_cast<char16_t>(FirstLow + ((character - FirstPaired) & 0x3FFU));
        }
    }
    return utf16;
}

} // namespace standin
