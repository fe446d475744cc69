// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/plugin/XConnection.h"
#include "velmark/Types.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <optional>

namespace cadrel::host {

// A key in the three ways of the host's contract, of JUCE and of the X server.

/// What IPlugView::onKeyDown tells; nothing for a key that JUCE has no code for.
std::optional<juce::KeyPress> toKeyPress(char16_t character, Velmark::int32 virtualKey, Velmark::int32 modifiers);

XKey toXKey(const juce::KeyPress& key);

} // namespace cadrel::host
