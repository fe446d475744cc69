// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Timecode.h"
#include "gui/input/TimecodeEntry.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <array>
#include <memory>
#include <optional>

namespace cadrel::gui {

/// An input for a timecode, with a sign where it is asked for, in four fields of two digits. What is typed becomes the value
/// when the focus leaves the input, on Return, and when the frames have two digits. Return and Escape go on to the parent
/// where nothing was typed.
class TcInput : public juce::Component {
public:
    class Listener {
    public:
        virtual ~Listener() = default;

        virtual void timecodeChanged(TcInput& input) = 0;
    };

    explicit TcInput(bool isSigned);
    ~TcInput() override;

    /// Listeners are not owned; null does nothing. The last that was added is told first. A listener may delete the input.
    void addListener(Listener* listener);
    void removeListener(Listener* listener) { m_listeners.remove(listener); }

    /// A timecode that the project's frame rate doesn't have is dropped. An uninitialised one is 00:00:00:00. Listeners are
    /// told when the value is another one.
    void setValue(const core::Timecode& timecode, bool isPositive, juce::NotificationType notification);
    void setValue(const core::Timecode& timecode, juce::NotificationType notification);
    /// Without its sign.
    const core::Timecode& getValue() const { return m_entry.value(); }
    bool isPositive() const { return m_entry.isPositive(); }

    /// An input that isn't active is covered and disabled. What was typed is taken before.
    void setActive(bool isActive);
    void setBackgroundColour(juce::Colour colour);

    void paint(juce::Graphics& graphics) override;
    void resized() override;
    /// The input is covered also when what it lies on is disabled.
    void enablementChanged() override;
    void parentHierarchyChanged() override;
    /// Steps the field under the mouse, or flips the sign, when the input has the focus.
    void mouseWheelMove(const juce::MouseEvent& event, const juce::MouseWheelDetails& wheel) override;
    bool keyPressed(const juce::KeyPress& key) override;
    void focusOfChildComponentChanged(FocusChangeType cause) override;

private:
    /// One of the editors that are typed into.
    class Editor;

    /// Covers the input while it is disabled.
    void cover();
    /// What was typed, pasted or undone.
    void typed(Editor& editor);
    bool stepByKey(Editor& editor, const juce::KeyPress& key);
    void step(Editor& editor, bool isUp);
    std::optional<TimecodeEntry::Field> fieldOf(const Editor& editor) const;

    TimecodeEntry::Texts texts() const;
    void showValue();
    /// Takes what the editors hold, and shows the value. Whether it is another one.
    bool take();
    /// Nothing of the input may be touched afterwards.
    void tell();

    TimecodeEntry m_entry;
    juce::ListenerList<Listener> m_listeners;
    juce::Colour m_backgroundColour = juce::Colours::black;
    std::array<std::unique_ptr<Editor>, TimecodeEntry::FieldCount> m_fields; ///< hours first
    std::unique_ptr<Editor> m_sign;
    std::array<juce::TextEditor, 3> m_colons; ///< the last first
    juce::Label m_disableOverlay;
};

} // namespace cadrel::gui
