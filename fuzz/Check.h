// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdio>
#include <cstdlib>

namespace cadrel::fuzz {

/// Ends the fuzzer, which then keeps its input, unless what the law says holds.
inline void check(bool holds, const char* law)
{
    if (holds)
        return;
    std::fprintf(stderr, "Broken: %s\n", law);
    std::abort();
}

} // namespace cadrel::fuzz
