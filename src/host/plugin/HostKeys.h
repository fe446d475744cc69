// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Types.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <optional>

namespace cadrel::host {

/// A key in the way of JUCE: what IPlugView::onKeyDown tells; nothing for a key that JUCE has no code for.
std::optional<juce::KeyPress> toKeyPress(char16_t character, Velmark::int32 virtualKey, Velmark::int32 modifiers);

} // namespace cadrel::host
