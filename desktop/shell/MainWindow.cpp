// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/MainWindow.h"

#include "gui/look/Text.h"

#include <algorithm>

namespace desktop {

namespace {

constexpr int WantedWidth = 1560;
constexpr int WantedHeight = 1140;
constexpr int LeastWidth = 800;
constexpr int LeastHeight = 560;

} // namespace

MainWindow::MainWindow()
    : DocumentWindow("Cadrel", cadrel::gui::toColour(cadrel::gui::Palette::panel), allButtons, false)
{
    // Or it would take the keyboard from what is in it when the X server says that the window has it.
    setWantsKeyboardFocus(false);
    setUsingNativeTitleBar(true);
    setContentNonOwned(&m_view, false);
    setResizable(true, false);
    setResizeLimits(LeastWidth, LeastHeight, 1 << 15, 1 << 15);
    juce::Rectangle<int> screen(0, 0, WantedWidth, WantedHeight);
    if (const auto* const display = juce::Desktop::getInstance().getDisplays().getPrimaryDisplay())
        screen = display->userArea;
    setBounds(screen.withSizeKeepingCentre(std::min(screen.getWidth(), WantedWidth),
                                           std::min(screen.getHeight(), WantedHeight)));
    addToDesktop();
    m_view.listenToKeysOf(*this);
    setVisible(true);
}

MainWindow::~MainWindow()
{
    m_view.stopListeningTo(*this);
}

void MainWindow::closeButtonPressed()
{
    if (onClose)
        onClose();
}

} // namespace desktop
