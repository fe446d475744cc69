// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace cadrel::app {

/// Aligns the cells of rows in columns, with two blanks between them. The cells are printable UTF-8. All rows are
/// measured before the first is written, so that none has to be kept; a cell that wasn't measured may reach further.
class Columns {
public:
    using Row = std::vector<std::string>;

    /// The columns of the set are aligned to the right.
    explicit Columns(const Row& titles, const std::vector<std::size_t>& rightAligned = {});

    void measure(const Row& row);
    /// Without blanks at its end.
    std::string lineOf(const Row& row) const;
    std::string titleLine() const { return lineOf(m_titles); }

private:
    struct Column {
        std::size_t width = 0;
        bool alignsRight = false;
    };

    Row m_titles;
    std::vector<Column> m_columns;
};

} // namespace cadrel::app
