// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/look/LookAndFeel.h"
#include "tests/support/x11/VirtualScreen.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <functional>

namespace cadrel::tests {

/// A window with the keyboard focus on a screen of its own, for components that need the focus. Keys and the mouse go the way
/// that they take from the screen. JUCE lives as long as this.
class WindowOnScreen {
public:
    WindowOnScreen();
    WindowOnScreen(const WindowOnScreen&) = delete;
    WindowOnScreen& operator=(const WindowOnScreen&) = delete;
    ~WindowOnScreen();

    /// Shows the component at its place. It isn't owned.
    void show(juce::Component& component);

    /// Presses a key in what has the focus. False when nobody used it.
    bool press(const juce::KeyPress& key);
    bool press(int keyCode) { return press(juce::KeyPress(keyCode)); }
    void type(const juce::String& text);
    /// In the middle of the component.
    void click(juce::Component& component);
    void wheel(juce::Component& component, float deltaY);

    /// Delivers what is waiting.
    void serve();
    /// Serves until the condition holds; false when it doesn't within ten seconds.
    bool serveUntil(const std::function<bool()>& condition);

    juce::Component& content() { return m_content; }

private:
    struct ManagedScreen : VirtualScreen {
        ManagedScreen();
    };

    struct Content : juce::Component {
        void paint(juce::Graphics& graphics) override { graphics.fillAll(juce::Colours::black); }
    };

    juce::ComponentPeer& peer();

    ManagedScreen m_screen;
    juce::ScopedJuceInitialiser_GUI m_juce;
    gui::LookAndFeel m_look;
    Content m_content;
};

} // namespace cadrel::tests
