// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/tracks/TrackIndex.h"

#include <juce_gui_basics/juce_gui_basics.h>

namespace desktop {

/// The colour and the shape by which a kind of marker is told apart: each has both of its own.
struct MarkerSymbol {
    static constexpr int Size = 9; ///< pixels

    static juce::Colour colourOf(MarkerLook look);
    /// In the current colour, with its upper left corner there.
    static void draw(juce::Graphics& graphics, MarkerLook look, float left, float top);
};

} // namespace desktop
