// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/MenuRegistry.h"

#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

class MenuRegistryTest : public testing::Test {
protected:
    int32 add(BundleHandle bundle, const char16_t* title)
    {
        return menus->addCommand(bundle, "Project", title, IMenuRegistry::ModuleCommand, "Cadrel", "ShowDialog");
    }
    std::vector<std::u16string> titles() const
    {
        std::vector<std::u16string> titles;
        for (const MenuRegistry::Command& command : registry->commands())
            titles.push_back(command.title);
        return titles;
    }

    using Titles = std::vector<std::u16string>;

    char one = 0;
    char other = 0;
    Counted<MenuRegistry> registry = makeCounted<MenuRegistry>();
    Counted<IMenuRegistry> menus = registry;
};

} // namespace

TEST_F(MenuRegistryTest, KeepsAllOfACommand)
{
    ASSERT_EQ(add(&one, u"Cadrel…"), ResultOk);

    const MenuRegistry::Command& command = registry->commands().at(0);
    EXPECT_EQ(command.bundle, &one);
    EXPECT_EQ(command.menu, "Project");
    EXPECT_EQ(command.title, u"Cadrel…");
    EXPECT_EQ(command.flags, 4);
    EXPECT_EQ(command.category, "Cadrel");
    EXPECT_EQ(command.action, "ShowDialog");
}

TEST_F(MenuRegistryTest, RemovesTheCommandsOfOneModuleAlone)
{
    add(&one, u"1");
    add(&other, u"2");
    add(&one, u"3");
    add(nullptr, u"4");

    EXPECT_EQ(menus->removeCommands(&one), ResultOk);
    EXPECT_EQ(titles(), (Titles{u"2", u"4"}));
    EXPECT_EQ(menus->removeCommands(nullptr), ResultOk);
    EXPECT_EQ(titles(), Titles{u"2"});
}

TEST_F(MenuRegistryTest, SaysThatAModuleHasNoCommands)
{
    add(&one, u"1");

    EXPECT_EQ(menus->removeCommands(&other), ResultFalse);
    EXPECT_EQ(menus->removeCommands(&one), ResultOk);
    EXPECT_EQ(menus->removeCommands(&one), ResultFalse);
}

TEST_F(MenuRegistryTest, RefusesACommandWithoutOneOfItsTexts)
{
    EXPECT_NE(menus->addCommand(&one, nullptr, u"Title", 4, "Category", "Action"), ResultOk);
    EXPECT_NE(menus->addCommand(&one, "Menu", nullptr, 4, "Category", "Action"), ResultOk);
    EXPECT_NE(menus->addCommand(&one, "Menu", u"Title", 4, nullptr, "Action"), ResultOk);
    EXPECT_NE(menus->addCommand(&one, "Menu", u"Title", 4, "Category", nullptr), ResultOk);

    EXPECT_EQ(titles(), Titles{});
}

} // namespace standin::tests
