// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/main/MainLayout.h"
#include "tests/support/x11/XWindows.h"

namespace cadrel::tests {

/// The two stills of Cadrel's window as the screen shows them, of videos whose frames have their number in bars.
class MainStills {
public:
    /// The window has its upper left corner at a pixel of the screen.
    MainStills(const XWindows& windows, const gui::MainLayout& layout, int left, int top)
        : m_windows(windows), m_layout(layout), m_left(left), m_top(top)
    {
    }

    /// The number in the bars; -1 when there are none.
    int oldNumber() const { return numberIn(area(false)); }
    int newNumber() const { return numberIn(area(true)); }

private:
    gui::MainLayout::Box area(bool isNew) const;
    int numberIn(const gui::MainLayout::Box& area) const;

    const XWindows& m_windows;
    gui::MainLayout m_layout;
    int m_left;
    int m_top;
};

} // namespace cadrel::tests
