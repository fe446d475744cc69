// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/FramerateProvider.h"
#include "core/time/Timecode.h"

namespace cadrel::host {

/// While it lives, timecodes have the rate of a project. Afterwards they have the earlier rate again.
class FramerateScope {
public:
    explicit FramerateScope(const core::FramerateProvider& provider) : m_former(core::Timecode::framerateProvider())
    {
        core::Timecode::setFramerateProvider(&provider);
    }
    FramerateScope(const FramerateScope&) = delete;
    FramerateScope& operator=(const FramerateScope&) = delete;
    ~FramerateScope() { core::Timecode::setFramerateProvider(m_former); }

private:
    const core::FramerateProvider* m_former;
};

} // namespace cadrel::host
