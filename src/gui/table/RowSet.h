// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::gui {

/// A set of rows of a table, kept as ranges: all rows of a long table are one range.
class RowSet {
public:
    /// From `first` to the row before `end`.
    struct Range {
        int first;
        int end;

        bool operator==(const Range&) const = default;
    };

    RowSet() = default;
    /// Reads row numbers joined with ";", as they are stored. Leaves out what is no number of a row below `rowCount`.
    static RowSet parse(std::string_view text, int rowCount);
    /// The row numbers in ascending order, joined with ";".
    std::string toText() const;

    /// Appends the rows from `first` to the one before `end`. Those that do not come after the last row are left out.
    void append(int first, int end);
    void append(int row) { append(row, row + 1); }

    bool isEmpty() const { return m_ranges.empty(); }
    std::size_t count() const;
    bool contains(int row) const;
    /// Ascending; there is a gap between any two.
    const std::vector<Range>& ranges() const { return m_ranges; }
    /// Calls `action` with each row, in ascending order.
    template <class Action>
    void forEach(Action&& action) const
    {
        for (const Range& range : m_ranges) {
            for (int row = range.first; row < range.end; ++row)
                action(row);
        }
    }

    bool operator==(const RowSet&) const = default;

private:
    std::vector<Range> m_ranges;
};

} // namespace cadrel::gui
