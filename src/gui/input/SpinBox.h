// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/input/NumberEntry.h"
#include "gui/look/PictureButton.h"

#include <juce_gui_basics/juce_gui_basics.h>

namespace cadrel::gui {

/// An input for a number within bounds: by two arrows, the mouse wheel, the up and down keys, or typing. What is typed becomes
/// the value when the focus leaves, on Return, and at a click elsewhere. Escape drops it.
class SpinBox : public juce::Component, public juce::Label::Listener, public juce::Button::Listener {
public:
    class Listener {
    public:
        virtual ~Listener() = default;

        virtual void valueChanged(SpinBox& spinBox) = 0;
    };

    SpinBox();
    ~SpinBox() override;

    /// Listeners are not owned; null does nothing. The last that was added is told first. A listener may delete the input.
    void addListener(Listener* listener);
    void removeListener(Listener* listener) { m_listeners.remove(listener); }

    /// Sets the value anew, without telling anybody.
    void setRange(double minimum, double maximum, double step);
    /// Within the bounds. Listeners are told even if the value is the same.
    void setValue(double value, juce::NotificationType notification);
    double getValue() const { return m_entry.value(); }
    void setSuffix(const juce::String& suffix);
    void setBackgroundColour(juce::Colour colour);

    void paint(juce::Graphics& graphics) override;
    void paintOverChildren(juce::Graphics& graphics) override;
    void resized() override;
    /// On the number, it opens an editor for it.
    void mouseDown(const juce::MouseEvent& event) override;
    void mouseWheelMove(const juce::MouseEvent& event, const juce::MouseWheelDetails& wheel) override;
    bool keyPressed(const juce::KeyPress& key) override;
    /// What was typed is dropped when the input is disabled.
    void enablementChanged() override;
    void focusGained(FocusChangeType cause) override;
    void focusLost(FocusChangeType cause) override;
    void focusOfChildComponentChanged(FocusChangeType cause) override;
    void labelTextChanged(juce::Label* label) override;
    void editorHidden(juce::Label* label, juce::TextEditor& editor) override;
    void buttonClicked(juce::Button* button) override;

private:
    /// Shows the number.
    class Display : public juce::Label {
    public:
        explicit Display(SpinBox& owner);

        /// A click elsewhere ends the typing.
        void inputAttemptWhenModal() override;

    private:
        SpinBox& m_owner;
    };

    juce::Colour shaded(juce::Colour ground) const;
    void openEditor();
    /// Closes the editor and takes what was typed. False when no editor was open.
    bool take();
    /// Takes what was typed and tells of it, even if the value is the same.
    void endTyping();
    void step(bool isUp);
    void showValue();
    /// Nothing of the input may be touched afterwards.
    void tell();

    NumberEntry m_entry;
    juce::ListenerList<Listener> m_listeners;
    juce::Colour m_backgroundColour = juce::Colours::black;
    Display m_valueDisplay;
    PictureButton m_upButton;
    PictureButton m_downButton;
};

} // namespace cadrel::gui
