// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/Result.h"

#include "tests/support/ThrownResult.h"

#include <gtest/gtest.h>

#include <type_traits>

using cadrel::tests::thrownBy;
using cadrel::util::Result;

// The numbers are stored, shown and handed to the host; they never move.
TEST(Result, HasTheFixedNumbers)
{
    EXPECT_EQ(Result::Ok, 0);
    EXPECT_EQ(Result::Refused, 1);
    EXPECT_EQ(Result::NotSupported, 2);
    EXPECT_EQ(Result::Cancelled, 3);
    EXPECT_EQ(Result::HostObjectMissing, 4);
    EXPECT_EQ(Result::HostCallFailed, 5);
    EXPECT_EQ(Result::NoProject, 6);
    EXPECT_EQ(Result::NoTracks, 7);
    EXPECT_EQ(Result::NoTracksSelected, 8);
    EXPECT_EQ(Result::ChangeEdlEmpty, 10);
    EXPECT_EQ(Result::FileAccessFailed, 11);
    EXPECT_EQ(Result::ChecksumMismatch, 12);
    EXPECT_EQ(Result::CorruptData, 13);
    EXPECT_EQ(Result::EndOfData, 14);
    EXPECT_EQ(Result::UnknownVersion, 15);
    EXPECT_EQ(Result::NewerVersion, 16);
    EXPECT_EQ(Result::InvalidArgument, 17);
    EXPECT_EQ(Result::NotAvailable, 18);
    EXPECT_EQ(Result::OutOfRange, 19);
    EXPECT_EQ(Result::FrameOutOfRate, 20);
    EXPECT_EQ(Result::PositionOccupied, 21);
}

TEST(Result, HoldsThirtyTwoBits)
{
    EXPECT_EQ(sizeof(Result::Type), 4U);
    EXPECT_TRUE(std::is_signed_v<std::underlying_type_t<Result::Type>>);
}

TEST(Result, IsThrownByValue)
{
    EXPECT_EQ(thrownBy([] { throw Result::PositionOccupied; }), Result::PositionOccupied);
}
