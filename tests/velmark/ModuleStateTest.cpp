// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/ModuleState.h"

#include <gtest/gtest.h>

#include <string>

using namespace Velmark;

namespace {

class ModuleStateTest : public testing::Test {
protected:
    void enter(std::string& path) { m_state.enter(path.data()); }

    ModuleState m_state;
    std::string m_first = "/opt/first";
    std::string m_second = "/opt/second";
};

} // namespace

TEST_F(ModuleStateTest, IsEmptyBeforeTheFirstEntry)
{
    EXPECT_EQ(m_state.entryCount(), 0);
    EXPECT_EQ(m_state.moduleHandle(), nullptr);
    EXPECT_STREQ(m_state.modulePath(), "");
    EXPECT_TRUE(m_state.handles().empty());
}

TEST_F(ModuleStateTest, KeepsTheHandleAndThePathOfTheFirstEntry)
{
    enter(m_first);
    enter(m_second);

    EXPECT_EQ(m_state.moduleHandle(), m_first.data());
    EXPECT_STREQ(m_state.modulePath(), "/opt/first");
}

TEST_F(ModuleStateTest, KeepsAHandleForEachEntryUntilTheLastExit)
{
    enter(m_first);
    enter(m_first);
    EXPECT_EQ(m_state.handles().size(), 2U);

    m_state.exit();
    EXPECT_EQ(m_state.handles().size(), 2U);
    EXPECT_EQ(m_state.entryCount(), 1);

    m_state.exit();
    EXPECT_TRUE(m_state.handles().empty());
    EXPECT_EQ(m_state.entryCount(), 0);
}

TEST_F(ModuleStateTest, KeepsHandleAndPathAfterTheLastExit)
{
    enter(m_first);
    m_state.exit();

    EXPECT_EQ(m_state.moduleHandle(), m_first.data());
    EXPECT_STREQ(m_state.modulePath(), "/opt/first");
}

TEST_F(ModuleStateTest, TakesTheHandleOfTheNextLoad)
{
    enter(m_first);
    m_state.exit();
    enter(m_second);

    EXPECT_EQ(m_state.moduleHandle(), m_second.data());
    EXPECT_STREQ(m_state.modulePath(), "/opt/second");
}

TEST_F(ModuleStateTest, IgnoresNullAndAnExitTooMany)
{
    m_state.enter(nullptr);
    EXPECT_EQ(m_state.entryCount(), 0);
    EXPECT_TRUE(m_state.handles().empty());

    m_state.exit();
    EXPECT_EQ(m_state.entryCount(), 0);

    enter(m_first);
    EXPECT_EQ(m_state.entryCount(), 1);
    EXPECT_EQ(m_state.moduleHandle(), m_first.data());
}

TEST_F(ModuleStateTest, LeavesAPathEmptyThatDoesNotFit)
{
    std::string fits(ModuleState::PathCapacity - 1, 'a');
    std::string tooLong(ModuleState::PathCapacity, 'a');

    enter(fits);
    EXPECT_EQ(m_state.modulePath(), fits);
    m_state.exit();

    enter(tooLong);
    EXPECT_STREQ(m_state.modulePath(), "");
    EXPECT_EQ(m_state.moduleHandle(), tooLong.data());
}
