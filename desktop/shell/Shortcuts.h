// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

namespace desktop {

/// The command of the menus that the key stands for; 0 for none.
int commandOfKey(const juce::KeyPress& key);

} // namespace desktop
