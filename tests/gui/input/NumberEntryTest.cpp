// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/input/NumberEntry.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cmath>
#include <limits>

using cadrel::gui::NumberEntry;

namespace {

NumberEntry fromTenToTwenty()
{
    NumberEntry entry;
    entry.setRange(10.0, 20.0, 3.0);
    return entry;
}

} // namespace

TEST(NumberEntry, KeepsANumberWithinItsBounds)
{
    NumberEntry entry = fromTenToTwenty();

    entry.set(9.0);
    EXPECT_EQ(entry.value(), 10.0);
    entry.set(10.0);
    EXPECT_EQ(entry.value(), 10.0);
    entry.set(20.0);
    EXPECT_EQ(entry.value(), 20.0);
    entry.set(21.0);
    EXPECT_EQ(entry.value(), 20.0);
}

TEST(NumberEntry, SetsTheValueAnewWithOtherBounds)
{
    NumberEntry entry;
    entry.set(50.0);

    entry.setRange(0.0, 25.0, 1.0);
    EXPECT_EQ(entry.value(), 25.0);
    entry.setRange(30.0, 60.0, 1.0);
    EXPECT_EQ(entry.value(), 30.0);
}

TEST(NumberEntry, TakesTheMinimumWhereItLiesAboveTheMaximum)
{
    NumberEntry entry;

    entry.setRange(9.0, 5.0, 1.0);
    EXPECT_EQ(entry.value(), 9.0);
    entry.set(7.0);
    EXPECT_EQ(entry.value(), 9.0);
}

TEST(NumberEntry, TakesTheMinimumForWhatIsNoNumber)
{
    NumberEntry entry = fromTenToTwenty();
    entry.set(15.0);

    entry.set(std::nan(""));

    EXPECT_EQ(entry.value(), 10.0);
}

TEST(NumberEntry, StepsWithinItsBounds)
{
    NumberEntry entry = fromTenToTwenty();
    entry.set(16.0);

    entry.stepUp();
    EXPECT_EQ(entry.value(), 19.0);
    entry.stepUp();
    EXPECT_EQ(entry.value(), 20.0);
    entry.stepDown();
    EXPECT_EQ(entry.value(), 17.0);
    for (int i = 0; i < 5; ++i)
        entry.stepDown();
    EXPECT_EQ(entry.value(), 10.0);
}

TEST(NumberEntry, ReadsWhatIsTyped)
{
    NumberEntry entry = fromTenToTwenty();

    entry.type("14");
    EXPECT_EQ(entry.value(), 14.0);
    entry.type("0013");
    EXPECT_EQ(entry.value(), 13.0);
    entry.type("99999999999999999999");
    EXPECT_EQ(entry.value(), 20.0);
}

TEST(NumberEntry, ReadsAnEmptyTextAsZeroWithinTheBounds)
{
    NumberEntry entry = fromTenToTwenty();
    entry.set(15.0);

    entry.type("");

    EXPECT_EQ(entry.value(), 10.0);
}

TEST(NumberEntry, ReadsATextThatIsNoNumberAsZero)
{
    NumberEntry entry;
    for (const char* const text : {"x", "1 x", " 1", "nan", "inf"}) {
        entry.set(15.0);
        entry.type(text);
        EXPECT_EQ(entry.value(), 0.0) << text;
    }
}

TEST(NumberEntry, ReadsMoreDigitsThanANumberHoldsAsTheMaximum)
{
    NumberEntry entry = fromTenToTwenty();

    entry.type(std::string(400, '9'));

    EXPECT_EQ(entry.value(), 20.0);
}

TEST(NumberEntry, ReadsWhatIsTooSmallForANumberAsZero)
{
    NumberEntry entry;
    entry.set(15.0);

    entry.type("0." + std::string(400, '0') + "1");

    EXPECT_EQ(entry.value(), 0.0);
}

TEST(NumberEntry, ReadsMoreDigitsThanANumberHoldsAsTheMinimumWhereItIsNegative)
{
    NumberEntry entry;
    entry.setRange(-5.0, 5.0, 1.0);

    entry.type('-' + std::string(400, '9'));

    EXPECT_EQ(entry.value(), -5.0);
}

TEST(NumberEntry, ShowsNoNegativeZero)
{
    NumberEntry entry;
    entry.setRange(-5.0, 5.0, 1.0);

    entry.type("-0");

    EXPECT_EQ(entry.number(), "0");
}

TEST(NumberEntry, ShowsTheNumberFollowedByItsSuffix)
{
    NumberEntry entry;
    entry.set(50.0);
    entry.setSuffix("%");

    EXPECT_EQ(entry.number(), "50");
    EXPECT_EQ(entry.numberWithSuffix(), "50%");
    entry.set(2.5);
    EXPECT_EQ(entry.numberWithSuffix(), "2.5%");
    entry.setRange(-5.0, 5.0, 1.0);
    entry.set(-3.0);
    EXPECT_EQ(entry.numberWithSuffix(), "-3%");
}

TEST(NumberEntry, ShowsTheLargestAndTheSmallestNumber)
{
    NumberEntry entry;
    const double largest = std::numeric_limits<double>::max();
    entry.setRange(-largest, largest, 1.0);

    entry.set(-largest);
    EXPECT_EQ(entry.number().size(), 310U);
    entry.set(std::numeric_limits<double>::denorm_min());
    EXPECT_FALSE(entry.number().empty());
}

TEST(NumberEntry, ShowsTheDecimalsOfItsSteps)
{
    NumberEntry entry;
    entry.setRange(-1.0, 1.0, 0.1);

    for (const char* const expected : {"0.1", "0.2", "0.3", "0.4", "0.5", "0.6", "0.7", "0.8", "0.9", "1", "1"}) {
        entry.stepUp();
        EXPECT_EQ(entry.number(), expected);
    }
    for (const char* const expected : {"0.9", "0.8", "0.7", "0.6", "0.5", "0.4", "0.3", "0.2", "0.1", "0", "-0.1"}) {
        entry.stepDown();
        EXPECT_EQ(entry.number(), expected);
    }
}

TEST(NumberEntry, StepsOnFromWhatWasTyped)
{
    NumberEntry entry;
    entry.setRange(0.0, 10.0, 0.1);
    entry.stepUp();

    entry.type("0.35");
    entry.stepUp();
    EXPECT_EQ(entry.number(), "0.45");
    entry.stepDown();
    entry.stepDown();
    EXPECT_EQ(entry.number(), "0.25");
}

TEST(NumberEntry, ReachesAWholeNumberInStepsOfAThird)
{
    NumberEntry entry;
    entry.setRange(0.0, 10.0, 1.0 / 3.0);

    entry.stepUp();
    EXPECT_EQ(entry.number(), "0.333333333333333");
    entry.stepUp();
    EXPECT_EQ(entry.number(), "0.666666666666667");
    entry.stepUp();
    EXPECT_EQ(entry.number(), "1");
}

TEST(NumberEntry, StepsByWhateverANumberHolds)
{
    NumberEntry entry;
    entry.setRange(0.0, std::numeric_limits<double>::max(), 1e-300);
    entry.stepUp();
    entry.stepUp();
    entry.stepUp();
    EXPECT_EQ(entry.value(), 3e-300);

    entry.setRange(0.0, std::numeric_limits<double>::max(), 1e300);
    entry.stepUp();
    EXPECT_EQ(entry.value(), 1e300);
    entry.setRange(0.0, std::numeric_limits<double>::max(), std::numeric_limits<double>::max());
    entry.stepUp();
    EXPECT_EQ(entry.value(), std::numeric_limits<double>::max());

    entry.setRange(0.0, 5.0, 0.0);
    entry.set(2.0);
    entry.stepUp();
    EXPECT_EQ(entry.number(), "2");
    entry.set(0.0);
    entry.stepUp();
    EXPECT_EQ(entry.number(), "0");
}

RC_GTEST_PROP(NumberEntryLaws, TypingWhatIsShownChangesNothing, ())
{
    NumberEntry entry;
    entry.setRange(-1000.0, 1000.0, 1.0);
    entry.set(*rc::gen::inRange(-100000, 100000) / 97.0);
    const double before = entry.value();

    entry.type(entry.number());

    RC_ASSERT(entry.value() == before);
}

RC_GTEST_PROP(NumberEntryLaws, ManyStepsOfADecimalShowNoMoreDecimalsThanItHas, ())
{
    const int thousandths = *rc::gen::inRange(1, 5000);
    const int count = *rc::gen::inRange(1, 300);
    NumberEntry entry;
    entry.setRange(0.0, 10000000.0, thousandths / 1000.0);

    for (int step = 0; step < count; ++step)
        entry.stepUp();
    RC_ASSERT(entry.value() == thousandths * count / 1000.0);

    for (int step = 0; step < count; ++step)
        entry.stepDown();
    RC_ASSERT(entry.number() == "0");
}
