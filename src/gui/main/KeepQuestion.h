// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"

#include <string>

namespace cadrel::core {
class ProtectedRun;
} // namespace cadrel::core

namespace cadrel::gui {

/// What the user is asked before a run that would take away sound that the change EDL doesn't carry, in his language.
class KeepQuestion {
public:
    /// The run is borrowed.
    KeepQuestion(const core::ProtectedRun& run, const core::Framerate& framerate) : m_run(run), m_framerate(framerate)
    {
    }

    /// Whether there is anything to ask about.
    bool isNeeded() const;
    /// Whether it can be kept at all.
    bool canKeep() const;
    /// How much there is, what becomes of it, and what keeps it from being kept.
    std::wstring text() const;

private:
    std::wstring doubts() const;
    std::wstring changeOfList() const;

    const core::ProtectedRun& m_run;
    core::Framerate m_framerate;
};

} // namespace cadrel::gui
