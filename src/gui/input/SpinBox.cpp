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

SpinBox::Display::Display(SpinBox& owner) : Label("m_valueDisplay"), m_owner(owner) {}

void SpinBox::Display::inputAttemptWhenModal()
{
    guardUser([this] { m_owner.endTyping(); });
}

SpinBox::SpinBox()
    : m_valueDisplay(*this), m_upButton("m_upButton", ButtonPicture::Symbol::Up),
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
    m_upButton.setTooltip(translatedText(L"Up"));
    m_downButton.setTooltip(translatedText(L"Down"));
    showValue();
}

SpinBox::~SpinBox()
{
    guardSystem([this] {
        // Nobody is told of what was typed, and the editor doesn't lose the focus when half of this is gone.
        m_listeners.clear();
        giveAwayKeyboardFocus();
        m_valueDisplay.removeMouseListener(this);
    });
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
    guardSystem([&] { graphics.fillAll(shaded(m_backgroundColour)); });
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
        if (event.eventComponent != this)
            return;
        if (isEnabled() && wheel.deltaY != 0.0F)
            step(wheel.deltaY > 0.0F);
        else
            Component::mouseWheelMove(event, wheel);
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
        } else if (m_valueDisplay.isBeingEdited() && key == juce::KeyPress(juce::KeyPress::returnKey)) {
            isUsed = true;
            endTyping();
        } else if (m_valueDisplay.isBeingEdited() && key == juce::KeyPress(juce::KeyPress::escapeKey)) {
            isUsed = true;
            showValue();
        } else if (juce::String(Digits).containsChar(key.getTextCharacter())) {
            openEditor();
            if (juce::TextEditor* const editor = m_valueDisplay.getCurrentTextEditor())
                isUsed = editor->keyPressed(key);
        }
    });
    return isUsed;
}

void SpinBox::enablementChanged()
{
    guardSystem([this] {
        // JUCE doesn't expect that a listener deletes the input meanwhile, so nobody is told.
        if (!isEnabled() && m_valueDisplay.isBeingEdited())
            showValue();
        // The look dims what stands on it.
        m_valueDisplay.setColour(juce::Label::backgroundColourId, shaded(juce::Colours::black));
        repaint();
    });
}

/// The ground of a disabled input; one that isn't drawn stays so.
juce::Colour SpinBox::shaded(juce::Colour ground) const
{
    return isEnabled() || ground.isTransparent() ? ground : ground.overlaidWith(juce::Colour(DisabledShade));
}

void SpinBox::focusGained(FocusChangeType)
{
    guardSystem([this] { repaint(); });
}

void SpinBox::focusLost(FocusChangeType)
{
    guardSystem([this] { repaint(); });
}

void SpinBox::focusOfChildComponentChanged(FocusChangeType)
{
    guardUser([&] {
        if (m_valueDisplay.isBeingEdited() && !m_valueDisplay.hasKeyboardFocus(true))
            endTyping();
    });
}

void SpinBox::labelTextChanged(juce::Label* label)
{
    guardUser([&] {
        m_entry.type(label->getText().toStdString());
        showValue();
        tell();
    });
}

void SpinBox::editorHidden(juce::Label*, juce::TextEditor&)
{
    guardSystem([this] { m_valueDisplay.setEditable(false); });
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
        // They come here, at once and whatever the text is.
        editor->setEscapeAndReturnKeysConsumed(false);
        // Where the label has its text.
        editor->setJustification(juce::Justification::centredLeft);
        editor->setBorder(m_valueDisplay.getBorderSize());
        editor->setIndents(0, 0);
    }
}

bool SpinBox::take()
{
    const juce::TextEditor* const editor = m_valueDisplay.getCurrentTextEditor();
    if (!editor)
        return false;
    m_entry.type(editor->getText().toStdString());
    // It closes the editor.
    showValue();
    return true;
}

void SpinBox::endTyping()
{
    if (take())
        tell();
}

void SpinBox::step(bool isUp)
{
    take();
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
