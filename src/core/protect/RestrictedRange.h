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
        set(m_settings, true, bounds);
    }
    RestrictedRange(const RestrictedRange&) = delete;
    RestrictedRange& operator=(const RestrictedRange&) = delete;
    ~RestrictedRange() { set(m_settings, m_wasRestricted, m_former); }

    bool isOf(const Settings& settings) const { return &settings == &m_settings; }
    /// A copy of the settings as they will be afterwards.
    Settings released() const
    {
        Settings settings = m_settings;
        set(settings, m_wasRestricted, m_former);
        return settings;
    }

private:
    static void set(Settings& settings, bool isRestricted, const SecondsRange& range)
    {
        settings.set(&Settings::restrictRange, isRestricted);
        settings.set(&Settings::preserveMaterialBefore, range.start);
        settings.set(&Settings::preserveMaterialAfter, range.end);
    }

    Settings& m_settings;
    bool m_wasRestricted;
    SecondsRange m_former;
};

} // namespace cadrel::core
