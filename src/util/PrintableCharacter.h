// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace cadrel::util {

/// Whether a character is visible and has no other effect: it doesn't control a terminal or change the writing
/// direction.
constexpr bool isPrintable(char32_t character)
{
    const auto within = [character](char32_t first, char32_t last) { return character >= first && character <= last; };
    const bool controls = within(0x00, 0x1f) || within(0x7f, 0x9f);
    const bool invisible = within(0x200b, 0x200f) || within(0x2028, 0x202e) || within(0x2060, 0x206f) ||
                           character == 0xfeff || within(0xe0000, 0xe007f);
    return !controls && !invisible;
}

} // namespace cadrel::util
