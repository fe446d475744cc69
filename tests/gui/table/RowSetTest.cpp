// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/RowSet.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <set>
#include <string>
#include <vector>

using cadrel::gui::RowSet;

namespace {

RowSet rowsOf(const std::vector<int>& ascending)
{
    RowSet rows;
    for (const int row : ascending)
        rows.append(row);
    return rows;
}

std::vector<int> listOf(const RowSet& rows)
{
    std::vector<int> list;
    rows.forEach([&](int row) { list.push_back(row); });
    return list;
}

} // namespace

TEST(RowSet, JoinsNeighboursToOneRange)
{
    const RowSet rows = rowsOf({0, 1, 2, 5, 6, 9});
    EXPECT_EQ(rows.ranges(), (std::vector<RowSet::Range>{{0, 3}, {5, 7}, {9, 10}}));
    EXPECT_EQ(rows.count(), 6U);
}

TEST(RowSet, AppendsNothingOfAnEmptyRange)
{
    RowSet rows;
    rows.append(4, 4);
    rows.append(4, 3);
    EXPECT_TRUE(rows.isEmpty());
}

TEST(RowSet, AppendsOnlyWhatComesAfterItsLastRow)
{
    RowSet rows;
    rows.append(5, 8);
    rows.append(1, 3);
    rows.append(4, 8);
    EXPECT_EQ(rows.ranges(), (std::vector<RowSet::Range>{{5, 8}}));
    rows.append(7, 9);
    rows.append(2, 12);
    EXPECT_EQ(rows.ranges(), (std::vector<RowSet::Range>{{5, 12}}));
    rows.append(13, 14);
    EXPECT_EQ(rows.ranges(), (std::vector<RowSet::Range>{{5, 12}, {13, 14}}));
}

TEST(RowSet, ContainsTheRowsOfItsRanges)
{
    const RowSet rows = rowsOf({3, 4, 8});
    for (const int row : {3, 4, 8})
        EXPECT_TRUE(rows.contains(row)) << row;
    for (const int row : {-1, 0, 2, 5, 7, 9})
        EXPECT_FALSE(rows.contains(row)) << row;
    EXPECT_FALSE(RowSet().contains(0));
}

TEST(RowSet, IsStoredAsNumbersWithSemicolonsBetween)
{
    EXPECT_EQ(RowSet().toText(), "");
    EXPECT_EQ(rowsOf({7}).toText(), "7");
    EXPECT_EQ(rowsOf({0, 1, 12}).toText(), "0;1;12");
}

TEST(RowSet, ReadsWhatItStores)
{
    EXPECT_EQ(RowSet::parse("0;1;12", 13), rowsOf({0, 1, 12}));
    EXPECT_EQ(RowSet::parse("", 13), RowSet());
}

TEST(RowSet, ReadsRowsBelowTheCountAlone)
{
    EXPECT_EQ(listOf(RowSet::parse("0;1;2;3", 2)), (std::vector{0, 1}));
    EXPECT_EQ(listOf(RowSet::parse("-1;0;99999999999999999999;2147483647;-2147483648", 2)), (std::vector{0}));
    EXPECT_TRUE(RowSet::parse("0", 0).isEmpty());
    EXPECT_TRUE(RowSet::parse("0", -1).isEmpty());
}

TEST(RowSet, ReadsNumbersInAnyOrderAndMoreThanOnce)
{
    EXPECT_EQ(listOf(RowSet::parse("3;1;3;2;1", 5)), (std::vector{1, 2, 3}));
}

TEST(RowSet, LeavesOutWhatIsNoNumber)
{
    EXPECT_EQ(listOf(RowSet::parse(";;x;1x;0x2; 3 ;1.5;+4;;", 9)), (std::vector{3}));
}

TEST(RowSet, ReadsALongTextInAShortTime)
{
    std::string text;
    for (int count = 0; count < 1000000; ++count)
        text += "5;";
    EXPECT_EQ(listOf(RowSet::parse(text, 6)), (std::vector{5}));
}

RC_GTEST_PROP(RowSetLaw, AnyRowsSurviveBeingStored, (const std::set<unsigned short>& numbers))
{
    const RowSet rows = rowsOf({numbers.begin(), numbers.end()});

    RC_ASSERT(RowSet::parse(rows.toText(), 65536) == rows);
    RC_ASSERT(rows.count() == numbers.size());
    RC_ASSERT(listOf(rows) == std::vector<int>(numbers.begin(), numbers.end()));
}

RC_GTEST_PROP(RowSetLaw, AnyTextGivesRowsBelowTheCount, (const std::string& text))
{
    const int rowCount = *rc::gen::inRange(0, 20);
    for (const int row : listOf(RowSet::parse(text, rowCount)))
        RC_ASSERT(row >= 0 && row < rowCount);
}
