// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/look/ButtonPicture.h"

#include <juce_gui_basics/juce_gui_basics.h>

namespace cadrel::gui {

/// A button that shows a picture. Screen readers read its title. Its first tooltip is also its title, unless it has one then.
class PictureButton : public juce::Button {
public:
    PictureButton(const juce::String& name, ButtonPicture::Symbol symbol) : Button(name), m_picture(symbol) {}

    void setTooltip(const juce::String& tooltip) override;
    void paintButton(juce::Graphics& graphics, bool isHighlighted, bool isDown) override;

private:
    ButtonPicture m_picture;
};

} // namespace cadrel::gui
