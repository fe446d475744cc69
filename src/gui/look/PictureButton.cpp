// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/PictureButton.h"

#include "gui/guard/Guard.h"
#include "gui/look/ButtonTile.h"

namespace cadrel::gui {

void PictureButton::setTooltip(const juce::String& tooltip)
{
    Button::setTooltip(tooltip);
    if (getTitle().isEmpty())
        setTitle(tooltip);
}

void PictureButton::paintButton(juce::Graphics& graphics, bool, bool isDown)
{
    guardSystem([&] {
        m_picture.draw(graphics, getLocalBounds(), {isDown, isEnabled(), hasKeyboardFocus(false), isBeneath(*this)});
    });
}

} // namespace cadrel::gui
