// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/Menus.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <stdexcept>
#include <string>
#include <vector>

namespace desktop::tests {
namespace {

const MenuItem& itemNamed(const std::vector<MenuItem>& items, const std::string& text)
{
    const auto found =
        std::find_if(items.begin(), items.end(), [&](const MenuItem& item) { return item.text == text; });
    if (found == items.end())
        throw std::out_of_range("there is no item " + text);
    return *found;
}

std::vector<std::string> textsOf(const std::vector<MenuItem>& items)
{
    std::vector<std::string> texts;
    for (const MenuItem& item : items)
        texts.push_back(item.text);
    return texts;
}

MenuState edited()
{
    MenuState state;
    state.hasProject = true;
    state.undoNames = {u"Load Old EDL", u"Load New EDL", u"Generate Change EDL"};
    state.undoPosition = 2;
    return state;
}

TEST(Menus, AreTheSameFiveWhateverIsOpen)
{
    const std::vector<std::string> names{"File", "Edit", "View", "Project", "Help"};
    EXPECT_EQ(textsOf(menusOf({})), names);
    EXPECT_EQ(textsOf(menusOf(edited())), names);
}

TEST(Menus, OfferNothingThatNeedsAProjectWithoutOne)
{
    MenuState state;
    state.moduleCommands = {u"Cadrel"};
    const auto menus = menusOf(state);
    EXPECT_TRUE(itemNamed(menus[0].items, "Open...").isEnabled);
    EXPECT_TRUE(itemNamed(menus[0].items, "Quit").isEnabled);
    EXPECT_FALSE(itemNamed(menus[0].items, "Save").isEnabled);
    EXPECT_FALSE(itemNamed(menus[0].items, "Close").isEnabled);
    EXPECT_FALSE(itemNamed(menus[0].items, "Open Recent").isEnabled);
    EXPECT_FALSE(itemNamed(menus[1].items, "Undo").isEnabled);
    EXPECT_FALSE(itemNamed(menus[1].items, "History").isEnabled);
    EXPECT_FALSE(itemNamed(menus[3].items, "Cadrel").isEnabled);
}

TEST(Menus, NameTheEntriesThatUndoAndRedoWouldChange)
{
    const auto edit = menusOf(edited())[1].items;
    EXPECT_TRUE(itemNamed(edit, "Undo Load New EDL").isEnabled);
    EXPECT_TRUE(itemNamed(edit, "Redo Generate Change EDL").isEnabled);
    EXPECT_EQ(itemNamed(edit, "Undo Load New EDL").command, MenuCommand::Undo);
}

TEST(Menus, ListAllEntriesAfterTheStateBeforeThemAndTickThePresentOne)
{
    const auto history = itemNamed(menusOf(edited())[1].items, "History").items;
    EXPECT_EQ(textsOf(history),
              (std::vector<std::string>{"As it was opened", "Load Old EDL", "Load New EDL", "Generate Change EDL"}));
    for (std::size_t position = 0; position < history.size(); ++position) {
        EXPECT_EQ(history[position].command, MenuCommand::FirstHistory + static_cast<int>(position));
        EXPECT_EQ(history[position].isTicked, position == 2) << position;
    }
}

TEST(Menus, ListAllEntriesWhereThereAreMoreThanFitOnAScreen)
{
    MenuState state = edited();
    state.undoNames.assign(100, u"Edit");
    for (const std::size_t position : {std::size_t{0}, std::size_t{20}, std::size_t{50}, std::size_t{100}}) {
        state.undoPosition = position;
        const auto history = itemNamed(menusOf(state)[1].items, "History").items;
        EXPECT_EQ(history.size(), 101U);
        EXPECT_EQ(history.back().command, MenuCommand::FirstHistory + 100);
        EXPECT_EQ(std::count_if(history.begin(), history.end(), [](const MenuItem& item) { return item.isTicked; }), 1)
            << position;
    }
}

TEST(Menus, ListRecentFilesAndTheCommandsOfModules)
{
    MenuState state;
    state.hasProject = true;
    state.recentFiles = {{"/film/b.stage", false}, {"/film/a.stage", true}};
    state.moduleCommands = {u"Cadrel"};
    const auto menus = menusOf(state);
    const auto recent = itemNamed(menus[0].items, "Open Recent").items;
    EXPECT_EQ(textsOf(recent),
              (std::vector<std::string>{"/film/b.stage", "/film/a.stage (missing)", "", "Clear This List"}));
    EXPECT_EQ(recent[1].command, MenuCommand::FirstRecent + 1);
    EXPECT_TRUE(recent[1].isEnabled) << "It can be taken off the list.";
    EXPECT_EQ(recent[3].command, MenuCommand::ClearRecent);
    EXPECT_EQ(itemNamed(menus[3].items, "Cadrel").command, MenuCommand::FirstOfModules);
}

} // namespace
} // namespace desktop::tests
