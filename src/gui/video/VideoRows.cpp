// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/video/VideoRows.h"

#include "core/model/DataModelCommandCreator.h"
#include "core/model/MediaPoolInterface.h"
#include "core/model/VideoList.h"
#include "gui/look/ShownText.h"
#include "util/Result.h"
#include "util/StringUtil.h"
#include "util/Utf8Text.h"

#include <algorithm>
#include <cstdint>
#include <limits>
#include <set>
#include <tuple>
#include <utility>

namespace cadrel::gui {

using core::Timecode;
using core::VideoList;
using util::Result;
using util::StringUtil;
using Entry = VideoList::Entry;

namespace {

/// The last timecode of the day for a length that goes beyond it.
Timecode lengthOf(std::uint32_t frames)
{
    constexpr auto Most = static_cast<std::uint32_t>(std::numeric_limits<std::int32_t>::max());
    const auto count = static_cast<std::int32_t>(std::min(frames, Most));
    return Timecode::isValidFrameCount(count) ? Timecode(count) : Timecode::maxTimecode();
}

std::optional<Timecode> endOf(const Timecode& start, const Timecode& length)
{
    try {
        return start + length;
    } catch (Result::Type) {
        return std::nullopt;
    }
}

/// Zero for a time that the day doesn't have.
Timecode timeOfDay(double seconds)
try {
    return seconds >= 0.0 && Timecode::isValidSeconds(seconds) ? Timecode(seconds) : Timecode::minTimecode();
} catch (Result::Type) {
    return Timecode::minTimecode();
}

Timecode shownEnd(const Timecode& start, const Timecode& length)
{
    return endOf(start, length).value_or(Timecode::maxTimecode());
}

/// Below zero when `a` comes first, above when `b` does.
int compare(const VideoRows::Row& a, const VideoRows::Row& b, int column)
{
    const auto compareTimes = [](const Timecode& left, const Timecode& right) {
        return left < right ? -1 : right < left ? 1 : 0;
    };
    switch (column) {
    case VideoColumn::Name:
        return a.name.compare(b.name);
    case VideoColumn::Start:
        return compareTimes(a.start, b.start);
    case VideoColumn::Length:
        return compareTimes(a.length, b.length);
    default:
        return 0;
    }
}

} // namespace

const std::vector<VideoColumn>& VideoColumn::all()
{
    static const std::vector<VideoColumn> columns{
        {Name, L"Name", 380, 800}, {Use, L"Use as New Video", 180, 180}, {Start, L"Start", 100, 100},
        {End, L"End", 100, 100},   {Length, L"Length", 100, 100},
    };
    return columns;
}

void VideoRows::refill()
{
    std::vector<Row> rows;
    std::set<std::string> paths;
    const Timecode proposal = proposedStart();
    const std::size_t videos = m_pool ? m_pool->count() : 0;
    for (std::size_t index = 0; index < videos; ++index) {
        std::optional<Row> row = readRow(index, proposal);
        if (row && paths.insert(row->path).second)
            rows.push_back(std::move(*row));
    }
    m_rows = std::move(rows);
    sortRows();
}

std::optional<VideoRows::Row> VideoRows::readRow(std::size_t index, const Timecode& proposal) const
{
    try {
        Row row;
        row.path = StringUtil::toUtf8(m_pool->getPath(index));
        row.name = StringUtil::toUtf8(m_pool->getName(index));
        row.length = lengthOf(m_pool->getFrameCount(index));
        if (row.path.empty())
            return std::nullopt;
        place(row, proposal);
        return row;
    } catch (Result::Type) {
        return std::nullopt;
    }
}

void VideoRows::place(Row& row, const Timecode& proposal) const
{
    const auto used = m_list.find(row.path);
    row.isUsed = used != m_list.entries().end();
    if (row.isUsed) {
        row.start = used->start;
    } else {
        const auto given = m_givenStarts.find(row.path);
        row.start = given == m_givenStarts.end() ? proposal : given->second;
    }
    row.end = shownEnd(row.start, row.length);
}

Timecode VideoRows::proposedStart() const
{
    const Timecode origin = timeOfDay(m_timeOrigin);
    if (m_list.isEmpty())
        return origin;
    const Entry& last = *m_list.entries().rbegin();
    return endOf(last.start, last.length).value_or(origin);
}

const VideoRows::Row& VideoRows::at(std::size_t row) const
{
    if (row >= m_rows.size())
        throw Result::InvalidArgument;
    return m_rows[row];
}

std::optional<std::size_t> VideoRows::find(const std::string& path) const
{
    const auto found = std::find_if(m_rows.begin(), m_rows.end(), [&](const Row& row) { return row.path == path; });
    if (found == m_rows.end())
        return std::nullopt;
    return static_cast<std::size_t>(found - m_rows.begin());
}

std::wstring VideoRows::text(std::size_t row, int column) const
{
    const Row& video = at(row);
    switch (column) {
    case VideoColumn::Name:
        return util::toShownLine(video.name);
    case VideoColumn::End:
        return util::toShownLine(video.end.toString());
    case VideoColumn::Length:
        return util::toShownLine(video.length.toString());
    default:
        return {};
    }
}

void VideoRows::sort(int column, bool forwards)
{
    const bool isColumn = column >= VideoColumn::Name && column <= VideoColumn::Length;
    m_sortColumn = isColumn ? column : VideoColumn::Start;
    m_sortForwards = forwards;
    sortRows();
}

void VideoRows::sortRows()
{
    std::sort(m_rows.begin(), m_rows.end(), [this](const Row& a, const Row& b) {
        if (const int order = compare(a, b, m_sortColumn); order != 0)
            return m_sortForwards ? order > 0 : order < 0;
        return std::tie(a.name, a.path) < std::tie(b.name, b.path);
    });
}

void VideoRows::setStart(const std::string& path, const Timecode& start)
{
    const std::optional<std::size_t> row = find(path);
    if (!row)
        return;
    const auto used = m_list.find(path);
    if (used == m_list.entries().end()) {
        m_givenStarts.insert_or_assign(path, start);
        return;
    }
    if (used->start == start)
        return;
    if (m_list.checkAdd(Entry(path, start, at(*row).length)) == Result::PositionOccupied)
        throw Result::PositionOccupied;
    const auto command = core::createDataModelCommand(translated(L"Move New Video"));
    m_list.setStart(path, start);
}

void VideoRows::setUsed(const std::string& path, bool isUsed)
{
    const std::optional<std::size_t> row = find(path);
    if (!row || m_list.containsFile(path) == isUsed)
        return;
    if (!isUsed) {
        const auto command = core::createDataModelCommand(translated(L"Remove New Video"));
        m_list.remove(path);
        return;
    }
    // The rows may be others when the listeners of the list have been told.
    const Entry entry(path, at(*row).start, at(*row).length);
    if (m_list.checkAdd(entry) == Result::PositionOccupied)
        throw Result::PositionOccupied;
    const auto command = core::createDataModelCommand(translated(L"Add New Video"));
    m_givenStarts.erase(path);
    m_list.add(entry, false);
}

} // namespace cadrel::gui
