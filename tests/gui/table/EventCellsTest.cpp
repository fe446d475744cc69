// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventCells.h"

#include "core/edl/EventBase.h"
#include "gui/table/EventColumn.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <optional>

using cadrel::core::EventBase;
using cadrel::core::EventFlaw;
using cadrel::core::TransitionType;
using cadrel::gui::EventCells;
using cadrel::gui::EventColumn;
using cadrel::tests::makeEvent;

namespace {

class EventCellsTest : public testing::Test {
protected:
    cadrel::tests::TestProject m_project;
    std::shared_ptr<EventBase> m_event =
        makeEvent("A001", "10:00:00:00", "10:00:04:12", "01:00:00:00", "01:00:04:12", 7);
};

} // namespace

TEST_F(EventCellsTest, ShowTheFieldsOfTheEvent)
{
    m_event->setClipName("42A-3 Maren");
    m_event->setEdlFileName("reel3_v07.edl");

    EXPECT_EQ(EventCells::text(*m_event, EventColumn::State), L"");
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::Number), L"7");
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::Roll), L"A001");
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::ClipName), L"42A-3 Maren");
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::EdlFile), L"reel3_v07.edl");
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::Transition), L"C");
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::SrcIn), L"10:00:00:00");
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::SrcOut), L"10:00:04:12");
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::DstIn), L"01:00:00:00");
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::DstOut), L"01:00:04:12");
    EXPECT_EQ(EventCells::text(*m_event, 11), L"");
    EXPECT_EQ(EventCells::text(*m_event, 0), L"");
}

TEST_F(EventCellsTest, NameTheTransitionByALetterAndAnyOtherACut)
{
    m_event->setTransitionType(TransitionType::Dissolve);
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::Transition), L"D");
    m_event->setTransitionType(TransitionType::Wipe);
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::Transition), L"W");
    m_event->setTransitionType(3);
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::Transition), L"C");
    m_event->setTransitionType(-1);
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::Transition), L"C");
}

TEST_F(EventCellsTest, ShowTheGreatestEventNumber)
{
    m_event->setEventNumber(4294967295U);
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::Number), L"4294967295");
}

TEST_F(EventCellsTest, ShowReplacementsInNamesThatAreNoUtf8)
{
    m_event->setClipName("K\xfcste");
    EXPECT_EQ(EventCells::text(*m_event, EventColumn::ClipName), L"K\ufffdste");
    EXPECT_EQ(EventCells::tooltip(*m_event, EventColumn::ClipName), L"K\ufffdste");
}

TEST_F(EventCellsTest, HaveTooltipsForNamesAndState)
{
    m_event->setClipName("42A-3 Maren");
    m_event->setEdlFileName("reel3_v07.edl");
    m_event->addFlaw(EventFlaw::NotVideoEvent);

    EXPECT_EQ(EventCells::tooltip(*m_event, EventColumn::Roll), L"A001");
    EXPECT_EQ(EventCells::tooltip(*m_event, EventColumn::ClipName), L"42A-3 Maren");
    EXPECT_EQ(EventCells::tooltip(*m_event, EventColumn::EdlFile), L"reel3_v07.edl");
    EXPECT_EQ(EventCells::tooltip(*m_event, EventColumn::State), L"Not a video event.");
    for (const int column : {0, 2, 6, 7, 8, 9, 10, 11})
        EXPECT_EQ(EventCells::tooltip(*m_event, column), L"") << column;
}

TEST_F(EventCellsTest, TellEachFlawInALineOfTheTooltipWithoutBlanksAround)
{
    EventBase event;
    event.addFlaw(EventFlaw::NotVideoEvent);
    // The text of the flaws has an empty line after flaw 0.
    EXPECT_EQ(EventCells::tooltip(event, EventColumn::State),
              L"Detected uninitialized timecode.\n\nNot a video event.");
}

TEST_F(EventCellsTest, TellNothingOfAValidEvent)
{
    EXPECT_EQ(EventCells::tooltip(*m_event, EventColumn::State), L"");
}

TEST_F(EventCellsTest, TellNothingOfAFlawThatHasNoText)
{
    m_event->addFlaw(31);
    EXPECT_EQ(EventCells::tooltip(*m_event, EventColumn::State), L"");
    EXPECT_EQ(EventCells::spokenText(*m_event, EventColumn::State, false), L"Invalid");
}

TEST_F(EventCellsTest, SayTheStateInWords)
{
    EXPECT_EQ(EventCells::spokenText(*m_event, EventColumn::State, false), L"Valid");
    m_event->setVfx(true);
    EXPECT_EQ(EventCells::spokenText(*m_event, EventColumn::State, false), L"Valid, VFX shot");
    EXPECT_EQ(EventCells::spokenText(*m_event, EventColumn::State, true),
              L"Valid, VFX shot, Related to the selected change");
    EventBase flawed;
    flawed.addFlaw(EventFlaw::NotVideoEvent);
    EXPECT_EQ(EventCells::spokenText(flawed, EventColumn::State, false),
              L"Invalid, Detected uninitialized timecode., Not a video event.");
    EXPECT_EQ(EventCells::spokenText(*m_event, EventColumn::Roll, true), L"A001");
}

TEST_F(EventCellsTest, SayARowWithoutItsEmptyCells)
{
    EXPECT_EQ(EventCells::spokenRow(*m_event, false),
              L"Valid, 7, A001, C, 10:00:00:00, 10:00:04:12, 01:00:00:00, 01:00:04:12");
}

TEST_F(EventCellsTest, NeverThrow)
{
    EventBase event;
    event.addFlaw(EventFlaw::NotVideoEvent);
    event.setRollName(std::string("\0\xff\n", 3));
    event.setTimecodes({-1, 99, 1000, -1}, {2147483647, 0, 0, 0}, {}, {});
    // Nothing translates, and nothing converts.
    const cadrel::tests::NoProject none;

    for (int column = -1; column <= 12; ++column) {
        EXPECT_NO_THROW(EventCells::text(event, column));
        EXPECT_NO_THROW(EventCells::tooltip(event, column));
        EXPECT_NO_THROW(EventCells::spokenText(event, column, true));
    }
    EXPECT_NO_THROW(EventCells::spokenRow(event, false));
    EXPECT_EQ(EventCells::text(event, EventColumn::Roll), L"\ufffd\ufffd\ufffd");
}
