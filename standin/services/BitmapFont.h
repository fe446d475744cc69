// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace standin {

/// A font of 5 by 7 pixels, for text in pictures.
struct BitmapFont {
    static constexpr int Width = 5;
    static constexpr int Height = 7;

    /// Whether the pixel of the character is set; columns count from the left, rows from the top. What is no printable ASCII
    /// character is an empty box.
    static bool isSet(char16_t character, int column, int row);
};

} // namespace standin
