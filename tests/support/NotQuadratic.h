// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <gtest/gtest.h>

#include <algorithm>

namespace cadrel::tests {

/// Expects that four times as much takes less than eight times as long, in one of three tries: what else runs on the machine
/// makes a try slower, but what is quadratic takes sixteen times as long in each. `secondsFor` does so much and gives its
/// seconds.
template <class SecondsFor>
void expectNotQuadratic(int amount, const SecondsFor& secondsFor)
{
    secondsFor(amount / 4); // so that the memory is there

    double growth = 0;
    for (int tries = 0; tries < 3; ++tries) {
        const double few = std::max(secondsFor(amount), secondsFor(amount));
        const double many = std::min(secondsFor(4 * amount), secondsFor(4 * amount));
        growth = many / few;
        if (growth < 8.0)
            return;
    }
    ADD_FAILURE() << "Four times as much takes " << growth << " times as long.";
}

} // namespace cadrel::tests
