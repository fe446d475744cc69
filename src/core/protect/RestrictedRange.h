// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/settings/Settings.h"
#include "core/time/SecondsRange.h"

namespace cadrel::core {

/// While it lives, a run may change what lies between the bounds alone. Afterwards the settings are as they were.
class RestrictedRange {
public:
    /// In seconds of the project's clock. The settings outlive this.
    RestrictedRange(Settings& settings, const SecondsRange& bounds)
        : m_settings(settings), m_wasRestricted(settings.restrictRange()), m_former{settings.preserveMaterialBefore(),
                                                                                    settings.preserveMaterialAfter()}
    {
        set(true, bounds);
    }
    RestrictedRange(const RestrictedRange&) = delete;
    RestrictedRange& operator=(const RestrictedRange&) = delete;
    ~RestrictedRange() { set(m_wasRestricted, m_former); }

private:
    void set(bool isRestricted, const SecondsRange& range)
    {
        m_settings.set(&Settings::restrictRange, isRestricted);
        m_settings.set(&Settings::preserveMaterialBefore, range.start);
        m_settings.set(&Settings::preserveMaterialAfter, range.end);
    }

    Settings& m_settings;
    bool m_wasRestricted;
    SecondsRange m_former;
};

} // namespace cadrel::core
