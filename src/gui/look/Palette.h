// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>

namespace cadrel::gui {

/// A colour as 0xAARRGGBB.
struct PaletteColour {
    std::uint32_t argb = 0;

    bool operator==(const PaletteColour&) const = default;
};

constexpr PaletteColour opaque(std::uint32_t red, std::uint32_t green, std::uint32_t blue)
{
    return {0xff000000U | red << 16U | green << 8U | blue};
}

/// The colours that the parts of the window share.
struct Palette {
    static constexpr PaletteColour red = opaque(200, 22, 0);      ///< state of a flawed event; a count of flawed ones
    static constexpr PaletteColour darkRed = opaque(100, 0, 0);   ///< the ring around it
    static constexpr PaletteColour green = opaque(65, 200, 0);    ///< state of a valid event; no flawed ones
    static constexpr PaletteColour darkGreen = opaque(0, 100, 0); ///< the ring around it
    static constexpr PaletteColour selection = opaque(135, 193, 122); ///< selected rows, events and text; the caret
    static constexpr PaletteColour band = opaque(86, 93, 99);         ///< header bands, row rules, table headers
    static constexpr PaletteColour frame = opaque(118, 120, 122);     ///< outlines and titles of panels
    static constexpr PaletteColour panel = opaque(23, 28, 36);        ///< panels, backgrounds of lists
    static constexpr PaletteColour text = opaque(201, 211, 220);      ///< tables, names of the timeline's lanes
    static constexpr PaletteColour eventBlue = opaque(64, 104, 142);  ///< events of the timeline
    static constexpr PaletteColour eventTeal = opaque(2, 168, 168);   ///< VFX events, on the timeline and in tables
    static constexpr PaletteColour light = opaque(231, 232, 233);     ///< a pressed button
    static constexpr PaletteColour lightBlue = opaque(163, 204, 255); ///< a button that is on; the highlight of menus
    static constexpr PaletteColour orange =
        opaque(255, 173, 0);                              ///< the preview button that is on; a video that is missing
    static constexpr PaletteColour highlight = selection; ///< text of events related to the selected ones
    static constexpr PaletteColour sheetShade = {0x3a899593}; ///< what a sheet lays over the whole window
    static constexpr PaletteColour sheet = {0xff899593};      ///< the panel of a sheet
};

} // namespace cadrel::gui
