// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/shell/MainView.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <functional>

namespace desktop {

/// The window of the program on the screen.
class MainWindow : public juce::DocumentWindow {
public:
    MainWindow();
    ~MainWindow() override;

    MainView& view() { return m_view; }
    /// The user wants to close the program.
    std::function<void()> onClose;

    void closeButtonPressed() override;

private:
    MainView m_view;
};

} // namespace desktop
