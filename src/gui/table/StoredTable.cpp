// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/StoredTable.h"

#include "core/model/DataModel.h"
#include "util/Result.h"

namespace cadrel::gui {

using core::PropertyKey;
using core::Variant;
using util::Result;

StoredTable::StoredTable(core::DataModel& model, std::int32_t listKind) : m_model(model)
{
    switch (listKind) {
    case core::ListKind::Old:
        m_sortColumn = PropertyKey::OldTableSortColumn;
        m_sortForwards = PropertyKey::OldTableSortForward;
        m_selection = PropertyKey::OldTableSelection;
        break;
    case core::ListKind::New:
        m_sortColumn = PropertyKey::NewTableSortColumn;
        m_sortForwards = PropertyKey::NewTableSortForward;
        m_selection = PropertyKey::NewTableSelection;
        break;
    case core::ListKind::Change:
        m_sortColumn = PropertyKey::ChangeTableSortColumn;
        m_sortForwards = PropertyKey::ChangeTableSortForward;
        m_selection = PropertyKey::ChangeTableSelection;
        break;
    default:
        throw Result::InvalidArgument;
    }
}

std::optional<SortKey> StoredTable::sortKey() const
{
    Variant column;
    Variant forwards;
    if (m_model.getProperty(m_sortColumn, column) != Result::Ok ||
        m_model.getProperty(m_sortForwards, forwards) != Result::Ok)
        return std::nullopt;
    return SortKey{shownSortColumn(column.toInt()), forwards.toBool()};
}

void StoredTable::setSortKey(const SortKey& key)
{
    m_model.setProperty(m_sortColumn, Variant(key.column));
    m_model.setProperty(m_sortForwards, Variant(key.forwards));
}

RowSet StoredTable::selection(int rowCount) const
{
    Variant rows;
    m_model.getProperty(m_selection, rows);
    return RowSet::parse(rows.toText(), rowCount);
}

void StoredTable::setSelection(const RowSet& rows)
{
    m_model.setProperty(m_selection, Variant(rows.toText()));
}

} // namespace cadrel::gui
