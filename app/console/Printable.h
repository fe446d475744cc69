// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace cadrel::app {

struct PrintableText {
    std::string text;
    std::size_t width = 0; ///< in columns of a terminal
};

/// The text as it may go to a terminal: "?" replaces what controls the terminal or changes the writing direction. A byte that
/// isn't UTF-8 counts as the Latin-1 letter that it stands for. A text of more than `mostColumns` is cut and ends in "…".
PrintableText toPrintable(std::string_view text, std::size_t mostColumns = std::string_view::npos);

/// How many columns of a terminal printable UTF-8 takes: none for an accent that stands over the letter before it, and two for
/// a Chinese character.
std::size_t displayWidth(std::string_view utf8);

/// Whether the bytes are UTF-8.
bool isUtf8(std::string_view text);

} // namespace cadrel::app
