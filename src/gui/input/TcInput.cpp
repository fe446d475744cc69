// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/input/TcInput.h"

#include "gui/guard/Guard.h"
#include "gui/look/ButtonTile.h"
#include "gui/look/Text.h"

#include <memory>
#include <utility>

namespace cadrel::gui {

namespace {

constexpr int FieldHeight = 22;
constexpr int Digits = 2;

struct Place {
    const char* name;
    int x;
    int width;
};
constexpr std::array<Place, TimecodeEntry::FieldCount> FieldPlaces = {{
    {"Hours Edit", 14, 24},
    {"Minutes Edit", 34, 24},
    {"Seconds Edit", 54, 24},
    {"FramesEdit", 74, 24},
}};
constexpr Place SignPlace = {"Sign", 0, 15};
constexpr std::array<Place, 3> ColonPlaces = {{{"", 71, 10}, {"", 51, 10}, {"", 31, 10}}};

void setUp(juce::TextEditor& editor, bool isEditable)
{
    editor.setMultiLine(false);
    editor.setReturnKeyStartsNewLine(false);
    editor.setReadOnly(!isEditable);
    editor.setScrollbarsShown(isEditable);
    editor.setCaretVisible(isEditable);
    editor.setPopupMenuEnabled(isEditable);
    editor.setSelectAllWhenFocused(isEditable);
    editor.setFont(getFont(7));
    editor.setJustification(juce::Justification::centred);
    editor.setIndents(0, 0);
    editor.setBorder({});
    editor.setColour(juce::TextEditor::textColourId, juce::Colours::white);
    editor.setColour(juce::TextEditor::backgroundColourId, juce::Colour(isEditable ? 0x00ffffff : 0x00000000));
}

} // namespace

/// Tells its input of each key after it has worked, and leaves Return and Escape to it. It tells at once: JUCE itself tells of
/// changes later, and by then the next digit would have gone to the wrong field.
class TcInput::Editor : public juce::TextEditor {
public:
    Editor(TcInput& owner, const char* name) : TextEditor(name), m_owner(owner)
    {
        setUp(*this, true);
        setEscapeAndReturnKeysConsumed(false);
    }

    bool keyPressed(const juce::KeyPress& key) override
    {
        bool isUsed = false;
        guardUser([&] {
            isUsed = m_owner.stepByKey(*this, key);
            if (isUsed)
                return;
            const juce::String before = getText();
            isUsed = TextEditor::keyPressed(key);
            // It may delete this.
            if (getText() != before)
                m_owner.typed(*this);
        });
        return isUsed;
    }
    void focusLost(FocusChangeType cause) override
    {
        guardSystem([&] {
            TextEditor::focusLost(cause);
            setHighlightedRegion({});
        });
    }

private:
    TcInput& m_owner;
};

TcInput::TcInput(bool isSigned) : m_entry(isSigned)
{
    for (std::size_t field = m_fields.size(); field-- > 0;) {
        m_fields[field] = std::make_unique<Editor>(*this, FieldPlaces[field].name);
        m_fields[field]->setInputRestrictions(Digits, "0123456789");
        addAndMakeVisible(*m_fields[field]);
    }
    m_sign = std::make_unique<Editor>(*this, SignPlace.name);
    m_sign->setInputRestrictions(1, "+-");
    m_sign->setColour(juce::CaretComponent::caretColourId, juce::Colours::black);
    addChildComponent(*m_sign);
    m_sign->setVisible(isSigned);
    for (juce::TextEditor& colon : m_colons) {
        setUp(colon, false);
        colon.setText(":", false);
        colon.setWantsKeyboardFocus(false);
        colon.setInterceptsMouseClicks(false, false);
        addAndMakeVisible(colon);
    }
    m_disableOverlay.setName("m_disableOverlay");
    m_disableOverlay.setText("\n", juce::dontSendNotification);
    m_disableOverlay.setColour(juce::Label::backgroundColourId, juce::Colour(DisabledShade));
    addChildComponent(m_disableOverlay);
    showValue();
    setSize(100, FieldHeight);
}

TcInput::~TcInput()
{
    // Nobody is told of what was typed, and no editor loses the focus when half of this is gone.
    m_listeners.clear();
    giveAwayKeyboardFocus();
}

void TcInput::addListener(Listener* listener)
{
    if (listener)
        m_listeners.add(listener);
}

void TcInput::setValue(const core::Timecode& timecode, bool isPositive, juce::NotificationType notification)
{
    const bool isAnother = m_entry.set(timecode, isPositive);
    showValue();
    if (isAnother && notification != juce::dontSendNotification)
        tell();
}

void TcInput::setValue(const core::Timecode& timecode, juce::NotificationType notification)
{
    setValue(timecode, true, notification);
}

void TcInput::setActive(bool isActive)
{
    setEnabled(isActive);
}

void TcInput::enablementChanged()
{
    guardSystem([this] {
        m_disableOverlay.setVisible(!isEnabled());
        m_disableOverlay.toFront(false);
    });
}

void TcInput::setBackgroundColour(juce::Colour colour)
{
    m_backgroundColour = colour;
    repaint();
}

void TcInput::paint(juce::Graphics& graphics)
{
    guardSystem([&] { graphics.fillAll(m_backgroundColour); });
}

void TcInput::resized()
{
    guardSystem([&] {
        const int y = getHeight() / 2 - FieldHeight / 2;
        const auto put = [y](juce::Component& component, const Place& place) {
            component.setBounds(place.x, y, place.width, FieldHeight);
        };
        for (std::size_t field = 0; field < m_fields.size(); ++field)
            put(*m_fields[field], FieldPlaces[field]);
        put(*m_sign, SignPlace);
        for (std::size_t colon = 0; colon < m_colons.size(); ++colon)
            put(m_colons[colon], ColonPlaces[colon]);
        m_disableOverlay.setBounds(getLocalBounds());
    });
}

void TcInput::mouseWheelMove(const juce::MouseEvent& event, const juce::MouseWheelDetails& wheel)
{
    guardUser([&] {
        if (!isEnabled() || !hasKeyboardFocus(true)) {
            Component::mouseWheelMove(event, wheel);
            return;
        }
        auto* const editor = dynamic_cast<Editor*>(getComponentAt(event.getPosition()));
        if (editor && wheel.deltaY != 0.0F)
            step(*editor, wheel.deltaY > 0.0F);
    });
}

bool TcInput::keyPressed(const juce::KeyPress& key)
{
    bool isUsed = false;
    guardUser([&] {
        const bool isReturn = key == juce::KeyPress(juce::KeyPress::returnKey);
        const bool isEscape = key == juce::KeyPress(juce::KeyPress::escapeKey);
        if ((!isReturn && !isEscape) || texts() == m_entry.texts())
            return;
        isUsed = true;
        if (isEscape)
            showValue();
        else if (take())
            tell();
    });
    return isUsed;
}

void TcInput::focusOfChildComponentChanged(FocusChangeType)
{
    guardUser([&] {
        if (!hasKeyboardFocus(true) && take())
            tell();
    });
}

void TcInput::typed(Editor& editor)
{
    const std::optional<TimecodeEntry::Field> field = fieldOf(editor);
    if (!isEnabled() || !field || editor.getTotalNumChars() != Digits)
        return;
    if (*field != TimecodeEntry::Frames) {
        m_fields[*field + 1]->grabKeyboardFocus();
        return;
    }
    const bool isAnother = take();
    editor.selectAll();
    if (isAnother)
        tell();
}

bool TcInput::stepByKey(Editor& editor, const juce::KeyPress& key)
{
    const bool isUp = key == juce::KeyPress(juce::KeyPress::upKey);
    if (!isUp && key != juce::KeyPress(juce::KeyPress::downKey))
        return false;
    step(editor, isUp);
    return true;
}

void TcInput::step(Editor& editor, bool isUp)
{
    editor.toFront(true);
    // What was typed and not taken yet counts.
    const bool wasTyped = take();
    const std::optional<TimecodeEntry::Field> field = fieldOf(editor);
    const bool isStepped = field ? m_entry.step(*field, isUp) : m_entry.flipSign();
    showValue();
    editor.selectAll();
    if (wasTyped || isStepped)
        tell();
}

std::optional<TimecodeEntry::Field> TcInput::fieldOf(const Editor& editor) const
{
    for (std::size_t field = 0; field < m_fields.size(); ++field) {
        if (m_fields[field].get() == &editor)
            return static_cast<TimecodeEntry::Field>(field);
    }
    return std::nullopt;
}

TimecodeEntry::Texts TcInput::texts() const
{
    TimecodeEntry::Texts texts;
    for (std::size_t field = 0; field < m_fields.size(); ++field)
        texts.fields[field] = m_fields[field]->getText().toStdString();
    texts.sign = m_sign->getText().toStdString();
    return texts;
}

void TcInput::showValue()
{
    const TimecodeEntry::Texts shown = m_entry.texts();
    for (std::size_t field = 0; field < m_fields.size(); ++field)
        m_fields[field]->setText(shown.fields[field], false);
    m_sign->setText(shown.sign, false);
}

bool TcInput::take()
{
    const bool isAnother = m_entry.commit(texts());
    showValue();
    return isAnother;
}

void TcInput::tell()
{
    const BailOutChecker checker(this);
    m_listeners.callChecked(checker, [this](Listener& listener) { listener.timecodeChanged(*this); });
}

} // namespace cadrel::gui
