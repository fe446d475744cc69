// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/StoredTable.h"

#include "core/model/DataModel.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <cmath>

using cadrel::core::DataModel;
using cadrel::core::ListKind;
using cadrel::core::PropertyKey;
using cadrel::core::Variant;
using cadrel::gui::EventColumn;
using cadrel::gui::RowSet;
using cadrel::gui::SortKey;
using cadrel::gui::StoredTable;

namespace {

class StoredTableTest : public testing::Test {
protected:
    Variant property(int key) const
    {
        Variant value;
        m_model.getProperty(key, value);
        return value;
    }

    cadrel::tests::TestProject m_project;
    DataModel m_model;
};

} // namespace

TEST_F(StoredTableTest, HasNothingAtFirst)
{
    const StoredTable stored(m_model, ListKind::Old);
    EXPECT_EQ(stored.sortKey(), std::nullopt);
    EXPECT_TRUE(stored.selection(100).isEmpty());
}

TEST_F(StoredTableTest, KeepsTheSortKeyOfEachListUnderItsOwnKeys)
{
    StoredTable(m_model, ListKind::Old).setSortKey({EventColumn::Roll, true});
    StoredTable(m_model, ListKind::New).setSortKey({EventColumn::DstOut, false});
    StoredTable(m_model, ListKind::Change).setSortKey({EventColumn::State, true});

    EXPECT_EQ(property(10006).toInt(), 3);
    EXPECT_TRUE(property(10007).toBool());
    EXPECT_EQ(property(10008).toInt(), 10);
    EXPECT_FALSE(property(10009).toBool());
    EXPECT_EQ(property(10009).valueType(), Variant::Bool);
    EXPECT_EQ(property(10010).toInt(), 1);
    EXPECT_EQ(property(10010).valueType(), Variant::Integer);
    EXPECT_TRUE(property(10011).toBool());
    EXPECT_EQ(StoredTable(m_model, ListKind::New).sortKey(), (SortKey{EventColumn::DstOut, false}));
    EXPECT_EQ(StoredTable(m_model, ListKind::Change).sortKey(), (SortKey{EventColumn::State, true}));
}

TEST_F(StoredTableTest, NeedsBothTheColumnAndTheDirection)
{
    m_model.setProperty(PropertyKey::OldTableSortColumn, Variant(3));
    EXPECT_EQ(StoredTable(m_model, ListKind::Old).sortKey(), std::nullopt);
    m_model.setProperty(PropertyKey::OldTableSortForward, Variant(false));
    EXPECT_EQ(StoredTable(m_model, ListKind::Old).sortKey(), (SortKey{3, false}));
}

TEST_F(StoredTableTest, ReadsAColumnThatIsNoneAsTheEventNumbers)
{
    m_model.setProperty(PropertyKey::OldTableSortForward, Variant(true));
    for (const double column : {0.0, 11.0, -1.0, 1e300, std::nan("")}) {
        m_model.setProperty(PropertyKey::OldTableSortColumn, Variant(column));
        EXPECT_EQ(StoredTable(m_model, ListKind::Old).sortKey(), (SortKey{EventColumn::Number, true})) << column;
    }
}

TEST_F(StoredTableTest, KeepsTheSelectionOfEachListUnderItsOwnKey)
{
    RowSet rows;
    rows.append(0, 2);
    rows.append(5);
    StoredTable(m_model, ListKind::Old).setSelection(rows);
    StoredTable(m_model, ListKind::New).setSelection({});
    RowSet last;
    last.append(7);
    StoredTable(m_model, ListKind::Change).setSelection(last);

    EXPECT_EQ(property(10017).toText(), "0;1;5");
    EXPECT_EQ(property(10018).toText(), "");
    EXPECT_EQ(property(10018).valueType(), Variant::String);
    EXPECT_EQ(property(10019).toText(), "7");
    EXPECT_EQ(StoredTable(m_model, ListKind::Old).selection(6), rows);
    EXPECT_EQ(StoredTable(m_model, ListKind::Change).selection(8), last);
    EXPECT_TRUE(StoredTable(m_model, ListKind::Change).selection(7).isEmpty());
}

TEST_F(StoredTableTest, ReadsASelectionThatIsNoTextAsNone)
{
    m_model.setProperty(PropertyKey::OldTableSelection, Variant(3));
    EXPECT_TRUE(StoredTable(m_model, ListKind::Old).selection(10).isEmpty());
}

TEST_F(StoredTableTest, ThereIsNoneForAnyOtherList)
{
    for (const int kind : {-1, 3})
        EXPECT_EQ(cadrel::tests::thrownBy([&] { StoredTable(m_model, kind); }), cadrel::util::Result::InvalidArgument);
}
