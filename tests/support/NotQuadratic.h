// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <gtest/gtest.h>

#include <algorithm>

namespace cadrel::tests {

/// Expects that four times as much takes less than eight times as long. `secondsFor` does so much and gives its seconds.
template <class SecondsFor>
void expectNotQuadratic(int amount, const SecondsFor& secondsFor)
{
    secondsFor(amount / 4); // so that the memory is there

    const double few = std::max(secondsFor(amount), secondsFor(amount));
    const double many = std::min(secondsFor(4 * amount), secondsFor(4 * amount));

    EXPECT_LT(many, 8.0 * few);
}

} // namespace cadrel::tests
