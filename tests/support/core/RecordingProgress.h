// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/ProgressHandlerBase.h"

#include <cstddef>
#include <cstdint>
#include <limits>
#include <numeric>
#include <string>
#include <vector>

namespace cadrel::tests {

/// Remembers all that it is told and asked, in order, and plays a user who cancels once `tick` was called so many
/// times.
class RecordingProgress : public core::ProgressHandlerBase {
public:
    static constexpr std::size_t Never = std::numeric_limits<std::size_t>::max();

    explicit RecordingProgress(std::size_t ticksUntilCancel = Never) : m_ticksUntilCancel(ticksUntilCancel) {}

    void start(const std::wstring& title, std::uint64_t steps, bool canCancel) override
    {
        calls.push_back(L"start " + title + L" " + std::to_wstring(steps) + (canCancel ? L" can cancel" : L""));
    }
    void finish() override { calls.emplace_back(L"finish"); }
    void setPosition(std::uint64_t value) override { calls.push_back(L"position " + std::to_wstring(value)); }
    void tick(std::uint64_t steps) override
    {
        ticks.push_back(steps);
        calls.push_back(L"tick " + std::to_wstring(steps));
    }
    bool isCancelled() override
    {
        calls.emplace_back(L"cancelled?");
        return ticks.size() >= m_ticksUntilCancel;
    }
    void setText(const std::wstring& text) override
    {
        texts.push_back(text);
        calls.push_back(L"text " + text);
    }
    void beginStage(std::uint64_t steps) override { calls.push_back(L"stage " + std::to_wstring(steps)); }

    /// The sum of all steps reported.
    std::uint64_t steps() const { return std::accumulate(ticks.begin(), ticks.end(), std::uint64_t{0}); }

    std::vector<std::uint64_t> ticks; ///< the steps of each tick
    std::vector<std::wstring> texts;  ///< of setText
    std::vector<std::wstring> calls;  ///< every call, such as L"tick 1", L"cancelled?", L"text Overlap Markers"

private:
    std::size_t m_ticksUntilCancel;
};

} // namespace cadrel::tests
