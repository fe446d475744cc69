// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace cadrel::util {

/// The character that stands for one that can't be shown.
inline constexpr char32_t ReplacementCharacter = 0xfffd;

/// One character of a text in UTF-8.
struct Utf8Character {
    std::size_t bytes = 0; ///< that it takes of the text; 0 where the text doesn't begin with a well-formed character
    char32_t value = 0;
};

/// The first character of a text, which isn't empty.
Utf8Character firstUtf8Character(std::string_view text);

/// The text as one line of the window may show it, which every text has: a replacement character stands for each byte that
/// isn't UTF-8, and for each character that isPrintable refuses. Needs no string converter.
std::wstring toShownLine(std::string_view utf8);

} // namespace cadrel::util
