// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/ProgrammeOrder.h"

#include "core/edl/CutMap.h"
#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

namespace cadrel::tests {
namespace {

using core::EventBase;
using core::EventFlaw;
using core::Timecode;
using util::Result;

using Events = std::vector<std::shared_ptr<EventBase>>;

std::shared_ptr<EventBase> startingAt(const char* dstIn)
{
    return makeEvent("A", "00:00:00:00", "00:00:01:00", dstIn, "23:00:00:00");
}

Events orderOf(const Events& events)
{
    Events ordered;
    for (const core::PlacedEvent& placed : core::inProgrammeOrder(events, Timecode::framerate()))
        ordered.push_back(events[placed.index]);
    return ordered;
}

} // namespace

TEST(ProgrammeOrder, EventsAreInTheOrderOfTheirDestinations)
{
    const TestProject project;
    const auto first = startingAt("01:00:00:00");
    const auto second = startingAt("01:00:00:01");
    const auto third = startingAt("02:00:00:00");

    EXPECT_EQ(orderOf({third, first, second}), (Events{first, second, third}));
    EXPECT_EQ(orderOf({}), Events{});
}

TEST(ProgrammeOrder, EventsOfEqualStartStayInTheirOrder)
{
    const TestProject project;
    const auto late = startingAt("02:00:00:00");
    const auto one = startingAt("01:00:00:00");
    const auto other = startingAt("01:00:00:00");

    EXPECT_EQ(orderOf({late, one, other, one}), (Events{one, other, one, late}));
}

TEST(ProgrammeOrder, TimecodesAreCountedInFrames)
{
    const TestProject project;

    const auto placed = core::inProgrammeOrder(
        {makeEvent("A", "00:00:00:01", "00:00:01:00", "00:00:02:02", "00:01:00:00")}, core::Framerate(25, 0));

    ASSERT_EQ(placed.size(), 1U);
    EXPECT_EQ(placed[0].index, 0U);
    EXPECT_EQ(placed[0].srcIn, 1);
    EXPECT_EQ(placed[0].srcOut, 25);
    EXPECT_EQ(placed[0].dstIn, 52);
    EXPECT_EQ(placed[0].dstOut, 1500);
}

TEST(ProgrammeOrder, OnlyEventsWithInvalidTimecodesAreLeftOut)
{
    const TestProject project;
    const auto flawed = startingAt("01:00:00:00");
    flawed->addFlaw(EventFlaw::RollNameInvalid);
    const auto untimed = startingAt("00:00:00:30");

    EXPECT_EQ(orderOf({untimed, flawed}), Events{flawed});
}

TEST(ProgrammeOrder, ARateThatOneOfTheFourTimecodesDoesNotFitFails)
{
    TestProject project(core::Framerate(30, 0));
    const char* const fits = "00:00:00:00";
    const char* const late = "00:00:01:27";
    const Events events = {makeEvent("A", late, fits, fits, fits), makeEvent("A", fits, late, fits, fits),
                           makeEvent("A", fits, fits, late, fits), makeEvent("A", fits, fits, fits, late)};
    project.framerate = core::Framerate(25, 0);

    for (const auto& event : events)
        EXPECT_EQ(thrownBy([&] { orderOf({event}); }), Result::FrameOutOfRate);
}

RC_GTEST_PROP(ProgrammeOrder, IsThatOfACutMap, ())
{
    const TestProject project;
    core::EventList list;
    for (const int frame : *rc::gen::container<std::vector<int>>(rc::gen::inRange(0, 20))) {
        const auto event = std::make_shared<EventBase>();
        event->setTimecodes(Timecode(0), Timecode(5), Timecode(frame), Timecode(frame + 5));
        list.add(event);
    }

    Events expected;
    const core::CutMap map(list, Timecode::framerate());
    for (const core::CutEntry& entry : map.dstInOrder())
        expected.push_back(entry.event.lock());
    RC_ASSERT(orderOf(list.events()) == expected);
}

} // namespace cadrel::tests
