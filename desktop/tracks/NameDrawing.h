// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

#include <cstddef>
#include <string>
#include <unordered_map>

namespace desktop {

/// A text of the project, as JUCE takes it; what isn't well-formed becomes "?".
juce::String shownName(const std::u16string& name);

/// Draws names of one font, and remembers how their letters stand: a view of the tracks has a thousand of them, and is drawn many
/// times a second.
class NameDrawing {
public:
    /// The font of all names, as in cadrel::gui::getFont.
    static constexpr int FontIndex = 4;

    explicit NameDrawing(juce::Font font) : m_font(std::move(font)) {}

    /// As many letters as have room, in the current colour; none where fewer than three of a longer name have. `baseline` is
    /// where they stand.
    void draw(juce::Graphics& graphics, const std::u16string& name, float left, float baseline, float room);

    /// How many names it remembers at most. When there are more, it forgets them all.
    static constexpr std::size_t Capacity = 16384;

private:
    juce::Font m_font;
    std::unordered_map<std::u16string, juce::GlyphArrangement> m_names;
};

} // namespace desktop
