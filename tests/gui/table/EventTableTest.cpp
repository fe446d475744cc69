// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventTable.h"

#include "gui/look/Text.h"
#include "gui/table/EventColumn.h"
#include "tests/gui/table/ShownTable.h"
#include "tests/support/window/MessagePump.h"

#include <gtest/gtest.h>

#include <utility>
#include <vector>

using cadrel::core::EventFlaw;
using cadrel::gui::EventColumn;
using cadrel::tests::pumpMessages;
using juce::KeyPress;
using juce::ModifierKeys;

namespace {

class EventTableTest : public cadrel::tests::ShownTable {
protected:
    bool press(int key, ModifierKeys modifiers = {}) { return m_table.keyPressed(KeyPress(key, modifiers, 0)); }
    /// Each of the three names may lose a part of a pixel.
    bool fills(int width) const
    {
        const int total = m_table.getHeader().getTotalWidth();
        return total <= width && total > width - 3;
    }
    juce::String titleOf(int row, int column) const
    {
        const juce::Component* const cell = m_table.getCellComponent(column, row);
        return cell == nullptr ? juce::String("none") : cell->getTitle();
    }
};

using Rows = std::vector<int>;

} // namespace

TEST_F(EventTableTest, HasTheTenColumns)
{
    const juce::TableHeaderComponent& header = m_table.getHeader();
    EXPECT_EQ(m_table.getName(), "Change Table List Box");
    EXPECT_EQ(m_table.getHeaderHeight(), 20);
    EXPECT_TRUE(header.isStretchToFitActive());
    ASSERT_EQ(header.getNumColumns(true), 10);
    for (int index = 0; index < 10; ++index)
        EXPECT_EQ(header.getColumnIdOfIndex(index, true), index + 1);
    EXPECT_EQ(header.getColumnName(EventColumn::ClipName), "Clip Name");
    EXPECT_FALSE(m_table.isAutoSizeMenuOptionShown());
}

TEST_F(EventTableTest, LetsNobodyResizeOrMoveAColumn)
{
    juce::TableHeaderComponent& header = m_table.getHeader();
    const auto dragFrom = [&](int x, int by) {
        const auto at = [&](int where, bool isDragged) {
            return juce::MouseEvent(juce::Desktop::getInstance().getMainMouseSource(),
                                    {static_cast<float>(where), 10.0F}, ModifierKeys::leftButtonModifier,
                                    juce::MouseInputSource::defaultPressure, 0.0F, 0.0F, 0.0F, 0.0F, &header, &header,
                                    {}, {static_cast<float>(x), 10.0F}, {}, 1, isDragged);
        };
        header.mouseMove(at(x, false));
        header.mouseDown(at(x, false));
        header.mouseDrag(at(x + by, true));
        header.mouseUp(at(x + by, true));
    };
    const auto layout = [&] {
        std::vector<std::pair<int, int>> columns;
        for (int index = 0; index < header.getNumColumns(true); ++index) {
            const int id = header.getColumnIdOfIndex(index, true);
            columns.emplace_back(id, header.getColumnWidth(id));
        }
        return columns;
    };
    m_table.setSize(1056, 200);
    const auto before = layout();

    const juce::Rectangle<int> names = header.getColumnPosition(4);
    dragFrom(names.getRight() - 1, 20);
    dragFrom(names.getCentreX(), 200);
    EXPECT_EQ(layout(), before);
}

TEST_F(EventTableTest, StretchesItsNamesAndNothingElse)
{
    m_table.setSize(1056, 200);
    const juce::TableHeaderComponent& header = m_table.getHeader();
    EXPECT_TRUE(fills(1056));
    for (const EventColumn& column : EventColumn::all()) {
        const int width = header.getColumnWidth(column.id);
        EXPECT_GE(width, column.width);
        EXPECT_LE(width, column.maximumWidth);
    }
    EXPECT_GT(header.getColumnWidth(EventColumn::Roll), 70);
    EXPECT_GT(header.getColumnWidth(EventColumn::ClipName), 70);
    EXPECT_GT(header.getColumnWidth(EventColumn::EdlFile), 80);
}

TEST_F(EventTableTest, FitsBesideItsScrollBarAtAnyWidthOfTheWindow)
{
    for (int index = 0; index < 200; ++index)
        add();
    show();
    // The old and the change list of windows from 1300 pixels on.
    for (const int width : {614, 615, 800, 1056, 1500}) {
        m_table.setSize(width, 200);
        pumpMessages();
        EXPECT_TRUE(m_table.getVerticalScrollBar().isVisible());
        EXPECT_FALSE(m_table.getHorizontalScrollBar().isVisible()) << width;
    }
}

TEST_F(EventTableTest, FitsAgainWhenItsScrollBarComesOrGoes)
{
    m_table.setSize(1056, 200);
    add();
    show();
    EXPECT_FALSE(m_table.getVerticalScrollBar().isVisible());
    EXPECT_TRUE(fills(1056));
    for (int index = 0; index < 200; ++index)
        add();
    pumpMessages();
    EXPECT_TRUE(m_table.getVerticalScrollBar().isVisible());
    EXPECT_FALSE(m_table.getHorizontalScrollBar().isVisible());
    EXPECT_TRUE(fills(1044));
    list().erase(1, 200);
    pumpMessages();
    EXPECT_TRUE(fills(1056));
}

TEST_F(EventTableTest, HasRoomForTimecodesAndNumbers)
{
    const juce::Font font = cadrel::gui::getFont(5);
    EXPECT_LE(font.getStringWidthFloat("23:59:59:29"), 65.0F - 4.0F);
    EXPECT_LE(font.getStringWidthFloat("100000"), 40.0F - 4.0F);
    EXPECT_LE(font.getStringWidthFloat("D"), 30.0F - 4.0F);
}

TEST_F(EventTableTest, OpensTheMenuWithShiftAndF10)
{
    add();
    add();
    show();
    EXPECT_TRUE(press(KeyPress::F10Key, ModifierKeys::shiftModifier));
    EXPECT_TRUE(m_menuText.empty());
    select({1});
    EXPECT_FALSE(press(KeyPress::F10Key));
    EXPECT_TRUE(m_menuText.empty());
    EXPECT_TRUE(press(KeyPress::F10Key, ModifierKeys::shiftModifier));
    EXPECT_EQ(m_menuText.substr(0, 7), "Healing");
}

TEST_F(EventTableTest, EditsWithReturnAndDeletesWithDeleteAndBackspace)
{
    const auto first = add();
    add();
    add();
    show();
    select({0});
    EXPECT_TRUE(press(KeyPress::returnKey));
    EXPECT_EQ(m_edited, first);
    EXPECT_TRUE(press(KeyPress::deleteKey));
    EXPECT_EQ(list().size(), 2U);
    EXPECT_TRUE(press(KeyPress::backspaceKey));
    EXPECT_EQ(list().size(), 1U);
    EXPECT_EQ(selectedRows(), (Rows{0}));
}

TEST_F(EventTableTest, SelectsAllWithControlAndA)
{
    for (int index = 0; index < 100; ++index)
        add();
    show();
    EXPECT_TRUE(press('a', ModifierKeys::commandModifier));
    EXPECT_EQ(selectedRows().size(), 100U);
    EXPECT_TRUE(isInView(0));
    EXPECT_EQ(m_steps, (Steps{"selection"}));
}

TEST_F(EventTableTest, GoesThroughTheRowsWithTheArrows)
{
    for (int index = 0; index < 3; ++index)
        add();
    show();
    EXPECT_TRUE(press(KeyPress::downKey));
    EXPECT_TRUE(press(KeyPress::downKey));
    EXPECT_EQ(selectedRows(), (Rows{1}));
    EXPECT_TRUE(press(KeyPress::upKey, ModifierKeys::shiftModifier));
    EXPECT_EQ(selectedRows(), (Rows{0, 1}));
}

TEST_F(EventTableTest, LeavesAllOtherKeysToTheWindow)
{
    add();
    show();
    select({0});
    for (const int key : {KeyPress::leftKey, KeyPress::rightKey, KeyPress::escapeKey, KeyPress::tabKey, int('s')})
        EXPECT_FALSE(press(key)) << key;
}

TEST_F(EventTableTest, UsesNoKeyOfItsOwnWithoutAModel)
{
    EXPECT_FALSE(press(KeyPress::F10Key, ModifierKeys::shiftModifier));
    EXPECT_FALSE(press(KeyPress::returnKey));
    EXPECT_FALSE(press(KeyPress::deleteKey));
}

TEST_F(EventTableTest, GivesEachCellItsTextForScreenReaders)
{
    const auto first = add();
    first->setVfx(true);
    const auto second = add();
    second->addFlaw(EventFlaw::NotVideoEvent);
    show();
    EXPECT_EQ(titleOf(0, EventColumn::State), "Valid, VFX shot");
    EXPECT_EQ(titleOf(0, EventColumn::Number), "1");
    EXPECT_EQ(titleOf(0, EventColumn::DstOut), "01:00:05:00");
    EXPECT_EQ(titleOf(1, EventColumn::State), "Invalid, Not a video event.");

    m_model->setHighlight({first});
    EXPECT_EQ(titleOf(0, EventColumn::State), "Valid, VFX shot, Related to the selected change");
    m_model->applySort(EventColumn::DstIn, true);
    EXPECT_EQ(titleOf(0, EventColumn::Number), "2");
    EXPECT_EQ(titleOf(1, EventColumn::Number), "1");
}

TEST_F(EventTableTest, GivesTheTextsOfTheColumnsThatAreShown)
{
    add("A001");
    show();
    m_table.getHeader().setColumnVisible(EventColumn::Number, false);
    pumpMessages();
    EXPECT_EQ(titleOf(0, EventColumn::Number), "none");
    EXPECT_EQ(titleOf(0, EventColumn::Roll), "A001");
    EXPECT_EQ(titleOf(0, EventColumn::DstOut), "01:00:05:00");
    m_table.getHeader().setColumnVisible(EventColumn::Number, true);
    pumpMessages();
    EXPECT_EQ(titleOf(0, EventColumn::Number), "1");
    EXPECT_EQ(titleOf(0, EventColumn::Roll), "A001");
}
