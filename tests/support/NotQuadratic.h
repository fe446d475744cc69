// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <limits>

namespace cadrel::tests {

/// Expects that four times as much takes less than eight times as long; what is quadratic takes sixteen times as long.
/// `secondsFor` does so much and gives its seconds.
///
/// What else runs on the machine only makes it slower, so that of each amount the best time counts. The few are done before,
/// between and after the many: a machine that is busy for a while doesn't let them look slow beside fast many.
template <class SecondsFor>
void expectNotQuadratic(int amount, const SecondsFor& secondsFor)
{
    secondsFor(amount / 4); // so that the memory is there

    double few = secondsFor(amount);
    double many = std::numeric_limits<double>::max();
    for (int runs = 0; runs < 6; ++runs) {
        many = std::min<double>(many, secondsFor(4 * amount));
        few = std::min<double>(few, secondsFor(amount));
        // Two of the many at least, with three of the few around them.
        if (runs > 0 && many < 8.0 * few)
            return;
    }
    ADD_FAILURE() << "Four times as much takes " << many / few << " times as long.";
}

} // namespace cadrel::tests
