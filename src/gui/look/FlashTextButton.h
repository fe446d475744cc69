// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

namespace cadrel::gui {

/// A text button that flashes while it is on: its on-colour alternates with the same darkened. Off, it has the on-colour
/// that it had before.
class FlashTextButton : public juce::TextButton, public juce::Timer {
public:
    using TextButton::TextButton;
    ~FlashTextButton() override { stopTimer(); }

    /// How long each phase lasts, in milliseconds.
    static constexpr int Phase = 800;

    void buttonStateChanged() override;
    void timerCallback() override;

private:
    void startFlashing();
    void stopFlashing();

    juce::Colour m_steady;
    juce::Colour m_dimmed;
};

} // namespace cadrel::gui
