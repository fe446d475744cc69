// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

#include <string>

namespace cadrel::tests {

/// A window without a screen, which has the keyboard focus. It passes keys and clicks to its children as a real one does.
/// JUCE has to be there while it lives.
class FocusedWindow : public juce::Component {
public:
    FocusedWindow(int width, int height);
    ~FocusedWindow() override;

    /// As another window of the host gets the keyboard, and as this one gets it back.
    void loseKeyboard();
    void regainKeyboard();

    /// False when no component has used the key.
    bool press(int keyCode, juce::ModifierKeys modifiers = {});
    /// Presses the keys of the characters, one by one.
    void type(const std::string& text);
    /// A click with the left button in the middle of a component, or at a place of the window.
    void click(const juce::Component& component);
    void click(juce::Point<int> place);

    /// Deals with all messages that were sent until now and with those that they send.
    static void pump();

private:
    juce::ComponentPeer* createNewPeer(int styleFlags, void* nativeWindow) override;
};

} // namespace cadrel::tests
