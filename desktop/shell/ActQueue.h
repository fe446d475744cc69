// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <functional>
#include <string>
#include <vector>

namespace desktop {

/// What the user has asked for, to be done as soon as there is time. What fails is told, and ends nothing else.
class ActQueue {
public:
    using Act = std::function<void()>;

    void add(Act act) { m_acts.push_back(std::move(act)); }
    /// Does all that is there. What comes meanwhile waits for the next call. `tell` gets a sentence for whatever an act has
    /// thrown.
    void run(const std::function<void(const std::string&)>& tell);

private:
    std::vector<Act> m_acts;
};

} // namespace desktop
