// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/boxes/Box.h"

#include <cstddef>
#include <memory>
#include <vector>

namespace desktop {

/// A message with up to a few buttons. Escape uses the last one. The text can be marked and copied.
class AlertBox : public Box {
public:
    /// Return uses the button of the index `byReturn`, which has the focus at first.
    AlertBox(const juce::String& title, const juce::String& message, const juce::StringArray& buttons,
             std::size_t byReturn);

    /// The index of the button that was used.
    std::size_t answer() const { return m_answer; }

private:
    void confirm() override { use(m_byReturn); }
    void cancel() override { use(m_buttons.size() - 1); }
    juce::Component* firstFocus() override { return m_buttons[m_byReturn].get(); }
    void layOut() override;
    void use(std::size_t button);

    juce::TextEditor m_message;
    std::vector<std::unique_ptr<juce::TextButton>> m_buttons;
    std::size_t m_byReturn;
    std::size_t m_answer = 0;
};

} // namespace desktop
