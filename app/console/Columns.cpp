// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/Columns.h"

#include "app/console/Printable.h"

#include <algorithm>

namespace cadrel::app {

Columns::Columns(const Row& titles, const std::vector<std::size_t>& rightAligned)
    : m_titles(titles), m_columns(titles.size())
{
    for (const std::size_t index : rightAligned)
        m_columns[index].alignsRight = true;
    measure(m_titles);
}

void Columns::measure(const Row& row)
{
    for (std::size_t index = 0; index < m_columns.size(); ++index)
        m_columns[index].width = std::max(m_columns[index].width, displayWidth(row[index]));
}

std::string Columns::lineOf(const Row& row) const
{
    std::string line;
    for (std::size_t index = 0; index < m_columns.size(); ++index) {
        const std::size_t width = displayWidth(row[index]);
        const std::string fill(std::max(m_columns[index].width, width) - width, ' ');
        line += index == 0 ? "" : "  ";
        line += m_columns[index].alignsRight ? fill + row[index] : row[index] + fill;
    }
    line.erase(line.find_last_not_of(' ') + 1);
    return line;
}

} // namespace cadrel::app
