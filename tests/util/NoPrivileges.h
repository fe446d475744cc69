#pragma once

#include <gtest/gtest.h>

#include <sys/types.h>
#include <unistd.h>

namespace cadrel::tests {

/// While it lives, the process has no more rights than a user who owns none of its files.
class NoPrivileges {
public:
    NoPrivileges() : former_(geteuid())
    {
        constexpr uid_t Nobody = 65534;
        if (former_ == 0) {
            EXPECT_EQ(seteuid(Nobody), 0);
        }
    }
    NoPrivileges(const NoPrivileges&) = delete;
    NoPrivileges& operator=(const NoPrivileges&) = delete;
    ~NoPrivileges() { EXPECT_EQ(seteuid(former_), 0); }

private:
    uid_t former_;
};

} // namespace cadrel::tests
