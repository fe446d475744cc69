// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/ActQueue.h"

#include "util/Result.h"

#include <exception>
#include <new>
#include <utility>

namespace desktop {

namespace {

/// Empty where nothing was thrown.
std::string faultOf(const ActQueue::Act& act)
try {
    act();
    return {};
} catch (const std::bad_alloc&) {
    return "There isn't enough memory for that.";
} catch (const std::exception& error) {
    return std::string("That has failed: ") + error.what();
} catch (cadrel::util::Result::Type failure) {
    return "That has failed: failure " + std::to_string(failure);
} catch (...) {
    return "That has failed, and nothing tells why.";
}

} // namespace

void ActQueue::run(const std::function<void(const std::string&)>& tell)
{
    for (const Act& act : std::exchange(m_acts, {})) {
        const std::string fault = faultOf(act);
        if (!fault.empty())
            tell(fault);
    }
}

} // namespace desktop
