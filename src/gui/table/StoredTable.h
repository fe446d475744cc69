// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/table/EventSort.h"
#include "gui/table/RowSet.h"

#include <cstdint>
#include <optional>

namespace cadrel::core {
class DataModel;
} // namespace cadrel::core

namespace cadrel::gui {

/// What the data model keeps of one of the three tables: by what it is sorted and which rows are selected. Read it only when a
/// model comes, and write it after every change of either.
class StoredTable {
public:
    /// Throws Result::InvalidArgument for a number that is no ListKind.
    StoredTable(core::DataModel& model, std::int32_t listKind);

    /// Nothing when it isn't stored. The column exists, whatever the project holds.
    std::optional<SortKey> sortKey() const;
    void setSortKey(const SortKey& key);
    /// Rows below `rowCount`.
    RowSet selection(int rowCount) const;
    void setSelection(const RowSet& rows);

private:
    core::DataModel& m_model;
    std::int32_t m_sortColumn;
    std::int32_t m_sortForwards;
    std::int32_t m_selection;
};

} // namespace cadrel::gui
