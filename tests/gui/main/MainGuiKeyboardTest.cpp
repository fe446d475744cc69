// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/gui/main/ShownWindow.h"
#include "tests/support/TempFolder.h"

#include <initializer_list>
#include <optional>

namespace cadrel::tests {
namespace {

using core::ActionChangeContext;
using core::ChangeContext;
using core::ListKind;

/// Who has the keyboard.
class MainGuiKeyboardTest : public ShownWindow {
protected:
    bool hasTable() const { return table("Change").hasKeyboardFocus(true); }
    /// The edit box of the second change, which lies in the lower half of the window.
    void openEditBox()
    {
        showThree();
        select("Change", {1});
        table("Change").grabKeyboardFocus();
        m_window.press(juce::KeyPress::returnKey);
        ASSERT_TRUE(editDialog().isVisible());
    }
    void clickBesideEditBox()
    {
        const juce::Point<int> place(1000, 200);
        ASSERT_FALSE(editDialog().getBounds().contains(place));
        m_window.click(place);
    }
};

// ---- Sheets --------------------------------------------------------------------------------------------------------

TEST_F(MainGuiKeyboardTest, StaysInTheEditBoxWhenTheUserClicksBesideIt)
{
    openEditBox();
    auto& out = find<gui::TcInput>(editDialog(), "m_copyOutEdit");
    out.grabKeyboardFocus();
    clickBesideEditBox();

    EXPECT_TRUE(out.hasKeyboardFocus(true));
    EXPECT_TRUE(m_window.press(juce::KeyPress::escapeKey));
    EXPECT_FALSE(editDialog().isVisible());
    EXPECT_TRUE(hasTable());
}

TEST_F(MainGuiKeyboardTest, ConfirmsTheEditBoxAlsoAfterAClickBesideIt)
{
    openEditBox();
    clickBesideEditBox();

    EXPECT_TRUE(m_window.press(juce::KeyPress::tabKey));
    EXPECT_TRUE(editDialog().hasKeyboardFocus(true));
    EXPECT_TRUE(m_window.press(juce::KeyPress::returnKey));
    EXPECT_FALSE(editDialog().isVisible());
}

TEST_F(MainGuiKeyboardTest, GoesToTheSheetThatIsOpen)
{
    showThree();
    click("Load Old Edl Button");
    juce::Component::unfocusAllComponents();
    m_gui->grabKeyboardFocus();

    EXPECT_TRUE(find<juce::Button>(fileDialog(), "Open Files Button").hasKeyboardFocus(true));
}

TEST_F(MainGuiKeyboardTest, StaysOutOfTheTableBeneathASheetThatCameUpWhileAnotherWindowHadIt)
{
    showThree();
    select("Change", {1});
    table("Change").grabKeyboardFocus();
    m_window.loseKeyboard();
    settingsDialog().setVisible(true);
    m_window.regainKeyboard();

    EXPECT_TRUE(settingsDialog().hasKeyboardFocus(true));
    for (const int key : {juce::KeyPress::deleteKey, juce::KeyPress::backspaceKey, juce::KeyPress::downKey})
        m_window.press(key);
    EXPECT_EQ(list(ListKind::Change).size(), 3U);
    EXPECT_EQ(selected("Change"), "1");
    EXPECT_EQ(m_undo.begun, Texts());
}

TEST_F(MainGuiKeyboardTest, WorksNothingBeneathASheetWithKeysThatNobodyInItUses)
{
    showThree();
    select("Change", {1});
    click("m_videoRightToggle");
    for (juce::Component* const sheet :
         std::initializer_list<juce::Component*>{&settingsDialog(), &videosDialog(), &fileDialog(), &editDialog()}) {
        sheet->setVisible(true);
        EXPECT_FALSE(m_gui->keyPressed(juce::KeyPress(juce::KeyPress::leftKey))) << sheet->getName();
        EXPECT_FALSE(table("Change").keyPressed(juce::KeyPress(juce::KeyPress::deleteKey)));
        EXPECT_FALSE(table("Change").keyPressed(juce::KeyPress('a', juce::ModifierKeys::commandModifier, 0)));
        sheet->setVisible(false);
    }

    EXPECT_TRUE(button("m_videoRightToggle").getToggleState());
    EXPECT_EQ(list(ListKind::Change).size(), 3U);
    EXPECT_EQ(selected("Change"), "1");
}

TEST_F(MainGuiKeyboardTest, GoesToTheTableAfterASheetThatCameUpWhileAnotherWindowHadIt)
{
    const TempFolder folder;
    const juce::String path = folder
                                  .write("reel.edl", "001  A001 V     C        10:00:00:00 10:00:05:00 "
                                                     "01:00:00:00 01:00:05:00\n")
                                  .string();
    showThree();
    {
        FocusedWindow other(50, 50);
        dynamic_cast<juce::FileDragAndDropTarget&>(controls()).filesDropped({path}, 800, 150);
    }
    ASSERT_TRUE(fileDialog().hasKeyboardFocus(true));
    m_window.press(juce::KeyPress::escapeKey);

    EXPECT_TRUE(hasTable());
}

// ---- Buttons that can't be used any more ---------------------------------------------------------------------------

TEST_F(MainGuiKeyboardTest, GoesToTheTableWhenAClickedButtonHasNothingMoreToDo)
{
    showThree();
    for (const char* const name : {"Clear Old Edl Button", "Clear New Edl Button", "Clear Change Edl Button"}) {
        click(name);
        EXPECT_FALSE(button(name).isEnabled());
        EXPECT_TRUE(hasTable()) << name;
    }
}

TEST_F(MainGuiKeyboardTest, GoesToTheTableWhenAPressedButtonHasNothingMoreToDo)
{
    showThree();
    button("Clear New Edl Button").grabKeyboardFocus();
    m_window.press(juce::KeyPress::returnKey);
    ASSERT_TRUE(list(ListKind::New).isEmpty());

    EXPECT_TRUE(hasTable());
}

TEST_F(MainGuiKeyboardTest, GoesToTheTableFromTheSidesOfAPreviewThatEnds)
{
    showThree();
    click("new component");
    destination().grabKeyboardFocus();
    ASSERT_TRUE(destination().hasKeyboardFocus(false));
    m_model.setPreviewActive(false);
    notify(ChangeContext(ChangeContext::PreviewStateChanged));

    EXPECT_TRUE(hasTable());
}

TEST_F(MainGuiKeyboardTest, StaysOnAButtonThatCanStillBeUsed)
{
    showThree();
    button("Load Old Edl Button").grabKeyboardFocus();
    list(ListKind::Old).clear();

    EXPECT_TRUE(button("Load Old Edl Button").hasKeyboardFocus(false));
}

TEST_F(MainGuiKeyboardTest, StaysInASheetWhenAButtonBeneathHasNothingMoreToDo)
{
    showThree();
    click("Load Old Edl Button");
    list(ListKind::New).clear();

    EXPECT_TRUE(fileDialog().hasKeyboardFocus(true));
}

// ---- Runs and previews ---------------------------------------------------------------------------------------------

TEST_F(MainGuiKeyboardTest, GoesToTheTableAfterARunWhoseQuestionHadIt)
{
    showThree();
    m_engine.material = {{18000, 18060}};
    std::optional<FocusedWindow> box;
    m_alerts.answer = 2;
    m_alerts.meanwhile = [&] { box.emplace(50, 50); };
    click("Cadrel Button");
    ASSERT_EQ(m_engine.calls, Calls{"run"});
    box.reset();
    notify(ActionChangeContext(ActionChangeContext::Run));

    EXPECT_TRUE(hasTable());
}

TEST_F(MainGuiKeyboardTest, GoesToTheTableAfterAPreviewWhoseProgressHadIt)
{
    showThree();
    click("new component");
    {
        FocusedWindow progress(50, 50);
    }
    ASSERT_EQ(juce::Component::getCurrentlyFocusedComponent(), nullptr);
    notify(ActionChangeContext(ActionChangeContext::Preview));

    EXPECT_TRUE(hasTable());
}

} // namespace
} // namespace cadrel::tests
