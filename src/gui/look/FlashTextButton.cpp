// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/FlashTextButton.h"

#include "gui/guard/Guard.h"
#include "gui/look/ButtonTile.h"

namespace cadrel::gui {

void FlashTextButton::buttonStateChanged()
{
    guardSystem([&] {
        if (getToggleState() && !isTimerRunning())
            startFlashing();
        else if (!getToggleState() && isTimerRunning())
            stopFlashing();
    });
}

void FlashTextButton::timerCallback()
{
    guardSystem([&] {
        setColour(buttonOnColourId, findColour(buttonOnColourId) == m_steady ? m_dimmed : m_steady);
        repaint();
    });
}

void FlashTextButton::startFlashing()
{
    m_steady = findColour(buttonOnColourId);
    m_dimmed = m_steady.darker(Darkening);
    startTimer(Phase);
}

void FlashTextButton::stopFlashing()
{
    stopTimer();
    setColour(buttonOnColourId, m_steady);
    repaint();
}

} // namespace cadrel::gui
