// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/Text.h"

#include "gui/look/FontTable.h"
#include "gui/look/ShownText.h"
#include "gui/look/TextShortening.h"

#include <string>

namespace cadrel::gui {

namespace {

/// Wide enough for a text to be measured in.
constexpr float MeasuringWidth = 2000.0F;

juce::AttributedString attributed(const juce::String& text, juce::Justification justification, const juce::Font& font,
                                  juce::Colour colour)
{
    juce::AttributedString result;
    result.setWordWrap(juce::AttributedString::none);
    result.setJustification(justification);
    result.append(text, font, colour);
    return result;
}

double widthOf(const juce::String& text, const juce::Font& font)
{
    juce::TextLayout layout;
    layout.createLayout(attributed(text, juce::Justification::left, font, {}), MeasuringWidth);
    return layout.getWidth();
}

/// Whatever the width of a text depends on. JUCE's own name of a font rounds its height and leaves out how it is stretched.
juce::String keyOf(const juce::Font& font)
{
    return font.toString() + ' ' + juce::String(font.getHeight()) + ' ' + juce::String(font.getHorizontalScale()) +
           ' ' + juce::String(font.getExtraKerningFactor());
}

juce::String shortened(const juce::String& text, double boxWidth, const juce::Font& font)
{
    const juce::SharedResourcePointer<TextShortening> shortening;
    const auto measure = [&font](const std::wstring& part) { return widthOf(juce::String(part.c_str()), font); };
    const std::wstring fontKey = keyOf(font).toWideCharPointer();
    return shortening->cutOnce(text.toWideCharPointer(), boxWidth, fontKey, measure).c_str();
}

} // namespace

juce::Font getFont(int index)
{
    const FontStyle style = fontStyle(index);
    return {FontFamily, style.height, style.isBold ? juce::Font::bold : juce::Font::plain};
}

juce::String translatedText(const std::wstring& text)
{
    return translated(text).c_str();
}

void drawText(juce::Graphics& graphics, const juce::String& text, float x, float y, float width, float height,
              juce::Justification justification, const juce::Font& font, juce::Colour colour, bool shorten)
{
    const juce::String shown = shorten ? shortened(text, width, font) : text;
    attributed(shown, justification, font, colour).draw(graphics, {x, y, width, height});
}

} // namespace cadrel::gui
