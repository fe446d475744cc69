// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/boxes/AlertBox.h"

#include "gui/look/Text.h"

#include <algorithm>
#include <cmath>

namespace desktop {

namespace {

constexpr int MessageFont = 0;
constexpr int Width = 520;
constexpr int MostTextHeight = 420;

int heightOf(const juce::String& text, int width)
{
    juce::AttributedString content;
    content.append(text, cadrel::gui::getFont(MessageFont));
    juce::TextLayout layout;
    layout.createLayout(content, static_cast<float>(width));
    constexpr int Spare = 24;
    return static_cast<int>(std::ceil(layout.getHeight())) + Spare;
}

} // namespace

AlertBox::AlertBox(const juce::String& title, const juce::String& message, const juce::StringArray& buttons,
                   std::size_t byReturn)
    : Box("Alert Box", title), m_byReturn(byReturn)
{
    m_message.setName("Alert Message");
    m_message.setMultiLine(true, true);
    m_message.setReadOnly(true);
    m_message.setCaretVisible(false);
    m_message.setPopupMenuEnabled(false);
    m_message.setBorder({});
    m_message.setIndents(0, 2);
    m_message.setFont(cadrel::gui::getFont(MessageFont));
    m_message.setColour(juce::TextEditor::backgroundColourId, juce::Colours::transparentBlack);
    m_message.setColour(juce::TextEditor::outlineColourId, juce::Colours::transparentBlack);
    m_message.setColour(juce::TextEditor::textColourId, juce::Colours::black);
    m_message.setText(message, false);
    addAndMakeVisible(m_message);
    int buttonsWidth = 0;
    for (const juce::String& label : buttons) {
        auto button = std::make_unique<juce::TextButton>(label);
        button->onClick = [this, index = m_buttons.size()] { use(index); };
        addAndMakeVisible(*button);
        buttonsWidth += buttonWidth(*button) + Margin;
        m_buttons.push_back(std::move(button));
    }
    const int width = std::max(Width, buttonsWidth + 2 * Margin);
    const int wholeHeight = heightOf(message, width - 2 * Margin);
    const int textHeight = std::min(wholeHeight, MostTextHeight);
    m_message.setScrollbarsShown(wholeHeight > MostTextHeight);
    constexpr int Title = 40;
    setPanelSize(width, Title + 2 * Margin + textHeight + Margin + ButtonHeight);
}

void AlertBox::layOut()
{
    juce::Rectangle<int> area = content();
    std::vector<juce::Button*> buttons;
    for (const auto& button : m_buttons)
        buttons.push_back(button.get());
    layOutButtons(area.removeFromBottom(ButtonHeight), buttons);
    m_message.setBounds(area.withTrimmedBottom(Margin));
}

void AlertBox::use(std::size_t button)
{
    if (isDone())
        return;
    m_answer = button;
    setDone();
}

} // namespace desktop
