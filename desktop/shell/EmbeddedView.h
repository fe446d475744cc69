// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/x11/XContainer.h"
#include "standin/window/WindowSystem.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <chrono>
#include <string>
#include <vector>

namespace desktop {

/// The X window of a component; 0 for none.
XContainer::Window windowOf(const juce::ComponentPeer* peer);

/// The place of a module's window in the window of the host. The module's view lies in an X window of its own over this component,
/// which has its size. There is one such window at a time.
class EmbeddedView : public juce::Component, public standin::WindowSystem {
public:
    /// Shown while there is no window.
    explicit EmbeddedView(juce::String hint) : Component("Embedded View"), m_hint(std::move(hint)) {}
    ~EmbeddedView() override;

    const char* parentType() const override;
    std::unique_ptr<standin::NativeWindow> createWindow(const std::string& title, std::int32_t width,
                                                        std::int32_t height,
                                                        standin::NativeWindow::Listener& listener) override;

    bool hasWindow() const { return m_window != nullptr; }
    /// While it is covered, the module's window is hidden, and a picture of it is shown in its place: nothing of ours could be
    /// seen over it, and it takes no input. Afterwards it has the keyboard again if it had it before.
    void setCovered(bool isCovered);
    /// Whether the keyboard is in the module's window.
    bool hasKeyboard() const;
    /// Gives the keyboard to the module's window, if there is one and it isn't covered.
    void takeKeyboard();
    /// To our own window, when the keyboard is in the module's.
    void giveKeyboardAway();

    /// On the module's view, at a place of this component. False where there is none.
    bool drop(const std::vector<std::string>& files, juce::Point<int> place);

    void paint(juce::Graphics& graphics) override;
    void resized() override;
    void moved() override;

private:
    class Window;

    /// In physical pixels of the window around it.
    XContainer::Place place() const;
    void layOut();
    /// What the module's view hasn't used is ours.
    void pass(const XContainer::Key& key);

    juce::String m_hint;
    Window* m_window = nullptr; ///< not owned
    /// Of the window, or null.
    juce::Image takePicture();

    juce::Image m_picture;
    juce::Image m_formerPicture; ///< of the last time that it was covered
    std::chrono::steady_clock::time_point m_uncovered;
    bool m_isCovered = false;
    bool m_hadKeyboard = false;
};

} // namespace desktop
