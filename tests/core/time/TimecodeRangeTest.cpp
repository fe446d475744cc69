// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/time/TimecodeRange.h"

#include "tests/support/ThrownResult.h"

#include <gtest/gtest.h>

namespace cadrel::tests {
namespace {

using core::Timecode;
using core::TimecodeRange;
using util::Result;

TimecodeRange rangeOf(const char* start, const char* end)
{
    return {Timecode(start), Timecode(end)};
}

TEST(TimecodeRange, KeepsItsEnds)
{
    const TimecodeRange range = rangeOf("00:00:01:00", "00:00:02:00");

    EXPECT_EQ(range.start.toString(), "00:00:01:00");
    EXPECT_EQ(range.end.toString(), "00:00:02:00");
}

TEST(TimecodeRange, MayBeEmptyButNotReversed)
{
    EXPECT_EQ(thrownBy([] { rangeOf("00:00:01:00", "00:00:01:00"); }), Result::Ok);
    EXPECT_EQ(thrownBy([] { rangeOf("00:00:01:00", "00:00:00:24"); }), Result::InvalidArgument);
}

TEST(TimecodeRange, NeedsNoFrameRate)
{
    EXPECT_EQ(thrownBy([] { rangeOf("00:00:00:98", "99:99:99:99"); }), Result::Ok);
}

TEST(TimecodeRange, AUnionHasTheSmallerStartAndTheGreaterEnd)
{
    const TimecodeRange early = rangeOf("00:00:01:00", "00:00:02:00");
    const TimecodeRange late = rangeOf("00:00:05:00", "00:00:06:00");
    const TimecodeRange around = rangeOf("00:00:00:00", "00:00:09:00");
    struct Case {
        TimecodeRange a;
        TimecodeRange b;
        const char* start;
        const char* end;
    };
    const Case cases[] = {
        {early, late, "00:00:01:00", "00:00:06:00"},   {late, early, "00:00:01:00", "00:00:06:00"},
        {early, around, "00:00:00:00", "00:00:09:00"}, {around, late, "00:00:00:00", "00:00:09:00"},
        {late, late, "00:00:05:00", "00:00:06:00"},
    };
    for (const Case& c : cases) {
        const TimecodeRange both = TimecodeRange::unite(c.a, c.b);
        EXPECT_EQ(both.start.toString(), c.start);
        EXPECT_EQ(both.end.toString(), c.end);
    }
}

} // namespace
} // namespace cadrel::tests
