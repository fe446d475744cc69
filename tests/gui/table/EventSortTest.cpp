// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventSort.h"

#include "core/edl/EventBase.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

using cadrel::core::EventBase;
using cadrel::core::EventFlaw;
using cadrel::core::Timecode;
using cadrel::gui::EventColumn;
using cadrel::gui::EventRow;
using cadrel::gui::sortEventRows;
using cadrel::tests::makeEvent;

namespace {

using Events = std::vector<std::shared_ptr<EventBase>>;

/// The list positions of the events in the order of the column.
std::vector<std::uint32_t> orderOf(const Events& events, int column, bool forwards)
{
    std::vector<EventRow> rows;
    for (const auto& event : events)
        rows.push_back({event, static_cast<std::uint32_t>(rows.size())});
    sortEventRows(rows, {column, forwards});
    std::vector<std::uint32_t> order;
    for (const EventRow& row : rows)
        order.push_back(row.position);
    return order;
}

using Order = std::vector<std::uint32_t>;

class EventSortTest : public testing::Test {
protected:
    std::shared_ptr<EventBase> event(const char* dstIn, std::uint32_t number)
    {
        return makeEvent("A", "00:00:00:00", "00:00:01:00", dstIn, "23:00:00:00", number);
    }
    static std::shared_ptr<EventBase> named(const std::string& roll, const std::string& clip = {},
                                            const std::string& file = {})
    {
        auto event = std::make_shared<EventBase>();
        event->setRollName(roll);
        event->setClipName(clip);
        event->setEdlFileName(file);
        return event;
    }

    cadrel::tests::TestProject m_project;
};

} // namespace

TEST_F(EventSortTest, LetsValuesRiseAndWithForwardsFall)
{
    const Events events = {event("01:00:10:00", 3), event("01:00:00:00", 1), event("01:00:05:00", 2)};
    EXPECT_EQ(orderOf(events, EventColumn::DstIn, false), (Order{1, 2, 0}));
    EXPECT_EQ(orderOf(events, EventColumn::DstIn, true), (Order{0, 2, 1}));
}

TEST_F(EventSortTest, SortsByEachTimecode)
{
    const Events events = {makeEvent("", "00:00:01:00", "00:00:09:00", "00:00:02:00", "00:00:08:00"),
                           makeEvent("", "00:00:00:24", "00:00:09:01", "00:00:02:01", "00:00:07:24")};
    EXPECT_EQ(orderOf(events, EventColumn::SrcIn, false), (Order{1, 0}));
    EXPECT_EQ(orderOf(events, EventColumn::SrcOut, false), (Order{0, 1}));
    EXPECT_EQ(orderOf(events, EventColumn::DstIn, false), (Order{0, 1}));
    EXPECT_EQ(orderOf(events, EventColumn::DstOut, false), (Order{1, 0}));
}

TEST_F(EventSortTest, PutsInvalidEventsBeforeValidOnesAndWithForwardsAfterThem)
{
    const Events events = {event("00:00:00:00", 1), std::make_shared<EventBase>()};
    ASSERT_TRUE(events[0]->isValid());
    ASSERT_FALSE(events[1]->isValid());
    EXPECT_EQ(orderOf(events, EventColumn::State, false), (Order{1, 0}));
    EXPECT_EQ(orderOf(events, EventColumn::State, true), (Order{0, 1}));
}

TEST_F(EventSortTest, ComparesEventNumbersUnsigned)
{
    const Events events = {event("00:00:00:00", 4294967295U), event("00:00:00:00", 1)};
    EXPECT_EQ(orderOf(events, EventColumn::Number, false), (Order{1, 0}));
}

TEST_F(EventSortTest, ComparesTransitionsSigned)
{
    Events events = {event("00:00:00:00", 1), event("00:00:00:00", 2), event("00:00:00:00", 3)};
    events[0]->setTransitionType(2);
    events[1]->setTransitionType(-1);
    EXPECT_EQ(orderOf(events, EventColumn::Transition, false), (Order{1, 2, 0}));
}

TEST_F(EventSortTest, ComparesNamesAsBytesAndTheShorterFirst)
{
    // B is before a, and a letter of Latin-1 or UTF-8 after both. The first bytes of the long names are equal.
    const std::string start(40, 'x');
    const Events events = {named("a"),         named("\xc3\xa4"), named("B"),         named(""),
                           named(start + "b"), named(start),      named(start + "a"), named(std::string("a\0", 2))};
    EXPECT_EQ(orderOf(events, EventColumn::Roll, false), (Order{3, 2, 0, 7, 5, 6, 4, 1}));
}

TEST_F(EventSortTest, SortsByClipNameAndByFile)
{
    const Events events = {named("a", "b", "c"), named("b", "c", "a"), named("c", "a", "b")};
    EXPECT_EQ(orderOf(events, EventColumn::Roll, false), (Order{0, 1, 2}));
    EXPECT_EQ(orderOf(events, EventColumn::ClipName, false), (Order{2, 0, 1}));
    EXPECT_EQ(orderOf(events, EventColumn::EdlFile, false), (Order{1, 2, 0}));
}

TEST_F(EventSortTest, PutsEqualRowsInTheOrderOfTheirNumbersAndThenOfTheList)
{
    const Events events = {event("00:00:05:00", 2), event("00:00:05:00", 1), event("00:00:05:00", 2),
                           event("00:00:05:00", 1)};
    EXPECT_EQ(orderOf(events, EventColumn::DstIn, false), (Order{1, 3, 0, 2}));
    EXPECT_EQ(orderOf(events, EventColumn::DstIn, true), (Order{2, 0, 3, 1}));
}

TEST_F(EventSortTest, TakesExpiredEventsAsTheLowest)
{
    const Events events = {nullptr, event("00:00:00:00", 0), nullptr};
    for (const EventColumn& column : EventColumn::all()) {
        EXPECT_EQ(orderOf(events, column.id, false), (Order{0, 2, 1})) << column.id;
        EXPECT_EQ(orderOf(events, column.id, true), (Order{1, 2, 0})) << column.id;
    }
}

TEST_F(EventSortTest, FollowsTheEventNumbersForANumberThatIsNoColumn)
{
    const Events events = {event("00:00:00:00", 2), event("00:00:05:00", 1)};
    for (const int column : {0, 11, -1})
        EXPECT_EQ(orderOf(events, column, false), (Order{1, 0})) << column;
}

TEST(EventSort, ReadsAColumnThatIsNoneAsTheEventNumbers)
{
    EXPECT_EQ(cadrel::gui::shownSortColumn(0), 2);
    EXPECT_EQ(cadrel::gui::shownSortColumn(1), 1);
    EXPECT_EQ(cadrel::gui::shownSortColumn(10), 10);
    EXPECT_EQ(cadrel::gui::shownSortColumn(11), 2);
}

namespace {

/// Few different values, so that many rows are equal.
Events randomEvents()
{
    const auto name = rc::gen::container<std::string>(rc::gen::elementOf(std::string("aB\xff")));
    Events events(*rc::gen::inRange<std::size_t>(0, 30));
    for (auto& event : events) {
        if (*rc::gen::inRange(0, 8) == 0)
            continue;
        const auto timecode = [] { return Timecode(0, 0, *rc::gen::inRange(0, 3), *rc::gen::inRange(-1, 27)); };
        event = std::make_shared<EventBase>();
        event->setTimecodes(timecode(), timecode(), timecode(), timecode());
        event->setEventNumber(*rc::gen::inRange(0U, 4U));
        event->setTransitionType(*rc::gen::inRange(-1, 4));
        event->setRollName(*name);
        event->setClipName(*name);
        event->setEdlFileName(*name);
    }
    return events;
}

/// How two events compare in a column, as a person would write it down: below 0, 0, or above.
int compared(const EventBase& a, const EventBase& b, int column)
{
    const auto sign = [](const auto& x, const auto& y) { return x < y ? -1 : (y < x ? 1 : 0); };
    switch (column) {
    case 1:
        return sign(a.isValid(), b.isValid());
    case 2:
        return sign(a.eventNumber(), b.eventNumber());
    case 3:
        return sign(a.rollName(), b.rollName());
    case 4:
        return sign(a.clipName(), b.clipName());
    case 5:
        return sign(a.edlFileName(), b.edlFileName());
    case 6:
        return sign(a.transitionType(), b.transitionType());
    case 7:
        return sign(a.srcIn(), b.srcIn());
    case 8:
        return sign(a.srcOut(), b.srcOut());
    case 9:
        return sign(a.dstIn(), b.dstIn());
    case 10:
        return sign(a.dstOut(), b.dstOut());
    default:
        return 0;
    }
}

} // namespace

RC_GTEST_FIXTURE_PROP(EventSortTest, TheOrderIsTotalAndFollowsColumnNumberAndPosition, ())
{
    const Events events = randomEvents();
    const int column = *rc::gen::inRange(0, 12);

    const Order order = orderOf(events, column, false);

    RC_ASSERT(order.size() == events.size());
    for (std::size_t index = 1; index < order.size(); ++index) {
        const auto& lower = events[order[index - 1]];
        const auto& upper = events[order[index]];
        if (!lower || !upper) {
            RC_ASSERT(!lower);
            RC_ASSERT(upper || order[index - 1] < order[index]);
            continue;
        }
        const int sign = compared(*lower, *upper, column);
        RC_ASSERT(sign <= 0);
        if (sign == 0) {
            RC_ASSERT(lower->eventNumber() <= upper->eventNumber());
            RC_ASSERT(lower->eventNumber() < upper->eventNumber() || order[index - 1] < order[index]);
        }
    }
}

RC_GTEST_FIXTURE_PROP(EventSortTest, FallingIsTheReverseOfRising, ())
{
    const Events events = randomEvents();
    const int column = *rc::gen::inRange(0, 12);

    Order rising = orderOf(events, column, false);
    std::reverse(rising.begin(), rising.end());
    RC_ASSERT(orderOf(events, column, true) == rising);
}
