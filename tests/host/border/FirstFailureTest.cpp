// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/border/FirstFailure.h"

#include "tests/support/ThrownResult.h"

#include <gtest/gtest.h>

#include <stdexcept>

namespace cadrel::host::tests {

using cadrel::tests::thrownBy;
using util::Result;

TEST(FirstFailure, IsRaisedBehindAllSteps)
{
    FirstFailure failure;
    int steps = 0;

    failure.ofStep([&] { ++steps; });
    failure.ofStep([&] {
        ++steps;
        throw Result::HostCallFailed;
    });
    failure.ofStep([&] {
        ++steps;
        throw Result::NoTracks;
    });
    failure.ofStep([&] { ++steps; });

    EXPECT_EQ(steps, 4);
    EXPECT_EQ(thrownBy([&] { failure.raise(); }), Result::HostCallFailed);
}

TEST(FirstFailure, IsNoneWhenAllWentWell)
{
    FirstFailure failure;

    failure.ofStep([] {});

    EXPECT_NO_THROW(failure.raise());
}

TEST(FirstFailure, IsNotAvailableForWhateverElseIsThrown)
{
    FirstFailure failure;

    failure.ofStep([] { throw std::runtime_error("unforeseen"); });

    EXPECT_EQ(thrownBy([&] { failure.raise(); }), Result::NotAvailable);
}

TEST(RequireSuccess, ThrowsEveryOtherResult)
{
    EXPECT_NO_THROW(requireSuccess(Result::Ok));
    EXPECT_EQ(thrownBy([] { requireSuccess(Result::Refused); }), Result::Refused);
    EXPECT_EQ(thrownBy([] { requireSuccess(Result::Cancelled); }), Result::Cancelled);
}

} // namespace cadrel::host::tests
