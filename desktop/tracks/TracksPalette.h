// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/look/Palette.h"

namespace desktop {

/// The colours of the view of the tracks that the other window hasn't got.
struct TracksPalette {
    using Colour = cadrel::gui::PaletteColour;

    static constexpr Colour ground = cadrel::gui::opaque(15, 19, 25);        ///< after the last track
    static constexpr Colour lane = cadrel::gui::opaque(27, 33, 42);          ///< a track of sound or picture
    static constexpr Colour lowLane = cadrel::gui::opaque(21, 26, 33);       ///< markers, rulers and folders
    static constexpr Colour selectedLane = cadrel::gui::opaque(36, 46, 48);  ///< of a selected track
    static constexpr Colour line = cadrel::gui::opaque(10, 13, 17);          ///< between two tracks
    static constexpr Colour dimText = cadrel::gui::opaque(139, 149, 158);    ///< small labels, folders
    static constexpr Colour soundBody = cadrel::gui::opaque(44, 69, 93);     ///< a clip of sound below its name
    static constexpr Colour soundSliver = cadrel::gui::opaque(76, 120, 161); ///< a clip that is too short for a name
    static constexpr Colour soundStrip = cadrel::gui::opaque(56, 90, 121);   ///< many of them, one after the other
    static constexpr Colour pictureName = cadrel::gui::opaque(74, 86, 104);  ///< the name of a clip of picture
    static constexpr Colour pictureBody = cadrel::gui::opaque(38, 45, 55);   ///< below it, where there is no still
    static constexpr Colour partName = cadrel::gui::opaque(96, 103, 124);    ///< the name of a part
    static constexpr Colour partBody = cadrel::gui::opaque(40, 44, 55);      ///< the ground of what it holds
    static constexpr Colour lockedName = cadrel::gui::opaque(72, 78, 84);    ///< the name of any clip of a locked track
    static constexpr Colour lockedBody = cadrel::gui::opaque(47, 52, 58);    ///< below it
    static constexpr Colour darkText = cadrel::gui::opaque(18, 24, 18);      ///< on what is marked
    static constexpr Colour markedBody = cadrel::gui::opaque(93, 135, 83);   ///< below the name of a marked clip
};

} // namespace desktop
