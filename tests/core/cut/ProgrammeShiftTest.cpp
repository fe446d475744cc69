// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/cut/ProgrammeShift.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <optional>
#include <vector>

namespace cadrel::core {
namespace {

using Shift = std::optional<double>;

TEST(ProgrammeShift, NothingIsShiftedWhereThereIsNoStretch)
{
    ProgrammeShift shift;
    EXPECT_EQ(shift.at(10.0), Shift());

    shift.add(10.0, 20.0, -90.0);

    EXPECT_EQ(shift.at(9.999), Shift());
    EXPECT_EQ(shift.at(10.0), Shift(-90.0));
    EXPECT_EQ(shift.at(19.999), Shift(-90.0));
    EXPECT_EQ(shift.at(20.0), Shift());
}

TEST(ProgrammeShift, TheStretchThatWasAddedLastCounts)
{
    ProgrammeShift shift;
    shift.add(10.0, 30.0, 1.0);
    shift.add(15.0, 20.0, 2.0);

    EXPECT_EQ(shift.at(14.0), Shift(1.0));
    EXPECT_EQ(shift.at(15.0), Shift(2.0));
    EXPECT_EQ(shift.at(20.0), Shift(1.0));

    shift.add(5.0, 30.0, 3.0);
    for (const double time : {5.0, 14.0, 17.0, 29.0})
        EXPECT_EQ(shift.at(time), Shift(3.0));
}

TEST(ProgrammeShift, AnEmptyOrReversedStretchAddsNothing)
{
    ProgrammeShift shift;
    shift.add(10.0, 10.0, 1.0);
    shift.add(10.0, 9.0, 1.0);

    EXPECT_EQ(shift.at(10.0), Shift());
    EXPECT_EQ(shift.at(9.5), Shift());
}

RC_GTEST_PROP(ProgrammeShift, IsThatOfTheLastStretchAroundATime, ())
{
    struct Stretch {
        double start;
        double end;
        double shift;
    };
    ProgrammeShift shift;
    std::vector<Stretch> all;
    for (int count = *rc::gen::inRange(0, 12); count > 0; --count) {
        const double start = *rc::gen::inRange(0, 20);
        const double end = start + *rc::gen::inRange(0, 10);
        const double by = *rc::gen::inRange(1, 9);
        shift.add(start, end, by);
        all.push_back({start, end, by});
    }

    for (double time = 0.0; time < 30.0; time += 0.5) {
        Shift expected;
        for (const Stretch& stretch : all) {
            if (stretch.start <= time && time < stretch.end)
                expected = stretch.shift;
        }
        RC_ASSERT(shift.at(time) == expected);
    }
}

} // namespace
} // namespace cadrel::core
