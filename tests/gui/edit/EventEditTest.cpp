// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/edit/EventEdit.h"

#include "core/edl/HealedEvent.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/core/RecordingUndo.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::EventBase;
using core::EventFlaw;
using core::Framerate;
using core::Timecode;
using gui::EventEdit;
using util::Result;

constexpr bool Single = true;
constexpr bool Pair = false;

class EventEditTest : public testing::Test {
protected:
    /// Five seconds of source in five seconds of programme.
    static std::shared_ptr<EventBase> fiveSeconds()
    {
        return makeEvent("A001", "10:00:00:00", "10:00:05:00", "01:00:00:00", "01:00:05:00");
    }

    /// The ticked boxes, in the order of the table.
    static std::vector<std::size_t> ticksOf(const EventEdit& edit)
    {
        std::vector<std::size_t> ticks;
        for (std::size_t place = 0; place < EventEdit::PlaceCount; ++place) {
            if (edit.isTicked(place))
                ticks.push_back(place);
        }
        return ticks;
    }

    /// The four timecodes with a blank between.
    static std::string textOf(const EventEdit& edit)
    {
        EventBase event;
        event.setTimecodes(edit.timecode(EventEdit::SrcIn), edit.timecode(EventEdit::SrcOut),
                           edit.timecode(EventEdit::DstIn), edit.timecode(EventEdit::DstOut));
        return timecodesOf(event);
    }

    using Ticks = std::vector<std::size_t>;

    TestProject m_project;
    RecordingUndo m_undo;
};

TEST_F(EventEditTest, IsNamedAfterTheClipAndTheRoll)
{
    const auto event = fiveSeconds();
    event->setClipName("SC14_TK1004");

    EXPECT_EQ(EventEdit(event, Pair).name(), "SC14_TK1004 A001");
}

TEST_F(EventEditTest, BeginsWithBothSourceTimecodesTicked)
{
    EXPECT_EQ(ticksOf(EventEdit(fiveSeconds(), Pair)), (Ticks{EventEdit::SrcIn, EventEdit::SrcOut}));
    EXPECT_EQ(ticksOf(EventEdit(fiveSeconds(), Single)), (Ticks{EventEdit::SrcIn, EventEdit::SrcOut}));
}

TEST_F(EventEditTest, KeepsTheTickOfOneOfTwoBoxesOfAChangeEvent)
{
    EventEdit edit(fiveSeconds(), Pair);

    edit.click(EventEdit::SrcIn);

    EXPECT_EQ(ticksOf(edit), (Ticks{EventEdit::SrcIn, EventEdit::SrcOut}));
}

TEST_F(EventEditTest, LetsOneBoxOfAnOldEventRemainAloneButNotNone)
{
    EventEdit edit(fiveSeconds(), Single);

    edit.click(EventEdit::SrcIn);
    EXPECT_EQ(ticksOf(edit), Ticks{EventEdit::SrcOut});
    edit.click(EventEdit::SrcOut);
    EXPECT_EQ(ticksOf(edit), Ticks{EventEdit::SrcOut});
}

TEST_F(EventEditTest, GivesUpTheOldestTickForAThird)
{
    EventEdit edit(fiveSeconds(), Pair);

    edit.click(EventEdit::DstOut);
    EXPECT_EQ(ticksOf(edit), (Ticks{EventEdit::SrcOut, EventEdit::DstOut}));
    edit.click(EventEdit::SrcIn);
    EXPECT_EQ(ticksOf(edit), (Ticks{EventEdit::SrcIn, EventEdit::DstOut}));
    edit.click(EventEdit::DstIn);
    EXPECT_EQ(ticksOf(edit), (Ticks{EventEdit::SrcIn, EventEdit::DstIn}));
}

TEST_F(EventEditTest, CountsABoxThatIsTickedAgainAsTheNewest)
{
    EventEdit edit(fiveSeconds(), Single);

    edit.click(EventEdit::SrcIn);
    edit.click(EventEdit::SrcIn);
    edit.click(EventEdit::DstIn);

    EXPECT_EQ(ticksOf(edit), (Ticks{EventEdit::SrcIn, EventEdit::DstIn}));
}

TEST_F(EventEditTest, MovesBothTickedTimecodesByTheSameAmount)
{
    EventEdit edit(fiveSeconds(), Pair);

    EXPECT_TRUE(edit.change(EventEdit::SrcIn, Timecode("10:00:01:10")));

    EXPECT_EQ(textOf(edit), "10:00:01:10 10:00:06:10 01:00:00:00 01:00:05:00");
}

TEST_F(EventEditTest, MovesSrcInWithSrcOutToo)
{
    EventEdit edit(fiveSeconds(), Pair);

    EXPECT_TRUE(edit.change(EventEdit::SrcOut, Timecode("10:00:04:24")));

    EXPECT_EQ(textOf(edit), "09:59:59:24 10:00:04:24 01:00:00:00 01:00:05:00");
}

TEST_F(EventEditTest, MovesASourceAndAProgrammeTimecodeTogether)
{
    EventEdit edit(fiveSeconds(), Pair);
    edit.click(EventEdit::DstOut);

    EXPECT_TRUE(edit.change(EventEdit::DstOut, Timecode("01:00:07:00")));

    EXPECT_EQ(textOf(edit), "10:00:00:00 10:00:07:00 01:00:00:00 01:00:07:00");
}

TEST_F(EventEditTest, MovesASingleTickedTimecodeAlone)
{
    EventEdit edit(fiveSeconds(), Single);
    edit.click(EventEdit::SrcIn);

    EXPECT_TRUE(edit.change(EventEdit::SrcOut, Timecode("10:00:10:00")));

    EXPECT_EQ(textOf(edit), "10:00:00:00 10:00:10:00 01:00:00:00 01:00:05:00");
}

TEST_F(EventEditTest, ChangesNoTimecodeWithoutATick)
{
    EventEdit edit(fiveSeconds(), Pair);

    EXPECT_FALSE(edit.change(EventEdit::DstIn, Timecode("02:00:00:00")));

    EXPECT_EQ(textOf(edit), "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00");
    EXPECT_FALSE(edit.isChanged());
}

TEST_F(EventEditTest, CountsFramesOfDropFrameTimecode)
{
    const TestProject project(Framerate(30, true, 1));
    EventEdit edit(makeEvent("A001", "01:00:59:28", "01:01:59:28", "01:00:00:00", "01:01:00:02"), Pair);

    EXPECT_TRUE(edit.change(EventEdit::SrcIn, Timecode("01:01:00:02")));

    // Two frames on are 29 and then 02, because 00 and 01 are left out.
    EXPECT_EQ(textOf(edit), "01:01:00:02 01:02:00:02 01:00:00:00 01:01:00:02");
}

TEST_F(EventEditTest, LeavesAllFourAsTheyWereWhenOneWouldLeaveTheDay)
{
    EventEdit edit(makeEvent("A001", "23:00:00:00", "23:59:59:24", "00:00:00:00", "00:59:59:24"), Pair);

    EXPECT_FALSE(edit.change(EventEdit::SrcIn, Timecode("23:00:00:01")));
    EXPECT_EQ(textOf(edit), "23:00:00:00 23:59:59:24 00:00:00:00 00:59:59:24");

    edit.click(EventEdit::DstIn);
    edit.click(EventEdit::DstOut);
    EXPECT_FALSE(edit.change(EventEdit::DstOut, Timecode("00:59:59:23")));
    EXPECT_EQ(textOf(edit), "23:00:00:00 23:59:59:24 00:00:00:00 00:59:59:24");
    EXPECT_TRUE(edit.change(EventEdit::DstOut, Timecode("01:00:00:00")));
    EXPECT_EQ(textOf(edit), "23:00:00:00 23:59:59:24 00:00:00:01 01:00:00:00");
}

TEST_F(EventEditTest, LeavesAllFourAsTheyWereWithoutAProject)
{
    EventEdit edit(fiveSeconds(), Pair);
    {
        const NoProject none;
        EXPECT_FALSE(edit.change(EventEdit::SrcIn, Timecode("10:00:01:00")));
    }
    EXPECT_EQ(textOf(edit), "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00");
}

TEST_F(EventEditTest, RepairsATimecodeThatDoesNotExistAtTheRate)
{
    // At 25 frames a second there is no frame 27.
    EventEdit edit(makeEvent("A001", "10:00:00:27", "10:00:05:00", "01:00:00:00", "01:00:05:00"), Pair);
    EXPECT_EQ(edit.flaw(), EventFlaw::TimecodeInvalid);

    EXPECT_TRUE(edit.change(EventEdit::SrcIn, Timecode("10:00:01:00")));
    EXPECT_EQ(textOf(edit), "10:00:01:00 10:00:05:00 01:00:00:00 01:00:05:00");
    EXPECT_EQ(edit.flaw(), std::nullopt);

    EXPECT_TRUE(edit.change(EventEdit::SrcIn, Timecode("10:00:02:00")));
    EXPECT_EQ(textOf(edit), "10:00:02:00 10:00:06:00 01:00:00:00 01:00:05:00");
}

TEST_F(EventEditTest, DoesNotMoveATimecodeThatDoesNotExistAtTheRate)
{
    EventEdit edit(makeEvent("A001", "10:00:00:00", "10:00:05:27", "01:00:00:00", "01:00:05:00"), Pair);

    EXPECT_TRUE(edit.change(EventEdit::SrcIn, Timecode("10:00:01:00")));

    EXPECT_EQ(textOf(edit), "10:00:01:00 10:00:05:27 01:00:00:00 01:00:05:00");
}

TEST_F(EventEditTest, DoesNotMoveATimecodeThatWasNeverRead)
{
    const auto event = std::make_shared<EventBase>();
    event->setSrcIn(Timecode("10:00:00:00"));
    EventEdit edit(event, Pair);

    EXPECT_TRUE(edit.change(EventEdit::SrcIn, Timecode("10:00:01:00")));
    EXPECT_EQ(textOf(edit), "10:00:01:00 00:00:00:00 00:00:00:00 00:00:00:00");
    EXPECT_TRUE(edit.change(EventEdit::SrcOut, Timecode("10:00:03:00")));
    EXPECT_EQ(textOf(edit), "10:00:01:00 10:00:03:00 00:00:00:00 00:00:00:00");
    EXPECT_TRUE(edit.change(EventEdit::SrcOut, Timecode("10:00:04:00")));
    EXPECT_EQ(textOf(edit), "10:00:02:00 10:00:04:00 00:00:00:00 00:00:00:00");
}

TEST_F(EventEditTest, ShowsTheSpeedThatTheTimecodesGive)
{
    EventEdit edit(fiveSeconds(), Single);
    EXPECT_EQ(edit.speedText(), "1.00x");
    edit.click(EventEdit::SrcIn);

    edit.change(EventEdit::SrcOut, Timecode("10:00:12:12"));
    // 312 frames in 125.
    EXPECT_EQ(edit.speedText(), "2.50x");
    edit.change(EventEdit::SrcOut, Timecode("10:00:00:00"));
    EXPECT_EQ(edit.speedText(), "0.00x");
    edit.change(EventEdit::SrcOut, Timecode("09:59:57:13"));
    // 62 frames the wrong way round.
    EXPECT_EQ(edit.speedText(), "-0.50x");
}

TEST_F(EventEditTest, ShowsNoSignBeforeASpeedOfNothing)
{
    EventEdit edit(makeEvent("A001", "10:00:00:01", "10:00:00:00", "01:00:00:00", "01:10:00:00"), Single);

    // One frame back in 15000.
    EXPECT_EQ(edit.speedText(), "0.00x");
}

TEST_F(EventEditTest, RefusesAnInAfterItsOut)
{
    EventEdit edit(fiveSeconds(), Single);
    edit.click(EventEdit::SrcOut);

    EXPECT_TRUE(edit.change(EventEdit::SrcIn, Timecode("10:00:05:00")));
    EXPECT_TRUE(edit.canApply());
    EXPECT_EQ(edit.flaw(), std::nullopt);

    EXPECT_TRUE(edit.change(EventEdit::SrcIn, Timecode("10:00:05:01")));
    EXPECT_FALSE(edit.canApply());
    EXPECT_EQ(edit.flaw(), EventFlaw::TimecodeRangeInvalid);

    EXPECT_TRUE(edit.change(EventEdit::SrcIn, Timecode("10:00:04:24")));
    EXPECT_TRUE(edit.canApply());
    EXPECT_EQ(edit.flaw(), std::nullopt);
}

TEST_F(EventEditTest, RefusesADestinationInAfterItsOut)
{
    EventEdit edit(fiveSeconds(), Single);
    edit.click(EventEdit::DstIn);
    edit.click(EventEdit::SrcOut);

    EXPECT_TRUE(edit.change(EventEdit::DstIn, Timecode("01:00:05:01")));

    EXPECT_FALSE(edit.canApply());
    EXPECT_EQ(edit.flaw(), EventFlaw::TimecodeRangeInvalid);
}

TEST_F(EventEditTest, LeavesTheEventAloneUntilItIsApplied)
{
    const auto event = fiveSeconds();
    EventEdit edit(event, Pair);

    edit.change(EventEdit::SrcIn, Timecode("10:00:01:00"));

    EXPECT_EQ(timecodesOf(*event), "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00");
    EXPECT_TRUE(m_undo.begun.empty());
}

TEST_F(EventEditTest, GivesTheEventItsTimecodesInOneNamedUndoEntry)
{
    const auto event = fiveSeconds();
    RecordingListener heard;
    event->addListener(&heard);
    EventEdit edit(event, Pair);
    edit.change(EventEdit::SrcIn, Timecode("10:00:01:00"));

    edit.apply();

    EXPECT_EQ(timecodesOf(*event), "10:00:01:00 10:00:06:00 01:00:00:00 01:00:05:00");
    EXPECT_EQ(m_undo.entries, std::vector<std::wstring>{L"Edit EDL Event"});
    EXPECT_EQ(heard.types, std::vector<std::int32_t>{core::ChangeContext::EventChanged});
    event->removeListener(&heard);
}

TEST_F(EventEditTest, MakesNoUndoEntryWhenNothingChanged)
{
    const auto event = fiveSeconds();
    RecordingListener heard;
    event->addListener(&heard);
    EventEdit edit(event, Pair);
    edit.change(EventEdit::SrcIn, Timecode("10:00:01:00"));
    edit.change(EventEdit::SrcIn, Timecode("10:00:00:00"));

    edit.apply();

    EXPECT_TRUE(m_undo.begun.empty());
    EXPECT_TRUE(heard.types.empty());
    event->removeListener(&heard);
}

TEST_F(EventEditTest, LeavesTheEventAloneWhenNoUndoEntryCanBeMade)
{
    const auto event = fiveSeconds();
    EventEdit edit(event, Pair);
    edit.change(EventEdit::SrcIn, Timecode("10:00:01:00"));
    m_undo.failure = Result::HostCallFailed;

    EXPECT_EQ(thrownBy([&] { edit.apply(); }), Result::HostCallFailed);

    EXPECT_EQ(timecodesOf(*event), "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00");
}

TEST_F(EventEditTest, EditsAHealedEventAsOne)
{
    const auto event = std::make_shared<core::HealedEvent>();
    event->addEvent(fiveSeconds());
    EventEdit edit(event, Pair);

    edit.change(EventEdit::SrcOut, Timecode("10:00:06:00"));
    edit.apply();

    EXPECT_EQ(timecodesOf(*event), "10:00:01:00 10:00:06:00 01:00:00:00 01:00:05:00");
    EXPECT_EQ(event->healedEvents().size(), 1U);
}

RC_GTEST_FIXTURE_PROP(EventEditTest, TicksNeverMoreThanTwoAndNeverTooFew,
                      (bool isSingle, std::vector<std::uint8_t> clicks))
{
    EventEdit edit(fiveSeconds(), isSingle);

    for (const std::uint8_t click : clicks) {
        edit.click(click % EventEdit::PlaceCount);
        const std::size_t count = ticksOf(edit).size();
        RC_ASSERT(count <= 2U);
        RC_ASSERT(count >= (isSingle ? 1U : 2U));
    }
}

RC_GTEST_FIXTURE_PROP(EventEditTest, KeepsTheDistanceOfTwoTickedTimecodes, ())
{
    EventEdit edit(fiveSeconds(), Pair);
    const auto places = *rc::gen::container<std::vector<std::size_t>>(rc::gen::inRange<std::size_t>(0, 4));
    for (const std::size_t place : places)
        edit.click(place);
    const std::vector<std::size_t> ticked = ticksOf(edit);
    const auto frames = [&](std::size_t place) { return edit.timecode(place).toFrameCount(); };
    const std::int32_t distance = frames(ticked[1]) - frames(ticked[0]);
    const std::size_t changed = ticked[*rc::gen::inRange<std::size_t>(0, 2)];
    const std::int32_t wanted = *rc::gen::inRange(0, 24 * 3600 * 25);

    const bool isDone = edit.change(changed, Timecode(wanted));

    RC_ASSERT(frames(ticked[1]) - frames(ticked[0]) == distance);
    RC_ASSERT(isDone == (frames(changed) == wanted));
    for (std::size_t place = 0; place < EventEdit::PlaceCount; ++place) {
        if (std::find(ticked.begin(), ticked.end(), place) == ticked.end())
            RC_ASSERT(edit.timecode(place) == EventEdit(fiveSeconds(), Pair).timecode(place));
    }
}

} // namespace
} // namespace cadrel::tests
