// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace cadrel::app {

struct PrintableText {
    std::string text;
    std::size_t width = 0; ///< in characters
};

/// The text as it may go to a terminal: "?" replaces what isn't UTF-8, controls the terminal or changes the writing
/// direction. A text of more than `mostCharacters` is cut and ends in "…".
PrintableText toPrintable(std::string_view text, std::size_t mostCharacters = std::string_view::npos);

/// Whether the bytes are UTF-8.
bool isUtf8(std::string_view text);

} // namespace cadrel::app
