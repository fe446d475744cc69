// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/MainWindow.h"

#include "gui/look/Text.h"

#include <utility>

namespace desktop {

namespace {

/// In JUCE's pixels. A window manager tells the area of all screens together.
juce::Rectangle<int> usableArea(const ManagedScreen& screen)
{
    juce::Rectangle<int> usable(0, 0, WindowForm().width, WindowForm().height);
    if (const auto* const display = juce::Desktop::getInstance().getDisplays().getPrimaryDisplay())
        usable = display->userArea;
    const double scale = juce::Desktop::getInstance().getGlobalScaleFactor();
    if (const auto area = screen.workArea()) {
        const auto work = (juce::Rectangle<int>(area->x, area->y, area->width, area->height).toDouble() / scale)
                              .getSmallestIntegerContainer();
        if (usable.intersects(work))
            usable = usable.getIntersection(work);
    }
    return usable;
}

} // namespace

MainWindow::MainWindow(WindowMemory memory)
    : DocumentWindow("Cadrel", cadrel::gui::toColour(cadrel::gui::Palette::panel), allButtons, false),
      m_memory(std::move(memory))
{
    // Or it would take the keyboard from what is in it when the X server says that the window has it.
    setWantsKeyboardFocus(false);
    setUsingNativeTitleBar(true);
    setContentNonOwned(&m_view, false);
    setResizable(true, false);
    setResizeLimits(WindowForm::LeastWidth, WindowForm::LeastHeight, WindowForm::Largest, WindowForm::Largest);
    const juce::Rectangle<int> usable = usableArea(m_screen);
    m_form = startForm(m_memory.read(), {usable.getWidth(), usable.getHeight(), m_screen.hasManager()});
    m_view.setTracksHeight(m_form.tracksHeight);
    setBounds(usable.withSizeKeepingCentre(m_form.width, m_form.height));
    addToDesktop();
    if (m_form.isMaximised)
        m_screen.startMaximised(windowOf(getPeer()));
    m_view.listenToKeysOf(*this);
    setVisible(true);
}

MainWindow::~MainWindow()
{
    m_view.stopListeningTo(*this);
}

void MainWindow::keepForm()
{
    const juce::ComponentPeer* const peer = getPeer();
    if (!peer || peer->isMinimised())
        return;
    const ManagedScreen::Extent extent = m_screen.extentOf(windowOf(peer));
    m_form.isMaximised = extent == ManagedScreen::Extent::Maximised;
    if (extent == ManagedScreen::Extent::Own) {
        m_form.width = getWidth();
        m_form.height = getHeight();
    }
    m_form.tracksHeight = m_view.tracksHeight();
    m_memory.keep(m_form);
}

void MainWindow::closeButtonPressed()
{
    if (onClose)
        onClose();
}

} // namespace desktop
