// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/RowSet.h"

#include "util/StringUtil.h"

#include <algorithm>
#include <charconv>
#include <optional>

namespace cadrel::gui {

namespace {

constexpr char Separator = ';';

std::optional<int> rowOf(std::string_view text)
{
    text = util::StringUtil::trimView(text);
    int row = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), row);
    if (error != std::errc() || end != text.data() + text.size())
        return std::nullopt;
    return row;
}

} // namespace

RowSet RowSet::parse(std::string_view text, int rowCount)
{
    std::vector<bool> isIn(static_cast<std::size_t>(std::max(rowCount, 0)));
    while (!text.empty()) {
        const std::string_view piece = text.substr(0, text.find(Separator));
        text.remove_prefix(std::min(piece.size() + 1, text.size()));
        if (const std::optional<int> row = rowOf(piece); row && *row >= 0 && *row < rowCount)
            isIn[static_cast<std::size_t>(*row)] = true;
    }
    RowSet rows;
    for (int row = 0; row < rowCount; ++row) {
        if (isIn[static_cast<std::size_t>(row)])
            rows.append(row);
    }
    return rows;
}

std::string RowSet::toText() const
{
    std::string text;
    forEach([&](int row) {
        if (!text.empty())
            text += Separator;
        text += std::to_string(row);
    });
    return text;
}

void RowSet::append(int first, int end)
{
    if (!m_ranges.empty())
        first = std::max(first, m_ranges.back().end);
    if (first >= end)
        return;
    if (!m_ranges.empty() && m_ranges.back().end == first)
        m_ranges.back().end = end;
    else
        m_ranges.push_back({first, end});
}

std::size_t RowSet::count() const
{
    std::size_t count = 0;
    for (const Range& range : m_ranges)
        count += static_cast<std::size_t>(range.end - range.first);
    return count;
}

bool RowSet::contains(int row) const
{
    const auto after =
        std::partition_point(m_ranges.begin(), m_ranges.end(), [row](const Range& range) { return range.end <= row; });
    return after != m_ranges.end() && after->first <= row;
}

} // namespace cadrel::gui
