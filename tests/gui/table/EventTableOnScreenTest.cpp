// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventColumn.h"
#include "gui/table/EventMenu.h"
#include "tests/gui/table/ShownTable.h"
#include "tests/support/window/WindowOnScreen.h"
#include "tests/support/x11/XUser.h"

#include <gtest/gtest.h>

using cadrel::gui::EventColumn;
using juce::KeyPress;
using juce::ModifierKeys;

namespace {

/// The screen comes before everything of JUCE.
struct Screen {
    cadrel::tests::WindowOnScreen m_window;
};

/// The table in a window, with its real menus.
class EventTableOnScreenTest : private Screen, public cadrel::tests::ShownTable {
protected:
    void SetUp() override
    {
        m_showsMenus = true;
        for (int index = 0; index < 4; ++index)
            add();
        show();
        m_table.setBounds(0, 0, 600, 300);
        m_window.show(m_table);
        m_table.grabKeyboardFocus();
        m_window.serve();
    }

    void click(int row, int button, int count = 1)
    {
        const auto cell = m_table.getCellPosition(EventColumn::Roll, row, true);
        const auto place = m_window.content().getLocalPoint(&m_table, cell.getCentre()).toFloat();
        for (int index = 0; index < count; ++index) {
            for (const ModifierKeys& buttons : {ModifierKeys(), ModifierKeys(button), ModifierKeys()})
                m_window.content().getPeer()->handleMouseEvent(juce::MouseInputSource::InputSourceType::mouse, place,
                                                               buttons, juce::MouseInputSource::defaultPressure,
                                                               juce::MouseInputSource::defaultOrientation,
                                                               juce::Time::currentTimeMillis());
        }
        m_window.serve();
    }
    static juce::Component* openMenu() { return juce::Component::getCurrentlyModalComponent(); }
    bool waitForMenu()
    {
        return m_window.serveUntil([] { return openMenu() != nullptr; });
    }
    /// Goes down in the menu that is open, and chooses.
    bool choose(int downs)
    {
        for (int index = 0; index < downs; ++index)
            openMenu()->keyPressed(KeyPress(KeyPress::downKey));
        openMenu()->keyPressed(KeyPress(KeyPress::returnKey));
        return m_window.serveUntil([] { return openMenu() == nullptr; });
    }

    cadrel::tests::WindowOnScreen& window() { return m_window; }
};

using Rows = std::vector<int>;

constexpr unsigned long MenuKey = 0xff67;

bool isMenuKeyDown()
{
    return KeyPress::isKeyCurrentlyDown((KeyPress::F10Key & ~0xff) | 0x67);
}

} // namespace

TEST_F(EventTableOnScreenTest, ShowsThatItHasTheKeyboard)
{
    const auto edge = [&] {
        return m_table.createComponentSnapshot(m_table.getLocalBounds(), true, 1.0F).getPixelAt(300, 0);
    };
    ASSERT_TRUE(m_table.hasKeyboardFocus(false));
    const juce::Colour focused = edge();

    m_table.giveAwayKeyboardFocus();
    window().serve();
    EXPECT_NE(edge(), focused);
    m_table.grabKeyboardFocus();
    window().serve();
    EXPECT_EQ(edge(), focused);
}

TEST_F(EventTableOnScreenTest, DeletesByTheMenuOfARightClick)
{
    click(1, ModifierKeys::rightButtonModifier);
    ASSERT_TRUE(waitForMenu());
    EXPECT_EQ(selectedRows(), (Rows{1}));
    // Healing, Extend Event, Edit, Delete.
    ASSERT_TRUE(choose(4));
    EXPECT_TRUE(window().serveUntil([this] { return list().size() == 3; }));
    EXPECT_EQ(m_edits.steps, (Steps{"Delete EDL Events of 4", "list of 3"}));
    EXPECT_EQ(selectedRows(), (Rows{1}));
}

TEST_F(EventTableOnScreenTest, KeepsTheSelectionAtARightClickOnIt)
{
    select({0, 1, 2});
    click(1, ModifierKeys::rightButtonModifier);
    ASSERT_TRUE(waitForMenu());
    EXPECT_EQ(selectedRows(), (Rows{0, 1, 2}));
    ASSERT_TRUE(choose(2));
    EXPECT_TRUE(window().serveUntil([this] { return list().size() == 1; }));
}

TEST_F(EventTableOnScreenTest, EditsAtADoubleClick)
{
    click(2, ModifierKeys::leftButtonModifier, 2);
    EXPECT_EQ(m_edited, list().eventAt(2));
    const juce::Rectangle<int> row = m_table.localAreaToGlobal(m_table.getRowPosition(2, true));
    EXPECT_TRUE(row.contains(m_editPosition));
}

TEST_F(EventTableOnScreenTest, OpensItsMenuWithTheMenuKeyOnceWhileItIsHeld)
{
    select({1});
    cadrel::tests::XUser user;
    user.hold(MenuKey);
    ASSERT_TRUE(waitForMenu());
    openMenu()->keyPressed(KeyPress(KeyPress::escapeKey));
    EXPECT_TRUE(window().serveUntil([] { return openMenu() == nullptr; }));
    // Other keys go up and down meanwhile.
    m_table.keyStateChanged(true);
    window().serve();
    EXPECT_EQ(openMenu(), nullptr);
    user.release(MenuKey);
    window().serve();
    EXPECT_TRUE(m_edits.steps.empty());
}

TEST_F(EventTableOnScreenTest, OpensItsMenuAgainAfterTheKeyWentUpInTheMenuAndAClickBesideClosedIt)
{
    select({1});
    cadrel::tests::XUser user;
    for (int time = 1; time <= 3; ++time) {
        user.hold(MenuKey);
        ASSERT_TRUE(waitForMenu()) << time;
        user.release(MenuKey);
        ASSERT_TRUE(window().serveUntil([] { return !isMenuKeyDown(); }));
        click(3, ModifierKeys::leftButtonModifier);
        ASSERT_TRUE(window().serveUntil([] { return openMenu() == nullptr; }));
        select({1});
    }
}

TEST_F(EventTableOnScreenTest, OpensItsMenuAgainAfterTheKeyWentUpWhereTheFocusWasMeanwhile)
{
    select({1});
    juce::TextEditor other;
    window().content().addAndMakeVisible(other);
    cadrel::tests::XUser user;
    for (int time = 1; time <= 2; ++time) {
        user.hold(MenuKey);
        ASSERT_TRUE(waitForMenu()) << time;
        openMenu()->exitModalState(0);
        ASSERT_TRUE(window().serveUntil([] { return openMenu() == nullptr; }));
        other.grabKeyboardFocus();
        user.release(MenuKey);
        ASSERT_TRUE(window().serveUntil([] { return !isMenuKeyDown(); }));
        m_table.grabKeyboardFocus();
    }
}

TEST_F(EventTableOnScreenTest, DoesNothingWhenItGoesWhileItsMenuIsOpen)
{
    select({1});
    m_model->openMenu();
    ASSERT_TRUE(waitForMenu());
    m_model.reset();
    choose(4);
    window().serve();
    EXPECT_EQ(list().size(), 4U);
    EXPECT_TRUE(m_edits.steps.empty());
}

TEST_F(EventTableOnScreenTest, SaysItsRowsAndCellsToScreenReaders)
{
    const juce::AccessibilityHandler* const table = m_table.getAccessibilityHandler();
    ASSERT_NE(table, nullptr);
    EXPECT_EQ(table->getRole(), juce::AccessibilityRole::table);
    const juce::AccessibilityTableInterface* const rows = table->getTableInterface();
    ASSERT_NE(rows, nullptr);
    EXPECT_EQ(rows->getNumRows(), 4);
    ASSERT_NE(rows->getRowHandler(1), nullptr);
    EXPECT_EQ(rows->getRowHandler(1)->getTitle(),
              "Valid, 2, A001, C, 00:00:05:00, 00:00:10:00, 01:00:05:00, 01:00:10:00");
    ASSERT_NE(rows->getCellHandler(1, 2), nullptr);
    EXPECT_EQ(rows->getCellHandler(1, 2)->getTitle(), "A001");
}
