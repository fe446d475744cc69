// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/shell/MainView.h"
#include "desktop/shell/WindowMemory.h"
#include "desktop/x11/ManagedScreen.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <functional>

namespace desktop {

/// The window of the program on the screen. It comes up as it was the last time, as far as it fits on the screen.
class MainWindow : public juce::DocumentWindow {
public:
    explicit MainWindow(WindowMemory memory);
    ~MainWindow() override;

    MainView& view() { return m_view; }
    /// The user wants to close the program.
    std::function<void()> onClose;
    /// Keeps its form for the next start if that has changed. To be called every now and then, and at the end.
    void keepForm();

    void closeButtonPressed() override;

private:
    WindowMemory m_memory;
    ManagedScreen m_screen;
    WindowForm m_form;
    MainView m_view;
};

} // namespace desktop
