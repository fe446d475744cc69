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
constexpr const char* DigitLetters = "0123456789";

struct Place {
    const char* name;
    const wchar_t* title; ///< for screen readers
    int x;
    int width;
};
constexpr std::array<Place, TimecodeEntry::FieldCount> FieldPlaces = {{
    {"Hours Edit", L"Hours", 14, 24},
    {"Minutes Edit", L"Minutes", 34, 24},
    {"Seconds Edit", L"Seconds", 54, 24},
    {"FramesEdit", L"Frames", 74, 24},
}};
constexpr Place SignPlace = {"Sign", L"Sign", 0, 15};
constexpr std::array<Place, 3> ColonPlaces = {{{"", L"", 71, 10}, {"", L"", 51, 10}, {"", L"", 31, 10}}};

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

/// Tells its input of each change by the user after it was made, and leaves Return and Escape to it. It tells at once: JUCE
/// itself tells of changes later, and by then the next digit would have gone to the wrong field.
class TcInput::Editor : public juce::TextEditor {
public:
    Editor(TcInput& owner, const Place& place) : TextEditor(place.name), m_owner(owner)
    {
        setTitle(translatedText(place.title));
        setUp(*this, true);
        setEscapeAndReturnKeysConsumed(false);
    }

    bool keyPressed(const juce::KeyPress& key) override
    {
        bool isUsed = false;
        guardUser([&] {
            isUsed = m_owner.stepByKey(*this, key);
            if (!isUsed)
                change([&] { isUsed = TextEditor::keyPressed(key); });
        });
        return isUsed;
    }
    void insertTextAtCaret(const juce::String& text) override
    {
        guardUser([&] {
            change([&] {
                m_hasDigit = m_hasDigit || text.containsAnyOf(DigitLetters);
                TextEditor::insertTextAtCaret(text);
            });
        });
    }
    void mouseUp(const juce::MouseEvent& event) override
    {
        guardSystem([&] {
            TextEditor::mouseUp(event);
            // At a caret between two digits there would be no room for what is typed.
            if (event.mouseWasClicked() && !event.mods.isPopupMenu())
                selectAll();
        });
    }
    void performPopupMenuAction(int item) override
    {
        guardUser([&] { change([&] { TextEditor::performPopupMenuAction(item); }); });
    }
    void focusLost(FocusChangeType cause) override
    {
        guardSystem([&] {
            TextEditor::focusLost(cause);
            setHighlightedRegion({});
        });
    }

private:
    /// Runs what may change the text. After the outermost one the input is told, which may delete this. A digit counts even if
    /// it leaves the text as it was.
    template <class Change>
    void change(Change&& run)
    {
        if (m_isChanging) {
            run();
            return;
        }
        const juce::String before = getText();
        m_hasDigit = false;
        {
            const juce::ScopedValueSetter<bool> changing(m_isChanging, true);
            run();
        }
        if (m_hasDigit || getText() != before)
            m_owner.typed(*this);
    }

    TcInput& m_owner;
    bool m_isChanging = false;
    bool m_hasDigit = false; ///< the change has brought one
};

TcInput::TcInput(bool isSigned) : m_entry(isSigned)
{
    for (std::size_t field = m_fields.size(); field-- > 0;) {
        m_fields[field] = std::make_unique<Editor>(*this, FieldPlaces[field]);
        m_fields[field]->setInputRestrictions(Digits, DigitLetters);
        addAndMakeVisible(*m_fields[field]);
    }
    m_sign = std::make_unique<Editor>(*this, SignPlace);
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
    guardSystem([this] {
        // Nobody is told of what was typed, and no editor loses the focus when half of this is gone.
        m_listeners.clear();
        giveAwayKeyboardFocus();
    });
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
    // JUCE doesn't expect that a listener deletes the input while it is being disabled.
    const SafePointer<TcInput> self(this);
    if (!isActive && hasKeyboardFocus(true)) {
        if (getParentComponent())
            getParentComponent()->grabKeyboardFocus();
        if (self)
            giveAwayKeyboardFocus();
    }
    if (self)
        setEnabled(isActive);
}

void TcInput::enablementChanged()
{
    guardSystem([this] { cover(); });
}

void TcInput::parentHierarchyChanged()
{
    guardSystem([this] { cover(); });
}

void TcInput::cover()
{
    m_disableOverlay.setVisible(!isEnabled());
    m_disableOverlay.toFront(false);
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
        auto* const editor = dynamic_cast<Editor*>(getComponentAt(event.getPosition()));
        // Only an enabled input has the focus.
        if (editor && hasKeyboardFocus(true) && wheel.deltaY != 0.0F)
            step(*editor, wheel.deltaY > 0.0F);
        else
            Component::mouseWheelMove(event, wheel);
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
