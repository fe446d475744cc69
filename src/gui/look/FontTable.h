// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace cadrel::gui {

/// A font of the window's one family.
struct FontStyle {
    bool isBold;
    float height; ///< in pixels, from the ascender to the descender

    bool operator==(const FontStyle&) const = default;
};

/// The fonts of the window by their index, 0 to 13. Throws Result::InvalidArgument for 8, which is no font, and for any other
/// number.
FontStyle fontStyle(int index);

} // namespace cadrel::gui
