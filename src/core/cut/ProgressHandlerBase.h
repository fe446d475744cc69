// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <string>

namespace cadrel::core {

/// Shows the user how far a run has come, and says whether the user has cancelled it.
class ProgressHandlerBase {
public:
    virtual ~ProgressHandlerBase() = default;

    virtual void start(const std::wstring& title, std::uint64_t steps, bool canCancel) = 0;
    virtual void finish() = 0;
    virtual void setPosition(std::uint64_t value) = 0;
    /// Moves on by so many steps.
    virtual void tick(std::uint64_t steps) = 0;
    virtual bool isCancelled() = 0;
    virtual void setText(const std::wstring& text) = 0;
    /// Announces a further stage of so many steps.
    virtual void beginStage(std::uint64_t steps) = 0;
};

} // namespace cadrel::core
