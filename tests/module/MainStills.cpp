// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/module/MainStills.h"

#include "examples/burnin/BurntInFrame.h"

#include <algorithm>

namespace cadrel::tests {

using examples::BurntInFrame;
using gui::MainLayout;

MainLayout::Box MainStills::area(bool isNew) const
{
    const MainLayout::Box video = m_layout.video();
    const int half = (video.height - 155) / 2;
    return {video.x + 8, video.y + (isNew ? half + 135 : 95), video.width - 16, half - 20};
}

/// A still stands in the middle of its area and keeps its shape.
int MainStills::numberIn(const MainLayout::Box& area) const
{
    constexpr int Dark = 0x40;
    constexpr int Bright = 0xc0;
    const double scale = std::min(area.width / 320.0, area.height / 180.0);
    const double left = area.x + area.width / 2.0 - 160.0 * scale;
    const double top = area.y + area.height / 2.0 - 90.0 * scale;
    const double y = top + 180.0 * scale * (1.0 + BurntInFrame::BarsTop) / 2.0;
    int number = 0;
    for (int bar = 0; bar < BurntInFrame::Bars; ++bar) {
        const double x = left + 320.0 * scale * (bar + 0.5) / BurntInFrame::Bars;
        const unsigned long colour = m_windows.colourAt(m_left + static_cast<int>(x), m_top + static_cast<int>(y));
        const auto green = static_cast<int>(colour >> 8 & 0xff);
        if (green > Dark && green < Bright)
            return -1;
        number = 2 * number + (green >= Bright ? 1 : 0);
    }
    return number;
}

} // namespace cadrel::tests
