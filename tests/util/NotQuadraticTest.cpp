// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/NotQuadratic.h"

#include <gtest/gtest-spi.h>
#include <gtest/gtest.h>

#include <functional>

namespace cadrel::tests {
namespace {

constexpr int Few = 100;
constexpr int Many = 4 * Few;

using Growth = std::function<double(double)>;
/// How many times as long the machine takes for a run, which is counted from 0 for each amount.
using Business = std::function<double(int amount, int run)>;

/// Calls the check with work that takes so long on a machine that is so busy.
void check(const Growth& growth, const Business& business)
{
    int fewRuns = 0;
    int manyRuns = 0;
    expectNotQuadratic(Few, [&](int amount) {
        const int run = amount == Few ? fewRuns++ : amount == Many ? manyRuns++ : 0;
        return growth(amount) * business(amount, run);
    });
}

double linear(double amount)
{
    return amount;
}

double quadratic(double amount)
{
    return amount * amount;
}

double quiet(int, int)
{
    return 1.0;
}

} // namespace

TEST(NotQuadratic, PassesWhatGrowsWithTheAmount)
{
    check(linear, quiet);
    check([](double amount) { return 1000.0 + amount; }, quiet);
    check([](double amount) { return amount * (1.0 + amount / (Many * 1.1)); }, quiet);
}

TEST(NotQuadratic, FailsWhatGrowsEightTimes)
{
    EXPECT_NONFATAL_FAILURE(check([](double amount) { return amount == Many ? 8.0 : 1.0; }, quiet), "takes 8 times");
    check([](double amount) { return amount == Many ? 7.99 : 1.0; }, quiet);
}

TEST(NotQuadratic, FailsWhatIsQuadratic)
{
    EXPECT_NONFATAL_FAILURE(check(quadratic, quiet), "takes 16 times");
}

TEST(NotQuadratic, PassesWhatIsLinearAlsoWhereTheMachineIsMostlyBusy)
{
    for (const int quietRun : {0, 1, 3, 5}) {
        SCOPED_TRACE(quietRun);
        check(linear, [=](int amount, int run) { return amount == Many && run != quietRun ? 9.0 : 1.0; });
    }
}

TEST(NotQuadratic, FailsWhatIsQuadraticWheneverTheFewHaveOneQuietRunBesideTheFirstTwoMany)
{
    for (const int quietRun : {0, 1, 2}) {
        SCOPED_TRACE(quietRun);
        EXPECT_NONFATAL_FAILURE(
            check(quadratic, [=](int amount, int run) { return amount == Few && run != quietRun ? 9.0 : 1.0; }),
            "takes 16 times");
    }
}

} // namespace cadrel::tests
