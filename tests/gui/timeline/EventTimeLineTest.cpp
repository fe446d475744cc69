// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/timeline/EventTimeLine.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>
#include <limits>
#include <ostream>
#include <vector>

using cadrel::core::EventBase;
using cadrel::core::EventFlaw;
using cadrel::core::EventList;
using cadrel::core::Timecode;
using cadrel::gui::EventTimeLine;
using cadrel::gui::TimeLineBlock;
using cadrel::tests::makeEvent;

using Lane = EventTimeLine::Lane;
using Blocks = std::vector<TimeLineBlock>;

namespace cadrel::gui {

static void PrintTo(const TimeLineBlock& block, std::ostream* out)
{
    *out << block.first << " to " << block.end << (block.isVfx ? " VFX" : "") << (block.isHighlighted ? " high" : "");
}

} // namespace cadrel::gui

namespace {

class EventTimeLineTest : public testing::Test {
protected:
    std::shared_ptr<EventBase> add(const char* srcIn, const char* srcOut, const char* dstIn, const char* dstOut)
    {
        m_list.add(makeEvent("A", srcIn, srcOut, dstIn, dstOut));
        return m_list.eventAt(m_list.size() - 1);
    }

    cadrel::tests::TestProject m_project;
    EventList m_list;
    EventTimeLine m_line;
};

} // namespace

TEST_F(EventTimeLineTest, IsEmptyWithoutEvents)
{
    m_line.setEvents(m_list);
    EXPECT_EQ(m_line.start(), 0.0);
    EXPECT_EQ(m_line.end(), 0.0);
    EXPECT_TRUE(m_line.blocks(Lane::Source, 900, 1).empty());
    EXPECT_TRUE(m_line.blocks(Lane::Destination, 900, 1).empty());
}

TEST_F(EventTimeLineTest, HasOneAxisForBothLanes)
{
    add("00:00:10:00", "00:00:20:00", "00:00:40:00", "00:00:50:00");
    add("00:00:30:00", "00:00:35:00", "00:00:50:00", "00:00:55:00");
    m_line.setEvents(m_list);

    EXPECT_EQ(m_line.start(), 10.0);
    EXPECT_EQ(m_line.end(), 55.0);
    // Ten columns a second.
    EXPECT_EQ(m_line.blocks(Lane::Source, 450, 1), (Blocks{{0, 100}, {200, 250}}));
    EXPECT_EQ(m_line.blocks(Lane::Destination, 450, 1), (Blocks{{300, 400}, {400, 450}}));
}

TEST_F(EventTimeLineTest, ForgetsTheEventsBefore)
{
    add("00:00:10:00", "00:00:20:00", "00:00:40:00", "00:00:50:00");
    m_line.setEvents(m_list);
    m_list.clear();
    m_line.setEvents(m_list);
    EXPECT_EQ(m_line.end(), 0.0);
    EXPECT_TRUE(m_line.blocks(Lane::Source, 900, 1).empty());
}

TEST_F(EventTimeLineTest, MeetsWithoutAGapAtAnyWidth)
{
    add("00:00:00:00", "00:00:00:07", "00:00:00:00", "00:00:00:07");
    add("00:00:00:07", "00:00:01:03", "00:00:00:07", "00:00:01:03");
    m_line.setEvents(m_list);
    for (int columns = 2; columns < 200; ++columns) {
        const Blocks blocks = m_line.blocks(Lane::Source, columns, 1);
        ASSERT_EQ(blocks.size(), 2U) << columns;
        EXPECT_EQ(blocks[0].first, 0);
        EXPECT_EQ(blocks[0].end, blocks[1].first);
        EXPECT_EQ(blocks[1].end, columns);
    }
}

TEST_F(EventTimeLineTest, ShowsAShortEventAtLeastSoWide)
{
    add("00:00:00:00", "00:01:40:00", "00:00:00:00", "00:01:40:00");
    add("00:00:10:00", "00:00:10:01", "00:00:10:00", "00:00:10:00");
    m_line.setEvents(m_list);
    // One column a second.
    EXPECT_EQ(m_line.blocks(Lane::Source, 100, 1), (Blocks{{0, 10}, {10, 11}, {11, 100}}));
    EXPECT_EQ(m_line.blocks(Lane::Destination, 100, 2), (Blocks{{0, 10}, {10, 12}, {12, 100}}));
}

TEST_F(EventTimeLineTest, ShowsAnEventThatIsShorterThanItsColumnAlsoWhereTheNextBeginsInIt)
{
    add("00:00:00:00", "00:00:11:00", "00:00:00:00", "00:00:11:00");
    const auto shorter = add("00:00:11:00", "00:00:11:01", "00:00:11:00", "00:00:11:01");
    const auto next = add("00:00:11:01", "00:01:40:00", "00:00:11:01", "00:01:40:00");
    m_line.setEvents(m_list);
    // One column a second.
    EXPECT_EQ(m_line.blocks(Lane::Source, 100, 1), (Blocks{{0, 11}, {11, 12}, {12, 100}}));
    EXPECT_EQ(m_line.blocks(Lane::Destination, 100, 2), (Blocks{{0, 11}, {11, 13}, {13, 100}}));

    m_line.highlight({next});
    EXPECT_EQ(m_line.blocks(Lane::Source, 100, 1), (Blocks{{0, 11}, {11, 100, false, true}}));
    // Among highlighted ones too.
    shorter->setVfx(true);
    m_line.setEvents(m_list);
    m_line.highlight({shorter, next});
    EXPECT_EQ(m_line.blocks(Lane::Source, 100, 1), (Blocks{{0, 11}, {11, 12, true, true}, {12, 100, false, true}}));
}

TEST_F(EventTimeLineTest, ShowsOverALaterEventOnlyWhatHadToBeWidened)
{
    add("00:00:10:00", "00:00:12:00", "00:00:10:00", "00:00:11:00")->setVfx(true);
    add("00:00:00:00", "00:01:40:00", "00:00:00:00", "00:01:40:00");
    m_line.setEvents(m_list);
    // Two columns are enough for two seconds, and not for one.
    EXPECT_EQ(m_line.blocks(Lane::Source, 100, 2), (Blocks{{0, 100}}));
    EXPECT_EQ(m_line.blocks(Lane::Source, 100, 3), (Blocks{{0, 10}, {10, 13, true}, {13, 100}}));
    EXPECT_EQ(m_line.blocks(Lane::Destination, 100, 2), (Blocks{{0, 10}, {10, 12, true}, {12, 100}}));
}

TEST_F(EventTimeLineTest, ShowsAShortEventAtTheEndOfTheAxisToo)
{
    add("00:00:00:00", "00:00:50:00", "00:00:00:00", "00:00:50:00");
    add("00:01:40:00", "00:01:40:00", "00:01:40:00", "00:01:40:00");
    m_line.setEvents(m_list);
    EXPECT_EQ(m_line.blocks(Lane::Source, 100, 2), (Blocks{{0, 50}, {98, 100}}));
}

TEST_F(EventTimeLineTest, ShowsASingleEventWithoutLength)
{
    add("00:00:10:00", "00:00:10:00", "00:00:10:00", "00:00:10:00");
    m_line.setEvents(m_list);
    // The axis is one frame long then.
    EXPECT_EQ(m_line.start(), 10.0);
    EXPECT_EQ(m_line.end(), 10.04);
    EXPECT_EQ(m_line.blocks(Lane::Source, 900, 1), (Blocks{{0, 1}}));
    EXPECT_EQ(m_line.blocks(Lane::Destination, 900, 1), (Blocks{{0, 1}}));
}

TEST_F(EventTimeLineTest, ShowsAnEventThatEndsBeforeItStartsAtItsStart)
{
    add("00:00:00:00", "00:01:40:00", "00:00:00:00", "00:01:40:00");
    add("00:00:20:00", "00:00:10:00", "00:00:20:00", "00:00:10:00");
    m_line.setEvents(m_list);
    EXPECT_EQ(m_line.blocks(Lane::Source, 100, 1), (Blocks{{0, 20}, {20, 21}, {21, 100}}));
}

TEST_F(EventTimeLineTest, LeavesOutEventsWithoutUsableTimes)
{
    const auto shown = add("01:00:00:00", "01:00:10:00", "01:00:00:00", "01:00:10:00");
    add("00:00:00:30", "00:00:01:00", "00:00:00:00", "00:00:01:00");
    m_list.add(std::make_shared<EventBase>());
    for (const auto flaw : {EventFlaw::SrcInUnreadable, EventFlaw::SrcOutUnreadable, EventFlaw::DstInUnreadable,
                            EventFlaw::DstOutUnreadable})
        add("00:00:00:00", "00:00:01:00", "00:00:00:00", "00:00:01:00")->addFlaw(flaw);
    // Its times are all right.
    add("01:00:10:00", "01:00:20:00", "01:00:10:00", "01:00:20:00")->addFlaw(EventFlaw::NotVideoEvent);
    ASSERT_TRUE(m_list.at(1).hasFlaw(EventFlaw::TimecodeInvalid));

    m_line.setEvents(m_list);

    EXPECT_EQ(m_line.start(), 3600.0);
    EXPECT_EQ(m_line.end(), 3620.0);
    EXPECT_EQ(m_line.blocks(Lane::Source, 20, 1), (Blocks{{0, 10}, {10, 20}}));
}

TEST_F(EventTimeLineTest, IsEmptyWhenNoEventHasUsableTimes)
{
    m_list.add(std::make_shared<EventBase>());
    m_line.setEvents(m_list);
    EXPECT_EQ(m_line.end(), 0.0);
    EXPECT_TRUE(m_line.blocks(Lane::Source, 900, 1).empty());
}

TEST_F(EventTimeLineTest, LeavesOutAnEventThatTheRateNoLongerHas)
{
    add("00:00:00:24", "00:00:01:00", "00:00:00:24", "00:00:01:00");
    add("00:00:00:00", "00:00:01:00", "00:00:00:00", "00:00:01:00");
    const cadrel::tests::TestProject slower(cadrel::core::Framerate(24, 0));
    m_line.setEvents(m_list);
    EXPECT_EQ(m_line.blocks(Lane::Source, 10, 1), (Blocks{{0, 10}}));
    EXPECT_EQ(m_line.start(), 0.0);
}

TEST_F(EventTimeLineTest, PlacesNothingWithoutColumns)
{
    add("00:00:00:00", "00:00:01:00", "00:00:00:00", "00:00:01:00");
    m_line.setEvents(m_list);
    for (const int columns : {0, -1, -100, std::numeric_limits<int>::min()})
        EXPECT_TRUE(m_line.blocks(Lane::Source, columns, 1).empty()) << columns;
    EXPECT_EQ(m_line.blocks(Lane::Source, 1, 1), (Blocks{{0, 1}}));
    // Wider than the lane.
    EXPECT_EQ(m_line.blocks(Lane::Source, 1, 2), (Blocks{{0, 1}}));
}

TEST_F(EventTimeLineTest, ShowsTheLaterOfTwoEventsOnTop)
{
    add("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00");
    add("00:00:04:00", "00:00:06:00", "00:00:00:00", "00:00:10:00")->setVfx(true);
    m_line.setEvents(m_list);
    EXPECT_EQ(m_line.blocks(Lane::Source, 10, 1), (Blocks{{0, 4}, {4, 6, true}, {6, 10}}));
    EXPECT_EQ(m_line.blocks(Lane::Destination, 10, 1), (Blocks{{0, 10, true}}));
}

TEST_F(EventTimeLineTest, ShowsHighlightedEventsOnTopOfAllOthers)
{
    const auto first = add("00:00:04:00", "00:00:06:00", "00:00:00:00", "00:00:10:00");
    const auto second = add("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00");
    second->setVfx(true);
    m_line.setEvents(m_list);
    EXPECT_EQ(m_line.blocks(Lane::Source, 10, 1), (Blocks{{0, 10, true}}));

    m_line.highlight({first, nullptr});
    EXPECT_EQ(m_line.blocks(Lane::Source, 10, 1), (Blocks{{0, 4, true}, {4, 6, false, true}, {6, 10, true}}));
    m_line.highlight({first, second});
    EXPECT_EQ(m_line.blocks(Lane::Source, 10, 1), (Blocks{{0, 10, true, true}}));
    m_line.highlight({});
    EXPECT_EQ(m_line.blocks(Lane::Source, 10, 1), (Blocks{{0, 10, true}}));
}

TEST_F(EventTimeLineTest, ForgetsTheHighlightWithTheEvents)
{
    const auto event = add("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00");
    m_line.setEvents(m_list);
    m_line.highlight({event});
    m_line.setEvents(m_list);
    EXPECT_EQ(m_line.blocks(Lane::Source, 10, 1), (Blocks{{0, 10}}));
}

TEST_F(EventTimeLineTest, ShowsAnEventThatIsGoneWhereItWas)
{
    add("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00");
    m_line.setEvents(m_list);
    m_list.clear();
    m_line.highlight({});
    EXPECT_EQ(m_line.blocks(Lane::Source, 10, 1), (Blocks{{0, 10}}));
}

TEST_F(EventTimeLineTest, NeedsAFrameRate)
{
    add("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00");
    m_line.setEvents(m_list);
    const cadrel::tests::NoProject none;
    EXPECT_EQ(cadrel::tests::thrownBy([&] { m_line.setEvents(m_list); }), cadrel::util::Result::NotAvailable);
    EXPECT_TRUE(m_line.blocks(Lane::Source, 10, 1).empty());
    EXPECT_NO_THROW(m_line.setEvents(EventList()));
}

RC_GTEST_FIXTURE_PROP(EventTimeLineTest, EveryColumnShowsTheTopmostEventThere, ())
{
    const int columns = *rc::gen::inRange(1, 60);
    const int least = *rc::gen::inRange(1, 4);
    std::vector<std::shared_ptr<EventBase>> highlighted;
    for (int count = *rc::gen::inRange(1, 12); count > 0; --count) {
        const auto timecode = [] { return Timecode(*rc::gen::inRange(0, 500)); };
        auto event = std::make_shared<EventBase>();
        event->setTimecodes(timecode(), timecode(), timecode(), timecode());
        event->setVfx(*rc::gen::arbitrary<bool>());
        m_list.add(event);
        if (*rc::gen::inRange(0, 3) == 0)
            highlighted.push_back(event);
    }
    m_line.setEvents(m_list);
    m_line.highlight(highlighted);

    // The painter's way: the lowest first, each over the last.
    std::vector<const TimeLineBlock*> painted(static_cast<std::size_t>(columns), nullptr);
    std::vector<TimeLineBlock> placed[4];
    const double scale = columns / (m_line.end() - m_line.start());
    for (const auto& event : m_list.events()) {
        const bool isHigh = std::find(highlighted.begin(), highlighted.end(), event) != highlighted.end();
        const auto columnOf = [&](const Timecode& timecode) {
            return static_cast<int>(std::lround((timecode.toSeconds() - m_line.start()) * scale));
        };
        const int width = std::min(least, columns);
        const int first = std::min(columnOf(event->srcIn()), columns - width);
        const int end = columnOf(event->srcOut());
        const bool isWidened = end < first + width;
        placed[(isHigh ? 2 : 0) + (isWidened ? 1 : 0)].push_back(
            {first, isWidened ? first + width : end, event->vfx(), isHigh});
    }
    for (const std::vector<TimeLineBlock>& level : placed) {
        for (const TimeLineBlock& block : level) {
            for (int column = block.first; column < block.end; ++column)
                painted[static_cast<std::size_t>(column)] = &block;
        }
    }

    const Blocks blocks = m_line.blocks(Lane::Source, columns, least);
    RC_ASSERT(blocks.size() <= static_cast<std::size_t>(columns));
    std::size_t covered = 0;
    int last = 0;
    for (const TimeLineBlock& block : blocks) {
        RC_ASSERT(last <= block.first);
        RC_ASSERT(block.first < block.end);
        last = block.end;
        for (int column = block.first; column < block.end; ++column) {
            const TimeLineBlock* const expected = painted[static_cast<std::size_t>(column)];
            RC_ASSERT(expected != nullptr);
            RC_ASSERT(expected == painted[static_cast<std::size_t>(block.first)]);
            RC_ASSERT(expected->isVfx == block.isVfx);
            RC_ASSERT(expected->isHighlighted == block.isHighlighted);
            ++covered;
        }
    }
    RC_ASSERT(covered ==
              painted.size() - static_cast<std::size_t>(std::count(painted.begin(), painted.end(), nullptr)));
}
