// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <gtest/gtest.h>

#include <sys/types.h>
#include <unistd.h>

namespace cadrel::tests {

/// While it lives, the process has no more rights than a user who owns none of its files.
class NoPrivileges {
public:
    NoPrivileges() : m_former(geteuid())
    {
        constexpr uid_t Nobody = 65534;
        if (m_former == 0) {
            EXPECT_EQ(seteuid(Nobody), 0);
        }
    }
    NoPrivileges(const NoPrivileges&) = delete;
    NoPrivileges& operator=(const NoPrivileges&) = delete;
    ~NoPrivileges() { EXPECT_EQ(seteuid(m_former), 0); }

private:
    uid_t m_former;
};

} // namespace cadrel::tests
