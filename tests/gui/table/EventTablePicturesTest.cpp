// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventColumn.h"
#include "tests/gui/table/ShownTable.h"
#include "tests/support/window/MessagePump.h"
#include "tests/support/window/Pictures.h"

#include <gtest/gtest.h>

using cadrel::core::EventFlaw;
using cadrel::core::TransitionType;
using cadrel::gui::EventColumn;
using cadrel::gui::RowSet;
using cadrel::tests::expectPicture;
using cadrel::tests::pumpMessages;

namespace {

/// Ten events of a reel, on the table of the change list at 1300 pixels of window.
class EventTablePicturesTest : public cadrel::tests::ShownTable {
protected:
    void SetUp() override
    {
        const char* const clips[] = {"42A-1 Pier, wide",  "42A-3 Maren",      "43-2 Boat",  "43-5 Oars",
                                     "44-1 Reeds",        "44-2 Reeds, slow", "45-1 Gulls", "45-7 Gulls, high",
                                     "46-1 Maren, close", "46-3 Hands"};
        std::size_t index = 0;
        for (const char* const clip : clips) {
            const auto event = add(index % 2 == 0 ? "A017C004" : "B021C011");
            event->setClipName(clip);
            event->setEdlFileName("reel3_v12.edl");
            event->setTransitionType(index == 4 ? TransitionType::Dissolve : TransitionType::Cut);
            ++index;
        }
        m_table.setBounds(0, 0, 1056, 200);
    }

    void expectTable(const std::string& name)
    {
        pumpMessages();
        // What a component finds out of its width comes with the messages.
        EXPECT_FALSE(m_table.getHorizontalScrollBar().isVisible());
        expectPicture(m_table, name);
    }
};

} // namespace

TEST_F(EventTablePicturesTest, Loaded)
{
    show();
    expectTable("table-loaded");
}

TEST_F(EventTablePicturesTest, Empty)
{
    list().clear();
    show();
    expectTable("table-empty");
}

TEST_F(EventTablePicturesTest, Selected)
{
    show();
    list().at(2).setVfx(true);
    list().at(6).addFlaw(EventFlaw::NotVideoEvent);
    m_model->reload(list());
    m_model->selectRows(RowSet::parse("1;2;3;6", 10));
    expectTable("table-selected");
}

TEST_F(EventTablePicturesTest, Highlighted)
{
    show();
    m_model->selectRows(RowSet::parse("3", 10));
    m_model->setHighlight({list().eventAt(2), list().eventAt(3), list().eventAt(4)});
    expectTable("table-highlighted");
}

TEST_F(EventTablePicturesTest, Flawed)
{
    list().at(1).addFlaw(EventFlaw::NotVideoEvent);
    list().at(4).setDst({1, 0, 20, 99}, {1, 0, 25, 0});
    list().at(5).addFlaw(EventFlaw::RollNameInvalid);
    show();
    expectTable("table-flawed");
}

TEST_F(EventTablePicturesTest, Vfx)
{
    list().at(1).setVfx(true);
    list().at(2).setVfx(true);
    list().at(2).addFlaw(EventFlaw::NotVideoEvent);
    list().at(5).setVfx(true);
    show();
    m_model->setHighlight({list().eventAt(5)});
    expectTable("table-vfx");
}

TEST_F(EventTablePicturesTest, LongNames)
{
    list().at(0).setClipName(
        "The clip name of a shot that somebody has described at length, with the lens and the weather");
    list().at(1).setEdlFileName("the_name_of_the_list_with_the_date_and_all_of_the_initials_v12_final_final.edl");
    list().at(2).setRollName("A017C004_20261122_A_ROLL_WITH_A_LONG_NAME");
    list().at(3).setClipName("K\xfcste, two\nlines");
    list().at(4).setClipName("");
    list().at(5).setClipName("Küste – Möwen über der Brücke");
    list().at(6).setEventNumber(99999);
    show();
    // That of the old and the new list.
    m_table.setBounds(0, 0, 614, 200);
    expectTable("table-long-names");
}

TEST_F(EventTablePicturesTest, Sorted)
{
    show();
    m_model->selectRows(RowSet::parse("0;1", 10));
    m_model->applySort(EventColumn::Roll, true);
    expectTable("table-sorted");
}
