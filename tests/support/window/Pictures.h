// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

#include <string>

namespace cadrel::tests {

/// Expects that the component looks as it does in `tests/gui/pictures/NAME.png` at scale 1 and in `NAME@2x.png` at scale 2. When
/// it doesn't, `build/PRESET/pictures/NAME.png` shows beside each other what was expected, what was drawn and where they
/// differ. `make pictures` makes all pictures of the tree anew from what is drawn.
///
/// A LookAndFeel has to live, for the bundled font.
void expectPicture(juce::Component& component, const std::string& name);

} // namespace cadrel::tests
