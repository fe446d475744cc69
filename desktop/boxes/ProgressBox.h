// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/boxes/Box.h"
#include "standin/services/UserBoxes.h"

namespace desktop {

/// The progress of an operation. Cancel and Escape ask it to stop, which takes until it asks for that.
class ProgressBox : public Box {
public:
    explicit ProgressBox(const standin::UserBoxes::Progress& progress);

    void update(const standin::UserBoxes::Progress& progress);
    bool isCancelled() const { return m_isCancelled; }

    void paint(juce::Graphics& graphics) override;

private:
    void confirm() override {}
    void cancel() override;
    juce::Component* firstFocus() override { return m_cancel.isVisible() ? &m_cancel : nullptr; }
    void layOut() override;

    standin::UserBoxes::Progress m_progress;
    double m_part = 0.0;
    juce::ProgressBar m_bar;
    juce::TextButton m_cancel{"Cancel"};
    bool m_isCancelled = false;
};

} // namespace desktop
