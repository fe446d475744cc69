// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"
#include "core/time/FramerateProvider.h"
#include "core/time/Timecode.h"

namespace cadrel::host {

/// While it lives, timecodes have the rate of a project. Afterwards they have the earlier rate again, unless another project
/// has been activated, or this one, or the one before has been closed.
class FramerateScope final : private core::FramerateProvider {
public:
    explicit FramerateScope(const core::FramerateProvider& provider)
        : m_provider(provider), m_former(core::Timecode::framerateProvider())
    {
        core::Timecode::setFramerateProvider(this);
    }
    FramerateScope(const FramerateScope&) = delete;
    FramerateScope& operator=(const FramerateScope&) = delete;
    ~FramerateScope()
    {
        if (core::Timecode::framerateProvider() == this)
            core::Timecode::setFramerateProvider(m_former);
    }

private:
    core::Framerate getFramerate() const override { return m_provider.getFramerate(); }

    const core::FramerateProvider& m_provider;
    const core::FramerateProvider* m_former;
};

} // namespace cadrel::host
