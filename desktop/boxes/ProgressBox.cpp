// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/boxes/ProgressBox.h"

#include "desktop/boxes/BoxText.h"
#include "gui/look/Text.h"

namespace desktop {

namespace {

constexpr int TextFont = 0;
constexpr int LineHeight = 22;
constexpr int BarHeight = 18;

} // namespace

ProgressBox::ProgressBox(const standin::UserBoxes::Progress& progress)
    : Box("Progress Box", toJuce(progress.title)), m_progress(progress), m_bar(m_part)
{
    m_bar.setPercentageDisplay(false);
    m_cancel.onClick = [this] { cancel(); };
    addAndMakeVisible(m_bar);
    addChildComponent(m_cancel);
    setPanelSize(520, 190);
    update(progress);
}

void ProgressBox::update(const standin::UserBoxes::Progress& progress)
{
    m_progress = progress;
    m_part = progress.percentage / 100.0;
    m_cancel.setVisible(progress.canCancel);
    repaint();
}

void ProgressBox::cancel()
{
    if (!m_progress.canCancel)
        return;
    m_isCancelled = true;
    m_cancel.setEnabled(false);
    repaint();
}

void ProgressBox::paint(juce::Graphics& graphics)
{
    Box::paint(graphics);
    juce::Rectangle<int> area = content();
    const auto line = [&](const juce::String& text) {
        const juce::Rectangle<float> place = area.removeFromTop(LineHeight).toFloat();
        cadrel::gui::drawText(graphics, text, place.getX(), place.getY(), place.getWidth(), place.getHeight(),
                              juce::Justification::centredLeft, cadrel::gui::getFont(TextFont), juce::Colours::black,
                              true);
    };
    line(m_isCancelled ? juce::String("Cancelling ...") : toJuce(m_progress.text));
    line(toJuce(m_progress.status));
}

void ProgressBox::layOut()
{
    juce::Rectangle<int> area = content();
    layOutButtons(area.removeFromBottom(ButtonHeight), {&m_cancel});
    area.removeFromTop(2 * LineHeight);
    m_bar.setBounds(area.removeFromTop(BarHeight));
}

} // namespace desktop
