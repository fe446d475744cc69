// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/look/TextShortening.h"

#include <juce_gui_basics/juce_gui_basics.h>

namespace cadrel::gui {

/// How the controls of the window look. While it lives it is the default of the process, so that popups and tooltips have it
/// too. Each window holds one `juce::SharedResourcePointer<LookAndFeel>`: all share one look and feel, which goes with the
/// last of them.
///
/// JUCE calls all of these. Those that draw run inside the guard. Those that return something can't fail: the fonts are those of
/// the table, the typefaces are there since the start, and a tick is a few lines.
class LookAndFeel : public juce::LookAndFeel_V2 {
public:
    LookAndFeel();
    ~LookAndFeel() override;

    /// The bundled family, for its own name and for the default sans serif.
    juce::Typeface::Ptr getTypefaceForFont(const juce::Font& font) override;

    void drawButtonBackground(juce::Graphics& graphics, juce::Button& button, const juce::Colour& background,
                              bool isHighlighted, bool isDown) override;
    juce::Font getTextButtonFont(juce::TextButton& button, int height) override;
    void drawButtonText(juce::Graphics& graphics, juce::TextButton& button, bool isHighlighted, bool isDown) override;
    void drawToggleButton(juce::Graphics& graphics, juce::ToggleButton& button, bool isHighlighted,
                          bool isDown) override;
    void drawTickBox(juce::Graphics& graphics, juce::Component& component, float x, float y, float width, float height,
                     bool isTicked, bool isEnabled, bool isHighlighted, bool isDown) override;
    juce::Path getTickShape(float height) override;

    void drawComboBox(juce::Graphics& graphics, int width, int height, bool isDown, int buttonX, int buttonY,
                      int buttonWidth, int buttonHeight, juce::ComboBox& box) override;
    juce::Font getComboBoxFont(juce::ComboBox& box) override;
    void drawPopupMenuBackground(juce::Graphics& graphics, int width, int height) override;
    void drawPopupMenuItem(juce::Graphics& graphics, const juce::Rectangle<int>& area, bool isSeparator, bool isActive,
                           bool isHighlighted, bool isTicked, bool hasSubMenu, const juce::String& text,
                           const juce::String& shortcut, const juce::Drawable* icon,
                           const juce::Colour* colour) override;
    juce::Font getPopupMenuFont() override;

    void drawLabel(juce::Graphics& graphics, juce::Label& label) override;
    void drawProgressBar(juce::Graphics& graphics, juce::ProgressBar& bar, int width, int height, double progress,
                         const juce::String& text) override;
    /// A disabled editor lies under a shade. Where what is beneath it shows, only its outline is dimmed.
    void drawTextEditorOutline(juce::Graphics& graphics, int width, int height, juce::TextEditor& editor) override;
    void drawTableHeaderBackground(juce::Graphics& graphics, juce::TableHeaderComponent& header) override;
    /// An arrow after the name shows the direction that the table is sorted in.
    void drawTableHeaderColumn(juce::Graphics& graphics, juce::TableHeaderComponent& header, const juce::String& name,
                               int columnId, int width, int height, bool isMouseOver, bool isMouseDown,
                               int flags) override;

private:
    void setColours();

    juce::Typeface::Ptr m_regular;
    juce::Typeface::Ptr m_bold;
    juce::SharedResourcePointer<TextShortening> m_shortening; ///< keeps what drawText remembers
};

} // namespace cadrel::gui
