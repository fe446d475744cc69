// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <functional>
#include <utility>
#include <vector>

namespace cadrel::host {

/// How to take back what has been registered and installed: the last first, at the latest when this goes.
class Teardown {
public:
    Teardown() = default;
    Teardown(Teardown&& other) noexcept : m_steps(std::exchange(other.m_steps, {})) {}
    Teardown& operator=(Teardown&&) = delete;
    ~Teardown() { run(); }

    /// The steps mustn't throw.
    void add(std::function<void()> step) { m_steps.push_back(std::move(step)); }
    void run()
    {
        while (!m_steps.empty()) {
            const std::function<void()> step = std::move(m_steps.back());
            m_steps.pop_back();
            step();
        }
    }

private:
    std::vector<std::function<void()>> m_steps;
};

} // namespace cadrel::host
