// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/input/TimecodeEntry.h"

#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <string>

using cadrel::core::Framerate;
using cadrel::core::Timecode;
using cadrel::gui::TimecodeEntry;
using cadrel::tests::NoProject;
using cadrel::tests::TestProject;

using Texts = TimecodeEntry::Texts;

namespace {

/// "+01:02:03:04" as the fields of an input hold it.
Texts texts(const std::string& signedText)
{
    const auto field = [&](std::size_t index) { return signedText.substr(1 + 3 * index, 2); };
    return {{field(0), field(1), field(2), field(3)}, signedText.substr(0, 1)};
}

std::string shown(const TimecodeEntry& entry)
{
    const Texts shown = entry.texts();
    return shown.sign + shown.fields[0] + ":" + shown.fields[1] + ":" + shown.fields[2] + ":" + shown.fields[3];
}

class TimecodeEntryTest : public testing::Test {
protected:
    /// What the entry shows after a step from the timecode.
    static std::string stepped(const std::string& from, TimecodeEntry::Field field, bool isUp, bool isSigned = false)
    {
        TimecodeEntry entry(isSigned);
        entry.commit(texts(from));
        EXPECT_EQ(shown(entry), from);
        const bool isAnother = entry.step(field, isUp);
        EXPECT_EQ(isAnother, shown(entry) != from);
        return shown(entry);
    }

    TestProject m_project;
};

class DropFrameEntryTest : public TimecodeEntryTest {
protected:
    TestProject m_project{Framerate(30, true, 1)};
};

} // namespace

TEST_F(TimecodeEntryTest, StartsAtZero)
{
    const TimecodeEntry entry(true);

    EXPECT_EQ(shown(entry), "+00:00:00:00");
    EXPECT_TRUE(entry.isPositive());
    EXPECT_TRUE(entry.value().isInitialized());
}

TEST_F(TimecodeEntryTest, TakesATimecode)
{
    TimecodeEntry entry(false);

    EXPECT_TRUE(entry.set(Timecode(1, 2, 3, 24), true));

    EXPECT_EQ(shown(entry), "+01:02:03:24");
    EXPECT_EQ(entry.value(), Timecode(1, 2, 3, 24));
}

TEST_F(TimecodeEntryTest, TellsNothingOfTheSameValue)
{
    TimecodeEntry entry(true);
    entry.set(Timecode(1, 0, 0, 0), false);

    EXPECT_FALSE(entry.set(Timecode(1, 0, 0, 0), false));
    EXPECT_FALSE(entry.commit(texts("-01:00:00:00")));
    EXPECT_TRUE(entry.commit(texts("+01:00:00:00")));
}

TEST_F(TimecodeEntryTest, IsNegativeOnlyWithASign)
{
    TimecodeEntry isSigned(true);
    TimecodeEntry isUnsigned(false);

    isSigned.set(Timecode(0, 0, 1, 0), false);
    isUnsigned.set(Timecode(0, 0, 1, 0), false);

    EXPECT_EQ(shown(isSigned), "-00:00:01:00");
    EXPECT_EQ(shown(isUnsigned), "+00:00:01:00");
    EXPECT_TRUE(isUnsigned.isPositive());
}

TEST_F(TimecodeEntryTest, ShowsZerosForAnUninitialisedTimecode)
{
    TimecodeEntry entry(true);
    entry.set(Timecode(1, 2, 3, 4), true);

    EXPECT_TRUE(entry.set(Timecode(), true));

    EXPECT_EQ(shown(entry), "+00:00:00:00");
}

TEST_F(TimecodeEntryTest, BringsBackTheFormerValueForFramesOverTheRate)
{
    TimecodeEntry entry(false);
    entry.set(Timecode(1, 0, 0, 12), true);

    EXPECT_FALSE(entry.commit(texts("+01:00:00:99")));
    EXPECT_EQ(shown(entry), "+01:00:00:12");
    EXPECT_FALSE(entry.commit(texts("+01:00:00:25")));
    EXPECT_TRUE(entry.commit(texts("+01:00:00:24")));
}

TEST_F(TimecodeEntryTest, BringsBackTheFormerValueOutsideOfTheDay)
{
    TimecodeEntry entry(false);

    EXPECT_FALSE(entry.commit(texts("+24:00:00:00")));
    EXPECT_FALSE(entry.commit(texts("+00:60:00:00")));
    EXPECT_FALSE(entry.commit(texts("+00:00:60:00")));
    EXPECT_TRUE(entry.commit(texts("+23:59:59:24")));
}

TEST_F(TimecodeEntryTest, ReadsEmptyFieldsAsZeroAndOneDigitAsItself)
{
    TimecodeEntry entry(true);
    entry.set(Timecode(1, 1, 1, 1), false);

    EXPECT_TRUE(entry.commit({{"", "5", "07", ""}, ""}));

    EXPECT_EQ(shown(entry), "+00:05:07:00");
}

TEST_F(TimecodeEntryTest, DropsATextThatIsNoNumber)
{
    TimecodeEntry entry(true);

    EXPECT_FALSE(entry.commit({{"1", "x", "0", "0"}, "+"}));
    EXPECT_FALSE(entry.commit({{"1", "-1", "0", "0"}, "+"}));
    EXPECT_FALSE(entry.commit({{"99999999999", "0", "0", "0"}, "+"}));
    EXPECT_EQ(shown(entry), "+00:00:00:00");
}

TEST_F(TimecodeEntryTest, KeepsItsValueWithoutAProject)
{
    TimecodeEntry entry(true);
    entry.set(Timecode(1, 2, 3, 4), true);
    const NoProject none;

    EXPECT_FALSE(entry.commit(texts("+05:00:00:00")));
    EXPECT_FALSE(entry.set(Timecode(5, 0, 0, 0), true));
    EXPECT_FALSE(entry.step(TimecodeEntry::Hours, true));
    EXPECT_EQ(shown(entry), "+01:02:03:04");
}

TEST_F(TimecodeEntryTest, ShowsZerosForAnUninitialisedTimecodeWithoutAProject)
{
    TimecodeEntry entry(true);
    entry.set(Timecode(1, 2, 3, 4), true);
    const NoProject none;

    entry.set(Timecode(), true);

    EXPECT_EQ(shown(entry), "+00:00:00:00");
}

TEST_F(TimecodeEntryTest, StepsEachField)
{
    EXPECT_EQ(stepped("+01:02:03:04", TimecodeEntry::Hours, true), "+02:02:03:04");
    EXPECT_EQ(stepped("+01:02:03:04", TimecodeEntry::Minutes, true), "+01:03:03:04");
    EXPECT_EQ(stepped("+01:02:03:04", TimecodeEntry::Seconds, true), "+01:02:04:04");
    EXPECT_EQ(stepped("+01:02:03:04", TimecodeEntry::Frames, true), "+01:02:03:05");
    EXPECT_EQ(stepped("+01:02:03:04", TimecodeEntry::Hours, false), "+00:02:03:04");
    EXPECT_EQ(stepped("+01:02:03:04", TimecodeEntry::Minutes, false), "+01:01:03:04");
    EXPECT_EQ(stepped("+01:02:03:04", TimecodeEntry::Seconds, false), "+01:02:02:04");
    EXPECT_EQ(stepped("+01:02:03:04", TimecodeEntry::Frames, false), "+01:02:03:03");
}

TEST_F(TimecodeEntryTest, CarriesIntoTheNextField)
{
    EXPECT_EQ(stepped("+00:59:59:24", TimecodeEntry::Frames, true), "+01:00:00:00");
    EXPECT_EQ(stepped("+01:00:00:00", TimecodeEntry::Frames, false), "+00:59:59:24");
    EXPECT_EQ(stepped("+00:59:59:10", TimecodeEntry::Seconds, true), "+01:00:00:10");
    EXPECT_EQ(stepped("+01:00:30:10", TimecodeEntry::Minutes, false), "+00:59:30:10");
}

TEST_F(TimecodeEntryTest, StaysWithinTheDay)
{
    EXPECT_EQ(stepped("+23:59:59:24", TimecodeEntry::Frames, true), "+23:59:59:24");
    EXPECT_EQ(stepped("+23:00:00:01", TimecodeEntry::Hours, true), "+23:00:00:01");
    EXPECT_EQ(stepped("-23:00:00:01", TimecodeEntry::Hours, false, true), "-23:00:00:01");
    EXPECT_EQ(stepped("+22:59:59:24", TimecodeEntry::Hours, true), "+23:59:59:24");
}

TEST_F(TimecodeEntryTest, StaysAtOrAboveZeroWithoutASign)
{
    EXPECT_EQ(stepped("+00:00:00:00", TimecodeEntry::Frames, false), "+00:00:00:00");
    EXPECT_EQ(stepped("+00:00:59:24", TimecodeEntry::Minutes, false), "+00:00:59:24");
    EXPECT_EQ(stepped("+00:01:00:00", TimecodeEntry::Minutes, false), "+00:00:00:00");
}

TEST_F(TimecodeEntryTest, StepsThroughZeroWithASign)
{
    EXPECT_EQ(stepped("+00:00:00:10", TimecodeEntry::Seconds, false, true), "-00:00:00:15");
    EXPECT_EQ(stepped("-00:00:00:15", TimecodeEntry::Seconds, true, true), "+00:00:00:10");
    EXPECT_EQ(stepped("-00:00:00:01", TimecodeEntry::Frames, true, true), "+00:00:00:00");
    EXPECT_EQ(stepped("-00:00:00:01", TimecodeEntry::Frames, false, true), "-00:00:00:02");
}

TEST_F(TimecodeEntryTest, FlipsTheSignWhereThereIsOne)
{
    TimecodeEntry isSigned(true);
    TimecodeEntry isUnsigned(false);

    EXPECT_TRUE(isSigned.flipSign());
    EXPECT_FALSE(isUnsigned.flipSign());

    EXPECT_EQ(shown(isSigned), "-00:00:00:00");
    EXPECT_TRUE(isSigned.flipSign());
    EXPECT_EQ(shown(isSigned), "+00:00:00:00");
}

TEST_F(TimecodeEntryTest, KeepsAValueThatTheProjectNoLongerHas)
{
    TimecodeEntry entry(false);
    entry.set(Timecode(0, 0, 0, 24), true);
    const TestProject slower(Framerate(24, 0));

    EXPECT_FALSE(entry.step(TimecodeEntry::Seconds, true));
    EXPECT_EQ(shown(entry), "+00:00:00:24");
    EXPECT_TRUE(entry.commit(texts("+00:00:00:23")));
}

TEST_F(DropFrameEntryTest, RefusesNumbersThatAreLeftOut)
{
    TimecodeEntry entry(false);

    EXPECT_FALSE(entry.commit(texts("+00:01:00:01")));
    EXPECT_TRUE(entry.commit(texts("+00:01:00:02")));
    EXPECT_TRUE(entry.commit(texts("+00:10:00:00")));
}

TEST_F(DropFrameEntryTest, StepsOverNumbersThatAreLeftOut)
{
    EXPECT_EQ(stepped("+00:00:59:29", TimecodeEntry::Frames, true), "+00:01:00:02");
    EXPECT_EQ(stepped("+00:01:00:02", TimecodeEntry::Frames, false), "+00:00:59:29");
    EXPECT_EQ(stepped("+00:00:59:00", TimecodeEntry::Seconds, true), "+00:01:00:02");
    EXPECT_EQ(stepped("+00:01:01:00", TimecodeEntry::Seconds, false), "+00:00:59:29");
    EXPECT_EQ(stepped("+00:00:00:00", TimecodeEntry::Minutes, true), "+00:01:00:02");
    EXPECT_EQ(stepped("+00:10:00:01", TimecodeEntry::Minutes, false), "+00:08:59:29");
    EXPECT_EQ(stepped("+00:09:00:02", TimecodeEntry::Minutes, true), "+00:10:00:02");
    EXPECT_EQ(stepped("-00:00:59:29", TimecodeEntry::Frames, false, true), "-00:01:00:02");
    EXPECT_EQ(stepped("-00:01:00:02", TimecodeEntry::Frames, true, true), "-00:00:59:29");
}

RC_GTEST_PROP(TimecodeEntryLaws, AStepUpAndAStepDownOfTheFramesComeBack, ())
{
    const Framerate rate = *rc::gen::element(Framerate(24, 0), Framerate(25, 0), Framerate(30, true, 1));
    const TestProject project(rate);
    const int count = *rc::gen::inRange(-100000, 100000);
    TimecodeEntry entry(true);
    Timecode timecode;
    timecode.setFrameCount(std::abs(count));
    entry.set(timecode, count >= 0);
    const std::string before = shown(entry);

    RC_ASSERT(entry.step(TimecodeEntry::Frames, true));
    RC_ASSERT(entry.value().toFrameCount() * (entry.isPositive() ? 1 : -1) == count + 1);
    RC_ASSERT(entry.step(TimecodeEntry::Frames, false));
    RC_ASSERT(shown(entry) == before);
}

RC_GTEST_PROP(TimecodeEntryLaws, WhateverIsTypedTheValueExists, ())
{
    const Framerate rate = *rc::gen::element(Framerate(24, 0), Framerate(25, 0), Framerate(30, true, 1));
    const TestProject project(rate);
    TimecodeEntry entry(*rc::gen::arbitrary<bool>());
    const auto typed = *rc::gen::container<std::vector<std::string>>(
        4, rc::gen::container<std::string>(rc::gen::elementOf(std::string("0123456789"))));
    const auto sign = *rc::gen::element<std::string>("", "+", "-");

    entry.commit({{typed[0], typed[1], typed[2], typed[3]}, sign});
    entry.step(*rc::gen::element(TimecodeEntry::Hours, TimecodeEntry::Minutes, TimecodeEntry::Seconds),
               *rc::gen::arbitrary<bool>());

    RC_ASSERT(entry.value().isValid());
    RC_ASSERT(entry.isSigned() || entry.isPositive());
    RC_ASSERT(!entry.commit(entry.texts()));
}
