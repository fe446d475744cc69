// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_core/juce_core.h>

#include <string>

namespace desktop {

/// Texts of the host as JUCE takes them, and back.
juce::String toJuce(const std::u16string& text);
std::u16string fromJuce(const juce::String& text);

} // namespace desktop
