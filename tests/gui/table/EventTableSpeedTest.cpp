// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventColumn.h"
#include "gui/table/StoredTable.h"
#include "gui/timeline/EventTimeLineView.h"
#include "tests/gui/table/ShownTable.h"
#include "tests/support/BestSeconds.h"
#include "tests/support/Sanitizer.h"

#include <gtest/gtest.h>

#include <iostream>

using cadrel::core::EventBase;
using cadrel::core::Timecode;
using cadrel::gui::EventColumn;
using cadrel::gui::RowSet;
using cadrel::tests::bestSecondsOf;

namespace {

constexpr int EventCount = 100000;
constexpr double Limit = CADREL_ADDRESS_SANITIZER ? 2.0 : 0.1; ///< in seconds

/// A list that no one has by hand: 100,000 events of a few frames.
class EventTableSpeedTest : public cadrel::tests::ShownTable {
protected:
    void SetUp() override
    {
        Events events;
        events.reserve(EventCount);
        for (int index = 0; index < EventCount; ++index) {
            auto event = std::make_shared<EventBase>();
            event->setRollName(index % 2 == 0 ? "A017C004_261122_R1AB" : "B021C011_261122_R1AB");
            event->setClipName("42A-" + std::to_string(index % 977));
            const int at = index * 20;
            event->setTimecodes(Timecode(at), Timecode(at + 20), Timecode(at), Timecode(at + 20));
            event->setEventNumber(static_cast<std::uint32_t>(index + 1));
            events.push_back(std::move(event));
        }
        list().append(events);
        show();
        m_reloads = false;
    }

    static void expectFast(const char* step, const std::function<void()>& action)
    {
        const double best = bestSecondsOf(5, Limit, action);
        std::cout << step << ": " << best * 1000.0 << " ms\n";
        EXPECT_LT(best, Limit) << step;
    }

    void paintTable() { m_table.createComponentSnapshot(m_table.getLocalBounds(), true, 1.0F); }
};

} // namespace

TEST_F(EventTableSpeedTest, EachStepOfAHundredThousandRowsIsDoneInATenthOfASecond)
{
    RowSet alternating;
    for (int row = 0; row < EventCount; row += 2)
        alternating.append(row);

    expectFast("reload", [this] { m_model->reload(list()); });
    expectFast("paint", [this] { paintTable(); });
    bool forwards = false;
    for (const EventColumn& column : EventColumn::all()) {
        expectFast(("sort by column " + std::to_string(column.id)).c_str(), [&] {
            forwards = !forwards;
            m_model->applySort(column.id, forwards);
        });
    }
    expectFast("select every other row", [&] { m_model->selectRows(alternating); });
    expectFast("reload with every other row selected", [this] { m_model->reload(list()); });
    expectFast("sort with every other row selected", [&] {
        forwards = !forwards;
        m_model->applySort(EventColumn::ClipName, forwards);
    });
    expectFast("select one more", [&] { m_table.flipRowSelection(50001); });
    expectFast("paint with every other row selected", [this] { paintTable(); });
    expectFast("select all", [&] {
        m_table.deselectAllRows();
        m_model->selectAll();
    });
    expectFast("selected events", [&] { EXPECT_EQ(m_model->getSelectedEvents().size(), 100000U); });
    expectFast("highlight", [&] { m_model->setHighlight(list().events()); });
    expectFast("paint with a highlight", [this] { paintTable(); });
    int row = 0;
    expectFast("scroll", [&] {
        row += 15000;
        m_table.scrollToEnsureRowIsOnscreen(row);
        paintTable();
    });
    m_dataModel.oldEdl().append(list());
    m_dataModel.newEdl().append(list());
    expectFast("related old events of one",
               [&] { EXPECT_EQ(m_dataModel.oldEventsBehind({list().eventAt(5000)}).size(), 1U); });
    expectFast("related new events of one",
               [&] { EXPECT_EQ(m_dataModel.newEventsBehind({list().eventAt(5000)}).size(), 1U); });
    expectFast("related old events of all",
               [&] { EXPECT_EQ(m_dataModel.oldEventsBehind(list().events()).size(), 100000U); });
    expectFast("related new events of all",
               [&] { EXPECT_EQ(m_dataModel.newEventsBehind(list().events()).size(), 100000U); });
    expectFast("open the menu of one", [&] {
        m_model->selectRows(RowSet::parse("5000", EventCount));
        m_model->openMenu();
    });
    expectFast("open the menu of all", [&] {
        m_model->selectAll();
        m_model->openMenu();
    });
    m_choose = nullptr;
    expectFast("store the selection",
               [&] { cadrel::gui::StoredTable(m_dataModel, 2).setSelection(m_model->getSelectedRows()); });
    expectFast("restore the selection",
               [&] { m_model->selectRows(cadrel::gui::StoredTable(m_dataModel, 2).selection(EventCount)); });
    expectFast("neighbours", [&] {
        std::size_t before = 1;
        std::size_t after = 1;
        EXPECT_EQ(m_model->getSelectionWithNeighbours({list().eventAt(5000)}, before, after).size(), 3U);
    });
}

TEST_F(EventTableSpeedTest, EveryOtherOfAHundredThousandRowsIsDeletedInATenthOfASecond)
{
    const Events events = list().events();
    RowSet alternating;
    for (int row = 0; row < EventCount; row += 2)
        alternating.append(row);
    const auto prepare = [&] {
        list().clear();
        list().append(events);
        m_model->reload(list());
        m_model->selectRows(alternating);
    };
    const double best = bestSecondsOf(
        3, Limit, [&] { m_model->deleteKeyPressed(EventCount - 2); }, prepare);
    std::cout << "delete every other row: " << best * 1000.0 << " ms\n";
    EXPECT_LT(best, Limit);
    EXPECT_EQ(list().size(), static_cast<std::size_t>(EventCount / 2));
}

TEST_F(EventTableSpeedTest, TheTimelineOfAHundredThousandEventsIsDrawnInATenthOfASecond)
{
    cadrel::gui::EventTimeLineView view;
    view.setBounds(0, 0, 1056, 80);
    const auto paint = [&] { view.createComponentSnapshot(view.getLocalBounds(), true, 1.0F); };
    expectFast("events", [&] { view.setEvents(list()); });
    expectFast("highlight and paint", [&] {
        view.highlightEvents(list().events());
        paint();
    });
    expectFast("paint", paint);
}
