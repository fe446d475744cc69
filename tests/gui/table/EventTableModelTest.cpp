// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventTableModel.h"

#include "gui/look/Text.h"
#include "gui/table/EventMenu.h"
#include "tests/gui/table/ShownTable.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/window/MessagePump.h"
#include "tests/support/window/RecordingAlerts.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <set>

using cadrel::core::EventBase;
using cadrel::core::EventFlaw;
using cadrel::gui::EventColumn;
using cadrel::gui::EventMenu;
using cadrel::gui::EventTableModel;
using cadrel::gui::RowSet;
using cadrel::tests::pumpMessages;

namespace {

class EventTableModelTest : public cadrel::tests::ShownTable {};

bool isSame(const juce::Image& image, const juce::Image& other)
{
    for (int y = 0; y < image.getHeight(); ++y) {
        for (int x = 0; x < image.getWidth(); ++x) {
            if (image.getPixelAt(x, y) != other.getPixelAt(x, y))
                return false;
        }
    }
    return true;
}

using Rows = std::vector<int>;

} // namespace

// Rows and order.

TEST_F(EventTableModelTest, ShowsTheListInTheOrderOfTheProgrammeAtFirst)
{
    add();
    add();
    EventTableModel& model = show();
    EXPECT_EQ(model.getNumRows(), 2);
    EXPECT_EQ(m_table.getNumRows(), 2);
    EXPECT_EQ(model.getSortColumn(), EventColumn::DstIn);
    EXPECT_FALSE(model.getSortForwards());
    // The header has its arrow.
    EXPECT_EQ(m_table.getHeader().getSortColumnId(), EventColumn::DstIn);
    EXPECT_FALSE(m_table.getHeader().isSortedForwards());
}

TEST_F(EventTableModelTest, SortsAtOnceAndShowsItInTheHeader)
{
    add("B");
    const auto a = add("A");
    EventTableModel& model = show();
    select({1});

    model.applySort(EventColumn::Roll, false);

    EXPECT_EQ(model.getSortColumn(), EventColumn::Roll);
    EXPECT_EQ(selectedRows(), (Rows{0}));
    EXPECT_EQ(model.getSelectedEvents(), (Events{a}));
    EXPECT_EQ(m_table.getHeader().getSortColumnId(), EventColumn::Roll);
    EXPECT_FALSE(m_table.getHeader().isSortedForwards());
    EXPECT_EQ(m_steps, (Steps{"sort"}));
    // The header calls back later, and tells nothing new.
    pumpMessages();
    EXPECT_EQ(m_steps, (Steps{"sort"}));
    EXPECT_EQ(selectedRows(), (Rows{0}));
}

TEST_F(EventTableModelTest, ReadsAColumnThatIsNoneAsTheEventNumbers)
{
    add();
    EventTableModel& model = show();
    model.applySort(99, true);
    EXPECT_EQ(model.getSortColumn(), EventColumn::Number);
    EXPECT_EQ(m_table.getHeader().getSortColumnId(), EventColumn::Number);
    model.sortOrderChanged(0, true);
    EXPECT_EQ(model.getSortColumn(), EventColumn::Number);
}

TEST_F(EventTableModelTest, PutsTheLargestValueAtTheTopAtTheFirstClickOnAHeader)
{
    add("A");
    const auto b = add("B");
    EventTableModel& model = show();
    pumpMessages();
    select({1});
    auto& header = m_table.getHeader();

    header.columnClicked(EventColumn::Roll, {});
    pumpMessages();
    EXPECT_TRUE(model.getSortForwards());
    EXPECT_EQ(selectedRows(), (Rows{0}));

    header.columnClicked(EventColumn::Roll, {});
    pumpMessages();
    EXPECT_FALSE(model.getSortForwards());
    EXPECT_EQ(selectedRows(), (Rows{1}));
    EXPECT_EQ(model.getSelectedEvents(), (Events{b}));
}

TEST_F(EventTableModelTest, KeepsThreeSelectedEventsThroughASortAndTellsOnlyOfTheSort)
{
    for (const char* const roll : {"C", "A", "B", "A", "C"})
        add(roll);
    EventTableModel& model = show();
    select({0, 2, 3});
    const Events before = model.getSelectedEvents();

    model.sortOrderChanged(EventColumn::Roll, false);

    const Events after = model.getSelectedEvents();
    EXPECT_EQ(std::set(after.begin(), after.end()), std::set(before.begin(), before.end()));
    EXPECT_EQ(selectedRows(), (Rows{1, 2, 3}));
    EXPECT_EQ(m_steps, (Steps{"sort"}));
}

TEST_F(EventTableModelTest, DoesNothingWhenItIsSortedSoAlready)
{
    add();
    EventTableModel& model = show();
    model.sortOrderChanged(EventColumn::DstIn, false);
    EXPECT_TRUE(m_steps.empty());
}

TEST_F(EventTableModelTest, LetsTheKeysGoOnFromTheSameEvent)
{
    for (const char* const roll : {"A", "C", "B", "D"})
        add(roll);
    EventTableModel& model = show();
    select({3, 1});
    model.applySort(EventColumn::Roll, false);
    EXPECT_EQ(m_table.getLastRowSelected(), 2);
    EXPECT_EQ(selectedRows(), (Rows{2, 3}));
}

TEST_F(EventTableModelTest, KeepsASelectedRowInView)
{
    for (int index = 0; index < 200; ++index)
        add();
    EventTableModel& model = show();
    select({150});
    m_table.scrollToEnsureRowIsOnscreen(150);
    ASSERT_TRUE(isInView(150));

    model.applySort(EventColumn::DstIn, true);
    EXPECT_EQ(selectedRows(), (Rows{49}));
    EXPECT_TRUE(isInView(49));

    // Not only the one that was selected last.
    m_table.selectRow(199, true, false);
    ASSERT_FALSE(isInView(199));
    model.applySort(EventColumn::DstIn, false);
    EXPECT_EQ(selectedRows(), (Rows{0, 150}));
    EXPECT_TRUE(isInView(150));
}

TEST_F(EventTableModelTest, KeepsASelectedRowInViewOfWhichAPartWasSeen)
{
    for (int index = 0; index < 200; ++index)
        add();
    EventTableModel& model = show();
    const int height = m_table.getRowHeight();
    // The last that was selected, and one that wasn't.
    for (const std::vector<int>& rows : {Rows{150}, Rows{150, 10}}) {
        model.applySort(EventColumn::DstIn, false);
        select(rows);
        m_table.getViewport()->setViewPosition(0, 151 * height - 1);
        model.applySort(EventColumn::DstIn, true);
        EXPECT_TRUE(isInView(49)) << rows.size();

        m_table.getViewport()->setViewPosition(0, 50 * height);
        model.applySort(EventColumn::DstIn, false);
        EXPECT_FALSE(isInView(150)) << rows.size();
    }
}

TEST_F(EventTableModelTest, DoesNotScrollToASelectedRowThatWasOutOfView)
{
    for (int index = 0; index < 200; ++index)
        add();
    EventTableModel& model = show();
    select({150});
    ASSERT_TRUE(isInView(0));
    model.reload(list());
    EXPECT_TRUE(isInView(0));
}

TEST_F(EventTableModelTest, KeepsTheSelectionThroughAReloadAndTellsNobody)
{
    for (int index = 0; index < 5; ++index)
        add();
    EventTableModel& model = show();
    select({1, 3, 4});

    list().erase(0, 2);

    EXPECT_EQ(model.getNumRows(), 3);
    EXPECT_EQ(selectedRows(), (Rows{1, 2}));
    list().clear();
    EXPECT_EQ(m_table.getNumRows(), 0);
    EXPECT_EQ(selectedRows(), (Rows{}));
    EXPECT_TRUE(m_steps.empty());
}

TEST_F(EventTableModelTest, SelectsRowsAndTellsNobody)
{
    for (int index = 0; index < 5; ++index)
        add();
    EventTableModel& model = show();
    model.selectRows(RowSet::parse("1;3;4;9", 99));
    EXPECT_EQ(selectedRows(), (Rows{1, 3, 4}));
    EXPECT_EQ(model.getNumSelectedRows(), 3);
    EXPECT_EQ(m_table.getLastRowSelected(), 1);
    EXPECT_TRUE(m_steps.empty());
}

TEST_F(EventTableModelTest, TellsOfASelection)
{
    for (int index = 0; index < 5; ++index)
        add();
    EventTableModel& model = show();
    m_table.selectRow(2);
    EXPECT_EQ(m_steps, (Steps{"selection"}));
    EXPECT_EQ(selectedRows(), (Rows{2}));
    model.selectAll();
    EXPECT_EQ(m_steps, (Steps{"selection", "selection"}));
    EXPECT_EQ(selectedRows(), (Rows{0, 1, 2, 3, 4}));
    // It is there already.
    model.selectAll();
    m_table.deselectAllRows();
    EXPECT_EQ(m_steps, (Steps{"selection", "selection", "selection"}));
    EXPECT_EQ(selectedRows(), (Rows{}));
}

TEST_F(EventTableModelTest, DoesNotScrollWhenAllIsSelected)
{
    for (int index = 0; index < 200; ++index)
        add();
    EventTableModel& model = show();
    select({0});
    model.selectAll();
    EXPECT_TRUE(isInView(0));
    EXPECT_EQ(selectedRows().size(), 200U);
}

TEST_F(EventTableModelTest, BeginsWithoutTheSelectionOfAnotherModel)
{
    add();
    add();
    show();
    select({1});
    show();
    EXPECT_EQ(selectedRows(), (Rows{}));
}

TEST_F(EventTableModelTest, LeavesTheTableWhenItGoes)
{
    add();
    show();
    m_model.reset();
    EXPECT_EQ(m_table.getModel(), nullptr);
    EXPECT_EQ(m_table.getNumRows(), 0);
}

TEST_F(EventTableModelTest, OutlivesItsTable)
{
    add();
    auto table = std::make_unique<cadrel::gui::EventTable>("short");
    EventTableModel model(*table, list(), m_dataModel);
    table.reset();

    add();
    model.reload(list());
    model.applySort(EventColumn::Roll, true);
    model.selectAll();
    model.selectRows(RowSet::parse("0", 1));
    model.setHighlight(list().events());
    model.openMenu();
    model.deleteKeyPressed(0);
    EXPECT_EQ(list().size(), 1U);
    EXPECT_EQ(model.getNumRows(), 1);
}

TEST_F(EventTableModelTest, SurvivesEventsThatHaveGone)
{
    add();
    add();
    EventTableModel& model = show();
    m_reloads = false;
    select({0, 1});
    list().clear();

    juce::Image image(juce::Image::ARGB, 100, 20, true);
    juce::Graphics graphics(image);
    for (int row = -1; row < 4; ++row) {
        model.paintRowBackground(graphics, row, 100, 20, true);
        const juce::Image background = image.createCopy();
        EXPECT_EQ(background.getPixelAt(1, 10), cadrel::gui::toColour(cadrel::gui::Palette::panel)) << row;
        EXPECT_EQ(background.getPixelAt(50, 10), cadrel::gui::toColour(cadrel::gui::Palette::selection)) << row;
        for (int column = 0; column < 12; ++column) {
            model.paintCell(graphics, row, column, 100, 20, false);
            EXPECT_TRUE(isSame(image, background)) << row << ", " << column;
            EXPECT_TRUE(model.getCellTooltip(row, column).isEmpty());
            EXPECT_TRUE(model.getSpokenCell(row, column).isEmpty());
        }
        EXPECT_TRUE(model.getSpokenRow(row).isEmpty());
    }
    EXPECT_TRUE(model.getSelectedEvents().empty());
    rightClick(0);
    EXPECT_TRUE(m_menuText.empty());
    model.returnKeyPressed(0);
    model.deleteKeyPressed(0);
    EXPECT_EQ(m_edits.steps, (Steps{"list of 0"}));
}

TEST_F(EventTableModelTest, HasTheTooltipsOfTheCells)
{
    const auto event = add();
    event->setClipName("42A-3 Maren");
    event->addFlaw(EventFlaw::NotVideoEvent);
    EventTableModel& model = show();
    EXPECT_EQ(model.getCellTooltip(0, EventColumn::State), "Not a video event.");
    EXPECT_EQ(model.getCellTooltip(0, EventColumn::ClipName), "42A-3 Maren");
    EXPECT_EQ(model.getCellTooltip(0, EventColumn::Roll), "A001");
    EXPECT_EQ(model.getCellTooltip(0, EventColumn::SrcIn), "");
}

TEST_F(EventTableModelTest, MakesNoComponentsForCells)
{
    add();
    EventTableModel& model = show();
    EXPECT_EQ(model.refreshComponentForCell(0, 1, false, nullptr), nullptr);
    EXPECT_EQ(model.refreshComponentForCell(0, 1, false, new juce::Component), nullptr);
}

// Listeners.

namespace {

class Caller : public EventTableModel::Listener {
public:
    Caller(std::string name, std::vector<std::string>& calls) : m_name(std::move(name)), m_calls(calls) {}

    void selectionChanged(EventTableModel&) override
    {
        m_calls.push_back(m_name);
        if (then)
            then();
    }
    void sortChanged(EventTableModel&) override {}
    void editRequested(const std::shared_ptr<EventBase>&, EventTableModel&, juce::Point<int>) override {}

    std::function<void()> then;

private:
    std::string m_name;
    std::vector<std::string>& m_calls;
};

} // namespace

TEST_F(EventTableModelTest, CallsItsListenersFromTheLastToTheFirstAndEachOnce)
{
    add();
    EventTableModel& model = show();
    std::vector<std::string> calls;
    Caller first("first", calls);
    Caller second("second", calls);
    model.addListener(nullptr);
    model.addListener(&first);
    model.addListener(&second);
    model.addListener(&first);

    m_table.selectRow(0);
    EXPECT_EQ(calls, (Steps{"second", "first"}));
    model.removeListener(&second);
    model.removeListener(&second);
    m_table.deselectAllRows();
    EXPECT_EQ(calls, (Steps{"second", "first", "first"}));
}

TEST_F(EventTableModelTest, LetsListenersLeaveWhileTheyAreCalled)
{
    add();
    EventTableModel& model = show();
    std::vector<std::string> calls;
    Caller first("first", calls);
    Caller second("second", calls);
    Caller third("third", calls);
    for (Caller* const caller : {&first, &second, &third})
        model.addListener(caller);
    third.then = [&] {
        model.removeListener(&third);
        model.removeListener(&second);
    };

    m_table.selectRow(0);
    EXPECT_EQ(calls, (Steps{"third", "first"}));
}

TEST_F(EventTableModelTest, CallsEachListenerOnceAlsoWhenOneRemovesAnEarlierOne)
{
    add();
    EventTableModel& model = show();
    std::vector<std::string> calls;
    Caller first("first", calls);
    Caller second("second", calls);
    Caller third("third", calls);
    Caller late("late", calls);
    for (Caller* const caller : {&first, &second, &third})
        model.addListener(caller);
    third.then = [&] {
        model.removeListener(&first);
        model.addListener(&late);
    };

    m_table.selectRow(0);
    EXPECT_EQ(calls, (Steps{"third", "second"}));
}

TEST_F(EventTableModelTest, MayGoWhileItTells)
{
    add();
    show();
    m_onSelection = [this] { m_model.reset(); };
    m_table.selectRow(0);
    EXPECT_EQ(m_model, nullptr);
    EXPECT_EQ(m_steps, (Steps{"selection"}));
}

TEST_F(EventTableModelTest, TellsTheUserOfAListenerThatFails)
{
    cadrel::tests::RecordingAlerts alerts;
    add();
    show();
    m_onSelection = [] { throw cadrel::util::Result::HostCallFailed; };
    m_table.selectRow(0);
    EXPECT_EQ(alerts.messages.size(), 1U);
    m_onSelection = [] { throw std::runtime_error("any"); };
    m_table.deselectAllRows();
    EXPECT_EQ(alerts.messages.size(), 2U);
}

// The menu.

TEST_F(EventTableModelTest, OpensNoMenuAtALeftClick)
{
    add();
    EventTableModel& model = show();
    select({0});
    model.cellClicked(0, 1, mouseAt(0, juce::ModifierKeys::leftButtonModifier));
    EXPECT_TRUE(m_menuText.empty());
}

TEST_F(EventTableModelTest, OpensItsMenuAtARightClick)
{
    add();
    add();
    show();
    rightClick(1);
    // The two events touch, and there is no gap to extend into.
    EXPECT_EQ(m_menuText, "Healing(1- 2- 3- 4- )|Extend Event(7- 8- 9- )|6 5 ");
    select({0, 1});
    rightClick(1);
    EXPECT_EQ(m_menuText, "Healing(1- 2 3 4 )|5 ");
    EXPECT_EQ(m_menuPosition, m_table.localPointToGlobal(m_table.getRowPosition(1, true).getCentre()));
}

TEST_F(EventTableModelTest, OpensItsMenuAtTheLastSelectedRowForTheKeyboard)
{
    for (int index = 0; index < 200; ++index)
        add();
    EventTableModel& model = show();
    model.openMenu();
    EXPECT_TRUE(m_menuText.empty());

    select({3, 180});
    model.openMenu();
    EXPECT_EQ(m_menuText, "Healing(1- 2- 3- 4- )|5 ");
    EXPECT_TRUE(isInView(180));
    EXPECT_EQ(m_menuPosition, m_table.localPointToGlobal(m_table.getRowPosition(180, true).getBottomLeft()));
}

TEST_F(EventTableModelTest, AsksForTheEditOfTheEventWhereTheMenuWasOpened)
{
    add();
    const auto second = add();
    show();
    rightClick(1);
    m_steps.clear();
    m_choose(EventMenu::Edit);
    EXPECT_EQ(m_steps, (Steps{"edit"}));
    EXPECT_EQ(m_edited, second);
    EXPECT_EQ(m_editPosition, m_menuPosition);
    EXPECT_TRUE(m_edits.steps.empty());
}

TEST_F(EventTableModelTest, HealsAndLeavesNothingSelected)
{
    for (int index = 0; index < 4; ++index)
        add();
    EventTableModel& model = show();
    select({1, 2});
    rightClick(2);
    m_choose(EventMenu::HealNormal);
    EXPECT_EQ(m_edits.steps, (Steps{"Heal EDL Events of 4", "list of 3"}));
    EXPECT_EQ(model.getNumRows(), 3);
    EXPECT_EQ(selectedRows(), (Rows{}));
    EXPECT_EQ(m_steps, (Steps{"selection"}));

    select({1});
    rightClick(1);
    EXPECT_EQ(m_menuText.substr(0, 19), "Healing(1 2- 3- 4- ");
    m_choose(EventMenu::HealNone);
    EXPECT_EQ(m_edits.steps, (Steps{"Heal EDL Events of 4", "list of 3", "Heal EDL events of 3", "list of 4"}));
}

TEST_F(EventTableModelTest, ExtendsAndKeepsTheEventSelected)
{
    add();
    const auto last = add();
    list().add(cadrel::tests::makeEvent("A", "00:05:00:00", "00:05:10:00", "01:05:00:00", "01:05:10:00"));
    show();
    rightClick(1);
    EXPECT_EQ(m_menuText, "Healing(1- 2- 3- 4- )|Extend Event(7- 8 9- )|6 5 ");
    m_steps.clear();
    m_choose(EventMenu::ExtendNext);
    EXPECT_EQ(m_edits.steps, (Steps{"Extend EDL Event of 3", "list of 3"}));
    EXPECT_EQ(last->dstOut().toString(), "01:05:00:00");
    EXPECT_EQ(selectedRows(), (Rows{1}));
    EXPECT_TRUE(m_steps.empty());
}

TEST_F(EventTableModelTest, DoesNothingWhenNoItemIsChosen)
{
    add();
    show();
    rightClick(0);
    m_steps.clear();
    for (const int id : {0, -1, 10, 99})
        m_choose(id);
    EXPECT_TRUE(m_steps.empty());
    EXPECT_TRUE(m_edits.steps.empty());
}

TEST_F(EventTableModelTest, DoesNothingWhenTheModelOrTheTableHasGoneBeforeTheAnswer)
{
    add();
    show();
    rightClick(0);
    m_model.reset();
    m_choose(EventMenu::Delete);
    EXPECT_EQ(list().size(), 1U);

    auto table = std::make_unique<cadrel::gui::EventTable>("short");
    EventTableModel model(*table, list(), m_dataModel);
    model.setMenuPresenter([this](juce::PopupMenu&, juce::Point<int>, auto chosen) { m_choose = std::move(chosen); });
    table->selectRow(0);
    m_choose = nullptr;
    model.openMenu();
    ASSERT_TRUE(m_choose);
    table.reset();
    m_choose(EventMenu::Delete);
    EXPECT_EQ(list().size(), 1U);
}

TEST_F(EventTableModelTest, DoesNothingWhenTheEventHasGoneBeforeTheAnswer)
{
    add();
    add();
    show();
    rightClick(0);
    list().erase(0, 1);
    m_edits.steps.clear();
    m_choose(EventMenu::Delete);
    m_choose(EventMenu::Edit);
    EXPECT_TRUE(m_edits.steps.empty());
    EXPECT_EQ(m_edited, nullptr);
}

TEST_F(EventTableModelTest, DoesNothingWhenAnotherEventIsSelectedBeforeTheAnswer)
{
    add();
    add();
    show();
    rightClick(0);
    select({1});
    m_choose(EventMenu::Delete);
    EXPECT_EQ(list().size(), 2U);
}

TEST_F(EventTableModelTest, TakesTheAnswerForTheSameEventsInAnotherOrder)
{
    Events events;
    for (int index = 0; index < 5; ++index)
        events.push_back(add());
    EventTableModel& model = show();
    select({0, 1});
    rightClick(1);
    model.applySort(EventColumn::DstIn, true);
    m_choose(EventMenu::Delete);
    EXPECT_EQ(list().events(), (Events{events[2], events[3], events[4]}));
    // No event came after the clicked one in the new order, so the last row is selected.
    EXPECT_EQ(model.getSelectedEvents(), (Events{events[2]}));
}

TEST_F(EventTableModelTest, EditsOnlyTheEventThatWasClicked)
{
    add();
    add();
    EventTableModel& model = show();
    select({0});
    // A click with the Control key has taken the second row out of the selection.
    model.cellClicked(1, 1, mouseAt(1, juce::ModifierKeys::rightButtonModifier));
    EXPECT_EQ(m_menuText, "Healing(1- 2- 3- 4- )|Extend Event(7- 8- 9- )|6- 5 ");
    m_choose(EventMenu::Edit);
    EXPECT_EQ(m_edited, nullptr);
}

TEST_F(EventTableModelTest, DoesNothingThatIsNoLongerAllowedAtTheAnswer)
{
    add();
    const auto second = add();
    show();
    select({0, 1});
    rightClick(1);
    ASSERT_EQ(m_menuText, "Healing(1- 2 3 4 )|5 ");
    second->setSrc({0, 1, 0, 0}, {0, 1, 5, 0});
    m_edits.steps.clear();
    m_choose(EventMenu::HealNormal);
    EXPECT_TRUE(m_edits.steps.empty());

    select({1});
    rightClick(1);
    second->setDst({1, 0, 5, 0}, {1, 0, 10, 99});
    m_choose(EventMenu::Edit);
    EXPECT_EQ(m_edited, nullptr);
}

// Deleting.

TEST_F(EventTableModelTest, DeletesByKeyAndByMenuInTheSameWay)
{
    for (const bool byMenu : {false, true}) {
        list().clear();
        Events events;
        for (int index = 0; index < 6; ++index)
            events.push_back(add());
        EventTableModel& model = show();
        select({1, 2, 4});
        if (byMenu) {
            rightClick(4);
            m_choose(EventMenu::Delete);
        } else {
            model.deleteKeyPressed(4);
        }
        EXPECT_EQ(m_edits.steps, (Steps{"Delete EDL Events of 6", "list of 3"}));
        EXPECT_EQ(list().events(), (Events{events[0], events[3], events[5]}));
        // The row that moved up to the place of the last.
        EXPECT_EQ(model.getSelectedEvents(), (Events{events[5]}));
        EXPECT_EQ(selectedRows(), (Rows{2}));
        EXPECT_EQ(m_steps, (Steps{"selection"}));
    }
}

TEST_F(EventTableModelTest, SelectsTheRowThatIsNowTheLastAfterDeletingTheLastRows)
{
    for (int index = 0; index < 5; ++index)
        add();
    EventTableModel& model = show();
    select({3, 4});
    model.deleteKeyPressed(4);
    EXPECT_EQ(selectedRows(), (Rows{2}));
}

TEST_F(EventTableModelTest, SelectsTheFirstRowAfterDeletingTheFirst)
{
    for (int index = 0; index < 3; ++index)
        add();
    EventTableModel& model = show();
    select({0});
    model.deleteKeyPressed(0);
    EXPECT_EQ(selectedRows(), (Rows{0}));
}

TEST_F(EventTableModelTest, SelectsNothingAfterDeletingAll)
{
    for (int index = 0; index < 3; ++index)
        add();
    EventTableModel& model = show();
    model.selectAll();
    m_steps.clear();
    model.deleteKeyPressed(1);
    EXPECT_TRUE(list().isEmpty());
    EXPECT_EQ(selectedRows(), (Rows{}));
    EXPECT_EQ(m_steps, (Steps{"selection"}));
}

TEST_F(EventTableModelTest, DeletesNothingWithoutALastRowOrASelection)
{
    add();
    EventTableModel& model = show();
    model.deleteKeyPressed(0);
    select({0});
    model.deleteKeyPressed(-1);
    EXPECT_EQ(list().size(), 1U);
    EXPECT_TRUE(m_edits.steps.empty());
}

TEST_F(EventTableModelTest, DeletesTheSameWhereNobodyReloads)
{
    for (int index = 0; index < 3; ++index)
        add();
    EventTableModel& model = show();
    m_reloads = false;
    select({1});
    model.deleteKeyPressed(1);
    EXPECT_EQ(model.getNumRows(), 2);
    EXPECT_EQ(selectedRows(), (Rows{1}));
}

TEST_F(EventTableModelTest, StopsAPreviewBeforeEachEdit)
{
    for (const int id : {EventMenu::HealNormal, EventMenu::Delete}) {
        list().clear();
        add();
        add();
        EventTableModel& model = show();
        m_dataModel.setPreviewActive(true);
        model.selectAll();
        rightClick(0);
        m_choose(id);
        ASSERT_EQ(m_edits.steps.size(), 3U);
        EXPECT_EQ(m_edits.steps[0], "preview off");
        EXPECT_FALSE(m_dataModel.isPreviewActive());
    }
    list().clear();
    add();
    list().add(cadrel::tests::makeEvent("A", "00:05:00:00", "00:05:10:00", "01:05:00:00", "01:05:10:00"));
    show();
    m_dataModel.setPreviewActive(true);
    rightClick(0);
    m_choose(EventMenu::ExtendNext);
    EXPECT_EQ(m_edits.steps, (Steps{"preview off", "Extend EDL Event of 2", "list of 2"}));
}

TEST_F(EventTableModelTest, EditsNothingWhenThePreviewCannotBeStopped)
{
    cadrel::tests::RecordingAlerts alerts;
    add();
    EventTableModel& model = show();
    m_dataModel.setPreviewActive(true);
    m_edits.onPreview = [] { throw cadrel::util::Result::HostCallFailed; };
    select({0});
    model.deleteKeyPressed(0);
    EXPECT_EQ(list().size(), 1U);
    EXPECT_EQ(m_edits.steps, (Steps{"preview off"}));
    EXPECT_EQ(alerts.messages.size(), 1U);
}

TEST_F(EventTableModelTest, EditsNothingWhenItHasGoneMeanwhile)
{
    add();
    EventTableModel* model = &show();
    m_dataModel.setPreviewActive(true);
    m_edits.onPreview = [this] { m_model.reset(); };
    select({0});
    model->deleteKeyPressed(0);
    EXPECT_EQ(m_edits.steps, (Steps{"preview off"}));

    model = &show();
    m_edits.onEntry = [this] { m_model.reset(); };
    m_table.selectRow(0);
    model->deleteKeyPressed(0);
    EXPECT_EQ(m_edits.steps, (Steps{"Delete EDL Events of 1"}));
    EXPECT_EQ(list().size(), 1U);
}

TEST_F(EventTableModelTest, EditsNothingWhenOtherEventsAreSelectedMeanwhile)
{
    add();
    add();
    EventTableModel& model = show();
    m_dataModel.setPreviewActive(true);
    m_edits.onPreview = [this] { list().erase(0, 1); };
    select({0});
    model.deleteKeyPressed(0);
    EXPECT_EQ(list().size(), 1U);
    EXPECT_EQ(m_edits.steps, (Steps{"preview off", "list of 1"}));
}

namespace {

/// Fails when the list tells of its change, as a window may that can't follow.
class FailingListener : public cadrel::core::ChangeContextListenerInterface {
public:
    void onChange(const cadrel::core::ChangeContext&) override { throw cadrel::util::Result::OutOfRange; }
};

} // namespace

TEST_F(EventTableModelTest, TellsOfTheLostSelectionAlsoWhenAnEditFails)
{
    cadrel::tests::RecordingAlerts alerts;
    add();
    add();
    EventTableModel& model = show();
    select({0});
    FailingListener failing;
    m_edits.addListener(&failing);
    model.deleteKeyPressed(0);
    m_edits.removeListener(&failing);

    EXPECT_EQ(alerts.messages.size(), 1U);
    EXPECT_EQ(m_steps, (Steps{"selection"}));
    EXPECT_EQ(selectedRows(), (Rows{}));
    // It hears of selections again.
    model.reload(list());
    m_table.selectRow(0);
    EXPECT_EQ(m_steps, (Steps{"selection", "selection"}));
}

TEST_F(EventTableModelTest, ShowsTheListAsItIsWhenAnEditFailsAndNobodyReloads)
{
    cadrel::tests::RecordingAlerts alerts;
    const auto first = add();
    add();
    EventTableModel& model = show();
    m_reloads = false;
    select({1});
    FailingListener failing;
    m_edits.addListener(&failing);
    model.deleteKeyPressed(1);
    m_edits.removeListener(&failing);

    EXPECT_EQ(alerts.messages.size(), 1U);
    EXPECT_EQ(model.getNumRows(), 1);
    EXPECT_EQ(m_table.getNumRows(), 1);
    m_table.selectRow(0);
    EXPECT_EQ(model.getSelectedEvents(), (Events{first}));
}

TEST_F(EventTableModelTest, SortsAnExtendedEventAnewWhereNobodyReloads)
{
    const auto first = add();
    list().add(cadrel::tests::makeEvent("A", "00:00:10:00", "00:00:20:00", "01:05:00:00", "01:05:10:00"));
    EventTableModel& model = show();
    m_reloads = false;
    model.applySort(EventColumn::SrcOut, false);
    select({0});
    rightClick(0);
    m_steps.clear();
    m_choose(EventMenu::ExtendNext);
    ASSERT_EQ(first->srcOut().toString(), "00:05:00:00");
    EXPECT_EQ(selectedRows(), (Rows{1}));
    EXPECT_EQ(model.getSelectedEvents(), (Events{first}));
    EXPECT_TRUE(m_steps.empty());
}

// Editing by mouse and keys.

TEST_F(EventTableModelTest, AsksForAnEditAtADoubleClickAndReturn)
{
    const auto event = add();
    EventTableModel& model = show();
    select({0});
    model.cellDoubleClicked(0, 1, mouseAt(0, juce::ModifierKeys::leftButtonModifier));
    EXPECT_EQ(m_edited, event);
    m_edited = nullptr;
    model.returnKeyPressed(0);
    EXPECT_EQ(m_edited, event);
    EXPECT_EQ(m_editPosition, m_table.localPointToGlobal(m_table.getRowPosition(0, true).getBottomLeft()));
    EXPECT_EQ(m_steps, (Steps{"edit", "edit"}));
}

TEST_F(EventTableModelTest, AsksForNoEditOfSeveralEventsOrOfOneThatMayNotBeEdited)
{
    add();
    const auto flawed = add();
    EventTableModel& model = show();
    const auto doubleClick = [&](int row, int button) { model.cellDoubleClicked(row, 1, mouseAt(row, button)); };
    select({0, 1});
    model.returnKeyPressed(1);
    doubleClick(1, juce::ModifierKeys::leftButtonModifier);
    select({0});
    model.returnKeyPressed(1);
    model.returnKeyPressed(-1);
    doubleClick(1, juce::ModifierKeys::leftButtonModifier);
    doubleClick(0, juce::ModifierKeys::rightButtonModifier);
    doubleClick(0, juce::ModifierKeys::middleButtonModifier);
    flawed->setDstIn({0, 0, 0, 99});
    // Its row has moved to the top.
    select({0});
    ASSERT_EQ(model.getSelectedEvents(), (Events{flawed}));
    model.returnKeyPressed(0);
    doubleClick(0, juce::ModifierKeys::leftButtonModifier);
    EXPECT_EQ(m_edited, nullptr);
}

// Neighbours and highlight.

TEST_F(EventTableModelTest, GivesTheNeighboursOfAPreview)
{
    Events events;
    for (int index = 0; index < 4; ++index)
        events.push_back(add());
    EventTableModel& model = show();
    model.applySort(EventColumn::DstIn, true);
    std::size_t before = 1;
    std::size_t after = 1;
    EXPECT_EQ(model.getSelectionWithNeighbours({events[0]}, before, after), (Events{events[0], events[1]}));
    EXPECT_EQ(before, 0U);
    EXPECT_EQ(after, 1U);
}

// Laws.

TEST_F(EventTableModelTest, DeletingSelectsTheRowThatMovedUp)
{
    rc::check([this] {
        list().clear();
        Events events;
        const int count = *rc::gen::inRange(1, 12);
        for (int index = 0; index < count; ++index)
            events.push_back(add());
        EventTableModel& model = show();
        const bool falls = *rc::gen::arbitrary<bool>();
        model.applySort(EventColumn::DstIn, falls);
        if (falls)
            std::reverse(events.begin(), events.end());
        const int last = *rc::gen::inRange(0, count);
        std::set<int> selected = {last};
        for (int row = 0; row < count; ++row) {
            if (*rc::gen::arbitrary<bool>())
                selected.insert(row);
        }
        select({selected.begin(), selected.end()});

        model.deleteKeyPressed(last);

        Events remaining;
        std::shared_ptr<EventBase> expected;
        for (int row = 0; row < count; ++row) {
            if (selected.contains(row))
                continue;
            remaining.push_back(events[static_cast<std::size_t>(row)]);
            if (row > last && !expected)
                expected = remaining.back();
        }
        if (!expected && !remaining.empty())
            expected = remaining.back();
        RC_ASSERT(list().size() == remaining.size());
        RC_ASSERT(model.getSelectedEvents() == (expected ? Events{expected} : Events{}));
        RC_ASSERT(selectedRows().size() == (expected ? 1U : 0U));
    });
}

TEST_F(EventTableModelTest, TableAndModelAgreeOnAnySelection)
{
    rc::check([this] {
        list().clear();
        const int count = *rc::gen::inRange(0, 30);
        for (int index = 0; index < count; ++index)
            add(*rc::gen::element<std::string>("A", "B", "C"));
        EventTableModel& model = show();
        RowSet rows;
        for (int row = 0; row < count; ++row) {
            if (*rc::gen::arbitrary<bool>())
                rows.append(row);
        }
        model.selectRows(rows);
        RC_ASSERT(model.getSelectedRows() == rows);
        // Compares them with those of the table.
        RC_ASSERT(selectedRows().size() == rows.count());
        const Events before = model.getSelectedEvents();

        model.applySort(*rc::gen::inRange(1, 11), *rc::gen::arbitrary<bool>());
        const Events after = model.getSelectedEvents();
        RC_ASSERT(std::set(before.begin(), before.end()) == std::set(after.begin(), after.end()));
        RC_ASSERT(selectedRows().size() == rows.count());
    });
}
