// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventRows.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <set>
#include <string>
#include <vector>

using cadrel::core::EventBase;
using cadrel::core::EventFlaw;
using cadrel::core::EventList;
using cadrel::core::Timecode;
using cadrel::gui::EventColumn;
using cadrel::gui::EventRows;
using cadrel::gui::RowSet;
using cadrel::tests::makeEvent;

using Events = EventRows::Events;

namespace {

RowSet rowsOf(std::initializer_list<int> ascending)
{
    RowSet rows;
    for (const int row : ascending)
        rows.append(row);
    return rows;
}

class EventRowsTest : public testing::Test {
protected:
    /// An event of one second at that second of the programme.
    std::shared_ptr<EventBase> add(int second, const std::string& roll = "A")
    {
        auto event = std::make_shared<EventBase>();
        event->setRollName(roll);
        event->setTimecodes({0, 0, 0, 0}, {0, 0, 1, 0}, {1, 0, second, 0}, {1, 0, second + 1, 0});
        event->setEventNumber(static_cast<std::uint32_t>(m_list.size() + 1));
        m_list.add(event);
        return event;
    }
    Events shown() const
    {
        Events events;
        for (int row = 0; row < m_rows.count(); ++row)
            events.push_back(m_rows.eventAt(row));
        return events;
    }

    cadrel::tests::TestProject m_project;
    EventList m_list;
    EventRows m_rows;
};

} // namespace

TEST_F(EventRowsTest, AreInTheOrderOfTheProgrammeAtFirst)
{
    const auto third = add(30);
    const auto first = add(10);
    const auto second = add(20);
    m_rows.reload(m_list);

    EXPECT_EQ(m_rows.sortKey().column, EventColumn::DstIn);
    EXPECT_FALSE(m_rows.sortKey().forwards);
    EXPECT_EQ(shown(), (Events{first, second, third}));
    EXPECT_EQ(m_rows.rowOf(third), 2);
    EXPECT_EQ(m_rows.rowOf(std::make_shared<EventBase>()), -1);
    EXPECT_EQ(m_rows.rowOf(nullptr), -1);
}

TEST_F(EventRowsTest, HaveNoEventOutsideOfTheTable)
{
    add(10);
    m_rows.reload(m_list);
    EXPECT_EQ(m_rows.eventAt(-1), nullptr);
    EXPECT_EQ(m_rows.eventAt(1), nullptr);
}

TEST_F(EventRowsTest, DontTouchTheListWhenTheySort)
{
    const auto later = add(20);
    const auto earlier = add(10);
    m_rows.reload(m_list);
    m_rows.sort({EventColumn::Roll, true});
    EXPECT_EQ(m_list.events(), (Events{later, earlier}));
}

TEST_F(EventRowsTest, KeepTheirOrderThroughAReload)
{
    const auto a = add(10, "A");
    const auto b = add(20, "B");
    m_rows.reload(m_list);
    m_rows.sort({EventColumn::Roll, true});
    const auto c = add(5, "C");
    m_rows.reload(m_list);
    EXPECT_EQ(shown(), (Events{c, b, a}));
}

TEST_F(EventRowsTest, SayWhenTheyAreSortedSoAlready)
{
    add(10);
    m_rows.reload(m_list);
    EXPECT_FALSE(m_rows.sort({EventColumn::DstIn, false}));
    EXPECT_TRUE(m_rows.sort({EventColumn::DstIn, true}));
    EXPECT_FALSE(m_rows.sort({EventColumn::DstIn, true}));
    EXPECT_TRUE(m_rows.sort({EventColumn::SrcIn, true}));
}

TEST_F(EventRowsTest, KeepTheSelectedEventsThroughASort)
{
    add(10, "D");
    const auto c = add(20, "C");
    const auto b = add(30, "B");
    const auto a = add(40, "A");
    m_rows.reload(m_list);
    m_rows.select(rowsOf({1, 2, 3}));

    m_rows.sort({EventColumn::Roll, false});

    EXPECT_EQ(m_rows.selection(), rowsOf({0, 1, 2}));
    EXPECT_EQ(m_rows.selectedEvents(), (Events{a, b, c}));
}

TEST_F(EventRowsTest, KeepWhatIsStillThereThroughAReload)
{
    const auto first = add(10);
    const auto second = add(20);
    const auto third = add(30);
    m_rows.reload(m_list);
    m_rows.select(rowsOf({1, 2}));

    m_list.erase(1, 1);
    const auto early = add(5);
    m_rows.reload(m_list);

    EXPECT_EQ(shown(), (Events{early, first, third}));
    EXPECT_EQ(m_rows.selectedEvents(), (Events{third}));
    EXPECT_EQ(m_rows.selection(), rowsOf({2}));
}

TEST_F(EventRowsTest, SelectNoRowThatIsNotThere)
{
    add(10);
    add(20);
    m_rows.reload(m_list);
    RowSet rows;
    rows.append(-3, 1);
    rows.append(1, 99);
    rows.append(100, 101);
    m_rows.select(rows);
    EXPECT_EQ(m_rows.selection(), rowsOf({0, 1}));
}

TEST_F(EventRowsTest, SkipEventsThatHaveExpired)
{
    add(10);
    add(20);
    const auto last = add(30);
    m_rows.reload(m_list);
    m_rows.select(rowsOf({0, 1, 2}));

    m_list.erase(0, 2);

    EXPECT_EQ(m_rows.count(), 3);
    EXPECT_EQ(m_rows.eventAt(0), nullptr);
    EXPECT_EQ(m_rows.rowOf(last), 2);
    EXPECT_EQ(m_rows.selectedEvents(), (Events{last}));
    std::size_t before = 1;
    std::size_t after = 1;
    EXPECT_EQ(m_rows.withNeighbours({last}, before, after), (Events{last}));
    EXPECT_EQ(before, 0U);
    EXPECT_TRUE(m_rows.sort({EventColumn::Roll, false}));
    EXPECT_EQ(m_rows.selectedEvents(), (Events{last}));
    // An expired event is lower than any other.
    EXPECT_EQ(m_rows.selection(), rowsOf({2}));
}

TEST_F(EventRowsTest, SelectBothRowsOfAnEventThatIsThereTwice)
{
    const auto event = add(10);
    add(20);
    m_list.add(event);
    m_rows.reload(m_list);
    ASSERT_EQ(shown(), (Events{event, event, m_list.eventAt(1)}));
    m_rows.select(rowsOf({0}));
    m_rows.sort({EventColumn::DstIn, true});
    EXPECT_EQ(m_rows.selection(), rowsOf({1, 2}));
}

TEST_F(EventRowsTest, GiveTheNeighboursInTheProgramme)
{
    const auto a = add(10);
    const auto b = add(20);
    const auto c = add(30);
    const auto d = add(40);
    m_rows.reload(m_list);
    // The order of the table makes no difference.
    m_rows.sort({EventColumn::DstIn, true});

    std::size_t before = 1;
    std::size_t after = 1;
    EXPECT_EQ(m_rows.withNeighbours({b}, before, after), (Events{a, b, c}));
    EXPECT_EQ(before, 1U);
    EXPECT_EQ(after, 1U);
    EXPECT_EQ(m_rows.withNeighbours({d, b}, before, after), (Events{a, b, c, d}));
    EXPECT_EQ(before, 1U);
    EXPECT_EQ(after, 0U);
}

TEST_F(EventRowsTest, LowerTheNeighboursWhereTheProgrammeEnds)
{
    const auto a = add(10);
    const auto b = add(20);
    m_rows.reload(m_list);

    std::size_t before = 1;
    std::size_t after = 1;
    EXPECT_EQ(m_rows.withNeighbours({a}, before, after), (Events{a, b}));
    EXPECT_EQ(before, 0U);
    EXPECT_EQ(after, 1U);

    before = static_cast<std::size_t>(-1);
    after = static_cast<std::size_t>(-1);
    EXPECT_EQ(m_rows.withNeighbours({b}, before, after), (Events{a, b}));
    EXPECT_EQ(before, 1U);
    EXPECT_EQ(after, 0U);
}

TEST_F(EventRowsTest, TakeNoNeighboursWhereNoneAreWanted)
{
    add(10);
    const auto b = add(20);
    add(30);
    m_rows.reload(m_list);
    std::size_t before = 0;
    std::size_t after = 0;
    EXPECT_EQ(m_rows.withNeighbours({b}, before, after), (Events{b}));
}

TEST_F(EventRowsTest, TakeOnlyValidEventsAsNeighbours)
{
    const auto a = add(10);
    const auto flawed = add(20);
    const auto c = add(30);
    flawed->addFlaw(EventFlaw::NotVideoEvent);
    m_rows.reload(m_list);

    std::size_t before = 1;
    std::size_t after = 1;
    EXPECT_EQ(m_rows.withNeighbours({c}, before, after), (Events{a, c}));
    before = 1;
    after = 1;
    EXPECT_TRUE(m_rows.withNeighbours({flawed}, before, after).empty());
    EXPECT_EQ(before, 1U);
    EXPECT_EQ(after, 1U);
    EXPECT_TRUE(m_rows.withNeighbours({}, before, after).empty());
    EXPECT_TRUE(m_rows.withNeighbours({nullptr}, before, after).empty());
}

TEST_F(EventRowsTest, HighlightTheEventsThatTheyAreGiven)
{
    const auto a = add(10);
    const auto b = add(20);
    m_rows.setHighlight({b, nullptr});
    EXPECT_FALSE(m_rows.isHighlighted(a));
    EXPECT_TRUE(m_rows.isHighlighted(b));
    EXPECT_FALSE(m_rows.isHighlighted(nullptr));
    m_rows.setHighlight({});
    EXPECT_FALSE(m_rows.isHighlighted(b));
}

TEST_F(EventRowsTest, MakeAListOfTheChangeTypeForTheEngine)
{
    const Events events = {add(10), add(20)};
    EXPECT_EQ(EventRows::listOf(events).events(), events);
    EXPECT_EQ(EventRows::listOf(events).listKind(), 2);
}

namespace {

cadrel::gui::SortKey randomKey()
{
    return {*rc::gen::inRange(1, 11), *rc::gen::arbitrary<bool>()};
}

RowSet randomSelection(int count)
{
    RowSet rows;
    for (int row = 0; row < count; ++row) {
        if (*rc::gen::arbitrary<bool>())
            rows.append(row);
    }
    return rows;
}

} // namespace

RC_GTEST_FIXTURE_PROP(EventRowsTest, TheSelectionIsKeptThroughAnySortReloadAndRemoval, ())
{
    const int count = *rc::gen::inRange(0, 20);
    for (int index = 0; index < count; ++index)
        add(*rc::gen::inRange(0, 5), *rc::gen::element<std::string>("A", "B"));
    m_rows.reload(m_list);
    m_rows.select(randomSelection(count));
    const Events before = m_rows.selectedEvents();
    std::set<std::shared_ptr<EventBase>> expected(before.begin(), before.end());

    for (int step = *rc::gen::inRange(1, 6); step > 0; --step) {
        switch (*rc::gen::inRange(0, 3)) {
        case 0:
            m_rows.sort(randomKey());
            break;
        case 1:
            add(*rc::gen::inRange(0, 5));
            m_rows.reload(m_list);
            break;
        default:
            if (!m_list.isEmpty()) {
                const auto position = *rc::gen::inRange<std::size_t>(0, m_list.size());
                expected.erase(m_list.eventAt(position));
                m_list.erase(position, 1);
                m_rows.reload(m_list);
            }
        }
        const Events selected = m_rows.selectedEvents();
        RC_ASSERT(std::set(selected.begin(), selected.end()) == expected);
        RC_ASSERT(m_rows.selection().count() == expected.size());
        RC_ASSERT(m_rows.count() == static_cast<int>(m_list.size()));
    }
}

RC_GTEST_FIXTURE_PROP(EventRowsTest, NeighboursAreTheProgrammeAroundTheSelection, ())
{
    const int count = *rc::gen::inRange(1, 15);
    for (int index = 0; index < count; ++index) {
        const auto event = add(*rc::gen::inRange(0, 60));
        if (*rc::gen::inRange(0, 5) == 0)
            event->addFlaw(EventFlaw::NotVideoEvent);
    }
    m_rows.reload(m_list);
    Events programme;
    for (const auto& event : shown()) {
        if (event->isValid())
            programme.push_back(event);
    }
    m_rows.select(randomSelection(count));
    const Events selected = m_rows.selectedEvents();
    m_rows.sort(randomKey());
    const auto wantedBefore = *rc::gen::inRange<std::size_t>(0, 4);
    const auto wantedAfter = *rc::gen::inRange<std::size_t>(0, 4);

    std::size_t before = wantedBefore;
    std::size_t after = wantedAfter;
    const Events shownEvents = m_rows.withNeighbours(selected, before, after);

    RC_ASSERT(before <= wantedBefore);
    RC_ASSERT(after <= wantedAfter);
    std::size_t validSelected = 0;
    for (const auto& event : selected)
        validSelected += event->isValid() ? 1 : 0;
    RC_ASSERT(shownEvents.empty() == (validSelected == 0));
    if (shownEvents.empty())
        return;
    // A stretch of the programme, whose first and last events without the neighbours are selected ones.
    const auto place = std::search(programme.begin(), programme.end(), shownEvents.begin(), shownEvents.end());
    RC_ASSERT(place != programme.end());
    const auto isSelected = [&](const auto& event) {
        return std::find(selected.begin(), selected.end(), event) != selected.end();
    };
    RC_ASSERT(isSelected(shownEvents[before]));
    RC_ASSERT(isSelected(shownEvents[shownEvents.size() - 1 - after]));
    RC_ASSERT(static_cast<std::size_t>(std::count_if(shownEvents.begin(), shownEvents.end(), isSelected)) ==
              validSelected);
    // None is missing but where the programme ends.
    RC_ASSERT(before == wantedBefore || place == programme.begin());
    RC_ASSERT(after == wantedAfter || place + static_cast<std::ptrdiff_t>(shownEvents.size()) == programme.end());
    RC_ASSERT(std::none_of(shownEvents.begin(), shownEvents.begin() + static_cast<std::ptrdiff_t>(before), isSelected));
}
