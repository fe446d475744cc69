// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/border/HostFailure.h"

#include <utility>

namespace cadrel::host {

/// For steps that are all carried out, whatever becomes of those before them: keeps what the first that failed has thrown.
///
///     FirstFailure failure;
///     failure.ofStep([&] { project.setTracksLocked(false); });
///     failure.ofStep([&] { project.extendProjectEnd(active); });
///     failure.raise();
class FirstFailure {
public:
    template <class Step>
    void ofStep(Step&& step)
    {
        const util::Result::Type result = resultOf(std::forward<Step>(step));
        if (m_result == util::Result::Ok)
            m_result = result;
    }
    /// Throws it; does nothing when all went well.
    void raise() const { requireSuccess(m_result); }

private:
    util::Result::Type m_result = util::Result::Ok;
};

} // namespace cadrel::host
