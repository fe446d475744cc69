// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/look/Palette.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <string>

namespace cadrel::gui {

/// The name of the window's font family. JUCE finds it while a LookAndFeel lives.
inline constexpr const char* FontFamily = "Roboto Condensed";

/// The font of the index, as fontStyle tells.
juce::Font getFont(int index);

inline juce::Colour toColour(PaletteColour colour)
{
    return juce::Colour(colour.argb);
}

/// The text in the user's language, as JUCE takes it; the text itself where it can't be translated.
juce::String translatedText(const std::wstring& text);

/// Draws the text in one line into the box. With `shorten`, a text that is wider than the box ends in "...".
void drawText(juce::Graphics& graphics, const juce::String& text, float x, float y, float width, float height,
              juce::Justification justification, const juce::Font& font, juce::Colour colour, bool shorten);

} // namespace cadrel::gui
