// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/ProgrammePlace.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

namespace cadrel::tests {
namespace {

using core::EventBase;
using core::EventFlaw;
using core::fillsProgramme;
using core::hasPlace;

class ProgrammePlaceTest : public testing::Test {
protected:
    static std::shared_ptr<EventBase> eventAt(const char* dstIn, const char* dstOut)
    {
        return makeEvent("A", "00:00:00:00", "00:00:01:00", dstIn, dstOut);
    }
    static std::shared_ptr<EventBase> eventWith(EventFlaw::Type flaw)
    {
        const auto event = eventAt("01:00:00:00", "01:00:01:00");
        event->addFlaw(flaw);
        return event;
    }
    bool isPlaced(const std::shared_ptr<EventBase>& event) const { return hasPlace(*event, m_project.framerate); }
    bool fills(const std::shared_ptr<EventBase>& event) const { return fillsProgramme(*event, m_project.framerate); }

    TestProject m_project;
};

} // namespace

TEST_F(ProgrammePlaceTest, AnEventWithADestinationHasAPlaceAndFillsItUnlessItIsEmpty)
{
    EXPECT_TRUE(isPlaced(eventAt("01:00:00:00", "01:00:00:01")));
    EXPECT_TRUE(fills(eventAt("01:00:00:00", "01:00:00:01")));
    EXPECT_TRUE(isPlaced(eventAt("01:00:00:00", "01:00:00:00")));
    EXPECT_FALSE(fills(eventAt("01:00:00:00", "01:00:00:00")));
    EXPECT_FALSE(isPlaced(eventAt("01:00:00:01", "01:00:00:00")));
    EXPECT_FALSE(fills(eventAt("01:00:00:01", "01:00:00:00")));
}

TEST_F(ProgrammePlaceTest, WhatIsWrongElsewhereTakesNoPlaceAway)
{
    EXPECT_TRUE(fills(eventWith(EventFlaw::SrcInUnreadable)));
    EXPECT_TRUE(fills(eventWith(EventFlaw::RollNameInvalid)));
    EXPECT_FALSE(isPlaced(eventWith(EventFlaw::DstInUnreadable)));
    EXPECT_FALSE(isPlaced(eventWith(EventFlaw::DstOutUnreadable)));
    EXPECT_FALSE(fills(eventWith(EventFlaw::DstOutUnreadable)));
}

TEST_F(ProgrammePlaceTest, SoundHasAPlaceButFillsNoPicture)
{
    EXPECT_TRUE(isPlaced(eventWith(EventFlaw::NotVideoEvent)));
    EXPECT_FALSE(fills(eventWith(EventFlaw::NotVideoEvent)));
}

TEST_F(ProgrammePlaceTest, ADestinationThatWasNeverSetFillsNothing)
{
    EXPECT_FALSE(fills(std::make_shared<EventBase>()));
}

TEST_F(ProgrammePlaceTest, BlackIsTheRollOfThatNameInAnyLetters)
{
    for (const char* roll : {"BL", "bl", "BLACK", "Black"})
        EXPECT_TRUE(isBlack(*makeEvent(roll, "00:00:00:00", "00:00:01:00", "01:00:00:00", "01:00:01:00"))) << roll;
    for (const char* roll : {"", "B", "BLA", "BLACK1", "AX"})
        EXPECT_FALSE(isBlack(*makeEvent(roll, "00:00:00:00", "00:00:01:00", "01:00:00:00", "01:00:01:00"))) << roll;
}

TEST_F(ProgrammePlaceTest, TheTwoLinesOfATransitionShareTheirNumber)
{
    core::EventList events;
    for (const std::uint32_t number : {1U, 2U, 2U})
        events.add(makeEvent("A", "00:00:00:00", "00:00:01:00", "01:00:00:00", "01:00:01:00", number));

    EXPECT_EQ(outgoingOf(events, 0), nullptr);
    EXPECT_EQ(outgoingOf(events, 1), nullptr);
    EXPECT_EQ(outgoingOf(events, 2), &events.at(1));
}

} // namespace cadrel::tests
