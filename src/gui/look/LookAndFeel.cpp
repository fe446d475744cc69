// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/LookAndFeel.h"

#include "gui/guard/Guard.h"
#include "gui/look/EmbeddedFonts.h"
#include "gui/look/Text.h"

#include <span>

namespace cadrel::gui {

namespace {

juce::Typeface::Ptr typefaceOf(std::span<const unsigned char> file)
{
    return juce::Typeface::createSystemTypefaceFor(file.data(), file.size());
}

} // namespace

LookAndFeel::LookAndFeel() : m_regular(typefaceOf(embedded::RegularFont)), m_bold(typefaceOf(embedded::BoldFont))
{
    setColours();
    // Forgets the typefaces that JUCE has found before.
    setDefaultSansSerifTypefaceName(FontFamily);
    setDefaultLookAndFeel(this);
}

LookAndFeel::~LookAndFeel()
{
    guardSystem([this] {
        if (&getDefaultLookAndFeel() == this)
            setDefaultLookAndFeel(nullptr);
        juce::Typeface::clearTypefaceCache();
    });
}

juce::Typeface::Ptr LookAndFeel::getTypefaceForFont(const juce::Font& font)
{
    const juce::String& name = font.getTypefaceName();
    if (name == FontFamily || name == juce::Font::getDefaultSansSerifFontName())
        return font.isBold() ? m_bold : m_regular;
    return LookAndFeel_V2::getTypefaceForFont(font);
}

void LookAndFeel::setColours()
{
    const juce::Colour white = juce::Colours::white;
    const juce::Colour black = juce::Colours::black;
    const juce::Colour selection = toColour(Palette::selection);
    setColour(juce::ListBox::backgroundColourId, toColour(Palette::panel));
    setColour(juce::ScrollBar::thumbColourId, white);
    setColour(juce::ScrollBar::trackColourId, juce::Colour(141, 143, 144));
    setColour(juce::Slider::textBoxTextColourId, white);
    setColour(juce::Slider::textBoxBackgroundColourId, black);
    setColour(juce::Slider::textBoxHighlightColourId, white);
    setColour(juce::Slider::textBoxOutlineColourId, black);
    setColour(juce::TextEditor::textColourId, white);
    setColour(juce::TextEditor::backgroundColourId, black);
    setColour(juce::TextEditor::focusedOutlineColourId, juce::Colours::transparentBlack);
    setColour(juce::TextEditor::shadowColourId, juce::Colours::transparentBlack);
    setColour(juce::TextEditor::highlightColourId, selection);
    setColour(juce::TextEditor::highlightedTextColourId, black);
    setColour(juce::CaretComponent::caretColourId, selection);
    setColour(juce::ComboBox::textColourId, white);
    setColour(juce::ComboBox::backgroundColourId, black);
    setColour(juce::ComboBox::outlineColourId, black);
    setColour(juce::ComboBox::buttonColourId, juce::Colour(121, 122, 123));
    setColour(juce::ComboBox::arrowColourId, black);
    setColour(juce::TooltipWindow::backgroundColourId, juce::Colour(239, 240, 246));
    setColour(juce::TooltipWindow::textColourId, juce::Colour(90, 90, 90));
    setColour(juce::TooltipWindow::outlineColourId, juce::Colour(118, 118, 118));
    setColour(juce::ProgressBar::backgroundColourId, black);
    setColour(juce::ProgressBar::foregroundColourId, juce::Colour(152, 177, 201));
    setColour(juce::PopupMenu::backgroundColourId, juce::Colour(240, 240, 240));
    setColour(juce::PopupMenu::highlightedBackgroundColourId, toColour(Palette::lightBlue).withAlpha(0.4F));
    setColour(juce::PopupMenu::highlightedTextColourId, black);
    setColour(juce::ToggleButton::tickDisabledColourId, black); // the box
    setColour(juce::ToggleButton::tickColourId, toColour(Palette::sheet));
    setColour(juce::TextButton::buttonOnColourId, toColour(Palette::lightBlue));
}

} // namespace cadrel::gui
