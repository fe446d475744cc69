// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/input/SpinBox.h"

#include "gui/guard/Guard.h"
#include "gui/look/ButtonTile.h"
#include "gui/look/Text.h"

namespace cadrel::gui {

namespace {

constexpr float FontHeight = 16.0F;
constexpr const char* Digits = "0123456789";

} // namespace

SpinBox::SpinBox()
    : m_valueDisplay("m_valueDisplay"), m_upButton("m_upButton", ButtonPicture::Symbol::Up),
      m_downButton("m_downButton", ButtonPicture::Symbol::Down)
{
    setWantsKeyboardFocus(true);
    m_valueDisplay.setFont({FontFamily, FontHeight, juce::Font::plain});
    m_valueDisplay.setJustificationType(juce::Justification::centredLeft);
    m_valueDisplay.setColour(juce::Label::textColourId, juce::Colours::white);
    m_valueDisplay.setColour(juce::Label::backgroundColourId, juce::Colours::black);
    m_valueDisplay.setColour(juce::TextEditor::textColourId, juce::Colours::white);
    m_valueDisplay.addMouseListener(this, false);
    m_valueDisplay.addListener(this);
    addAndMakeVisible(m_valueDisplay);
    for (PictureButton* const button : {&m_upButton, &m_downButton}) {
        button->setWantsKeyboardFocus(false);
        button->addListener(this);
        addAndMakeVisible(*button);
    }
    showValue();
}

SpinBox::~SpinBox()
{
    // Nobody is told of what was typed, and the editor doesn't lose the focus when half of this is gone.
    m_listeners.clear();
    giveAwayKeyboardFocus();
    m_valueDisplay.removeMouseListener(this);
}

void SpinBox::addListener(Listener* listener)
{
    if (listener)
        m_listeners.add(listener);
}

void SpinBox::setRange(double minimum, double maximum, double step)
{
    m_entry.setRange(minimum, maximum, step);
    showValue();
}

void SpinBox::setValue(double value, juce::NotificationType notification)
{
    m_entry.set(value);
    showValue();
    if (notification != juce::dontSendNotification)
        tell();
}

void SpinBox::setSuffix(const juce::String& suffix)
{
    m_entry.setSuffix(suffix.toStdString());
    showValue();
}

void SpinBox::setBackgroundColour(juce::Colour colour)
{
    m_backgroundColour = colour;
    repaint();
}

void SpinBox::paint(juce::Graphics& graphics)
{
    guardSystem([&] { graphics.fillAll(m_backgroundColour); });
}

void SpinBox::paintOverChildren(juce::Graphics& graphics)
{
    guardSystem([&] {
        if (hasKeyboardFocus(false))
            drawFocusRing(graphics, m_valueDisplay.getBounds().toFloat(), 0.0F);
    });
}

void SpinBox::resized()
{
    guardSystem([&] {
        m_valueDisplay.setBounds(0, 0, getWidth() - 20, 20);
        m_upButton.setBounds(getWidth() - 11, 1, 10, 8);
        m_downButton.setBounds(getWidth() - 11, 11, 10, 8);
    });
}

void SpinBox::mouseDown(const juce::MouseEvent& event)
{
    guardUser([&] {
        if (event.eventComponent == &m_valueDisplay && isEnabled() && !event.mods.isPopupMenu())
            openEditor();
    });
}

void SpinBox::mouseWheelMove(const juce::MouseEvent& event, const juce::MouseWheelDetails& wheel)
{
    guardUser([&] {
        // The label's own event comes here, too; it isn't on this component.
        if (event.eventComponent == this && isEnabled() && wheel.deltaY != 0.0F)
            step(wheel.deltaY > 0.0F);
    });
}

bool SpinBox::keyPressed(const juce::KeyPress& key)
{
    bool isUsed = false;
    guardUser([&] {
        const bool isUp = key == juce::KeyPress(juce::KeyPress::upKey);
        if (isUp || key == juce::KeyPress(juce::KeyPress::downKey)) {
            isUsed = true;
            step(isUp);
        } else if (juce::String(Digits).containsChar(key.getTextCharacter())) {
            openEditor();
            if (juce::TextEditor* const editor = m_valueDisplay.getCurrentTextEditor())
                isUsed = editor->keyPressed(key);
        }
    });
    return isUsed;
}

void SpinBox::focusGained(FocusChangeType)
{
    repaint();
}

void SpinBox::focusLost(FocusChangeType)
{
    repaint();
}

void SpinBox::focusOfChildComponentChanged(FocusChangeType)
{
    guardUser([&] {
        if (m_valueDisplay.isBeingEdited() && !m_valueDisplay.hasKeyboardFocus(true))
            m_valueDisplay.hideEditor(false);
    });
}

void SpinBox::labelTextChanged(juce::Label*)
{
    guardUser([&] {
        m_entry.type(m_typed);
        showValue();
        tell();
    });
}

void SpinBox::editorHidden(juce::Label*, juce::TextEditor& editor)
{
    guardUser([&] {
        // The label tells afterwards whether the text is another one. Only then may the input be deleted.
        m_typed = editor.getText().toStdString();
        m_valueDisplay.setEditable(false);
        showValue();
    });
}

void SpinBox::buttonClicked(juce::Button* button)
{
    guardUser([&] { step(button == &m_upButton); });
}

void SpinBox::openEditor()
{
    if (m_valueDisplay.isBeingEdited())
        return;
    m_valueDisplay.setEditable(true);
    m_valueDisplay.setText(m_entry.number(), juce::dontSendNotification);
    m_valueDisplay.showEditor();
    if (juce::TextEditor* const editor = m_valueDisplay.getCurrentTextEditor()) {
        editor->setInputRestrictions(0, Digits);
        // Where the label has its text.
        editor->setJustification(juce::Justification::centredLeft);
        editor->setBorder(m_valueDisplay.getBorderSize());
        editor->setIndents(0, 0);
    }
}

void SpinBox::step(bool isUp)
{
    const SafePointer<SpinBox> self(this);
    m_valueDisplay.hideEditor(false);
    if (!self)
        return;
    if (isUp)
        m_entry.stepUp();
    else
        m_entry.stepDown();
    showValue();
    tell();
}

void SpinBox::showValue()
{
    m_valueDisplay.setText(juce::String::fromUTF8(m_entry.numberWithSuffix().c_str()), juce::dontSendNotification);
}

void SpinBox::tell()
{
    const BailOutChecker checker(this);
    m_listeners.callChecked(checker, [this](Listener& listener) { listener.valueChanged(*this); });
}

} // namespace cadrel::gui
