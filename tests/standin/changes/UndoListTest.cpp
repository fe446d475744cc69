// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/changes/UndoList.h"

#include <gtest/gtest.h>

#include <cstdint>

namespace standin::tests {

TEST(UndoList, StandsAtZeroBeforeItsFirstEntry)
{
    UndoList list;
    EXPECT_EQ(list.state(), 0U);
    list.add(u"A", {});
    EXPECT_NE(list.state(), 0U);
    list.undo();
    EXPECT_EQ(list.state(), 0U);
}

TEST(UndoList, StandsAtTheSameNumberWhereTheSameEntriesAreDone)
{
    UndoList list;
    list.add(u"A", {});
    const std::uint64_t a = list.state();
    list.add(u"B", {});
    const std::uint64_t b = list.state();
    EXPECT_NE(a, b);
    list.undo();
    EXPECT_EQ(list.state(), a);
    list.redo();
    EXPECT_EQ(list.state(), b);
}

TEST(UndoList, NeverStandsAgainAtTheNumberOfAnEntryThatWasDropped)
{
    UndoList list;
    list.add(u"A", {});
    const std::uint64_t a = list.state();
    list.undo();
    list.add(u"A", {});
    const std::uint64_t again = list.state();
    EXPECT_NE(again, a);
    list.clear();
    EXPECT_EQ(list.state(), 0U);
    list.add(u"A", {});
    EXPECT_NE(list.state(), a);
    EXPECT_NE(list.state(), again);
}

} // namespace standin::tests
