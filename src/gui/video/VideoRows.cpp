// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/video/VideoRows.h"

#include "core/model/DataModelCommandCreator.h"
#include "core/model/MediaPoolInterface.h"
#include "core/model/VideoList.h"
#include "gui/look/ShownText.h"
#include "util/FilledText.h"
#include "util/Result.h"
#include "util/StringUtil.h"
#include "util/Utf8Text.h"

#include <algorithm>
#include <cstdint>
#include <limits>
#include <tuple>
#include <unordered_set>
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

/// The list of the new videos, in which many are looked for as VideoList::find does.
class VideoRows::UsedVideos {
public:
    explicit UsedVideos(const VideoList& list) : m_list(list)
    {
        for (const Entry& entry : list.entries()) {
            m_byPath.try_emplace(entry.path, &entry);
            if (const auto name = fileNameOf(entry))
                m_byFileName.try_emplace(*name, &entry);
        }
    }

    /// Null for a video that isn't used. Throws what the string converter throws for a path that is no text.
    const Entry* take(const std::string& path)
    {
        const Entry* entry = findIn(m_byPath, path);
        if (!entry)
            entry = findIn(m_byFileName, StringUtil::fileNameOf(StringUtil::toWide(path)));
        if (entry)
            m_taken.insert(entry);
        return entry;
    }
    /// The rows of those that nobody has taken.
    std::vector<Row> missingRows() const
    {
        std::vector<Row> rows;
        for (const Entry& entry : m_list.entries()) {
            if (std::optional<Row> row = m_taken.contains(&entry) ? std::nullopt : missingRow(entry))
                rows.push_back(std::move(*row));
        }
        return rows;
    }

private:
    /// Nothing without a project.
    static std::optional<Row> missingRow(const Entry& entry)
    {
        try {
            const auto name = fileNameOf(entry);
            return Row{entry.path,
                       name && !name->empty() ? StringUtil::toUtf8(*name) : entry.path,
                       entry.start,
                       entry.length,
                       shownEnd(entry.start, entry.length),
                       true,
                       true};
        } catch (Result::Type) {
            return std::nullopt;
        }
    }
    /// A stored path may be no text.
    static std::optional<std::wstring> fileNameOf(const Entry& entry)
    {
        try {
            return entry.fileName();
        } catch (Result::Type) {
            return std::nullopt;
        }
    }
    template <class Map>
    static const Entry* findIn(const Map& map, const typename Map::key_type& key)
    {
        const auto found = map.find(key);
        return found == map.end() ? nullptr : found->second;
    }

    const VideoList& m_list;
    std::unordered_map<std::string, const Entry*> m_byPath;
    std::unordered_map<std::wstring, const Entry*> m_byFileName;
    std::unordered_set<const Entry*> m_taken;
};

void VideoRows::refill()
{
    std::vector<Row> rows;
    if (m_pool) {
        UsedVideos used(m_list);
        const Timecode proposal = proposedStart();
        const std::size_t videos = m_pool->count();
        for (std::size_t index = 0; index < videos; ++index) {
            if (std::optional<Row> row = readRow(index, proposal, used))
                rows.push_back(std::move(*row));
        }
        for (Row& row : used.missingRows())
            rows.push_back(std::move(row));
    }
    std::unordered_set<std::string> paths;
    std::erase_if(rows, [&paths](const Row& row) { return !paths.insert(row.path).second; });
    m_rows = std::move(rows);
    sortRows();
}

std::optional<VideoRows::Row> VideoRows::readRow(std::size_t index, const Timecode& proposal, UsedVideos& used) const
{
    try {
        Row row;
        row.path = StringUtil::toUtf8(m_pool->getPath(index));
        row.name = StringUtil::toUtf8(m_pool->getName(index));
        row.length = lengthOf(m_pool->getFrameCount(index));
        if (row.path.empty())
            return std::nullopt;
        if (const Entry* const entry = used.take(row.path)) {
            row.isUsed = true;
            row.start = entry->start;
        } else {
            const auto given = m_givenStarts.find(row.path);
            row.start = given == m_givenStarts.end() ? proposal : given->second;
        }
        row.end = shownEnd(row.start, row.length);
        return row;
    } catch (Result::Type) {
        return std::nullopt;
    }
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
    const auto found = m_rowOf.find(path);
    return found == m_rowOf.end() ? std::nullopt : std::optional(found->second);
}

std::wstring VideoRows::text(std::size_t row, int column) const
{
    const Row& video = at(row);
    switch (column) {
    case VideoColumn::Name:
        return video.isMissing ? util::filled(translated(L"Missing: %s"), util::toShownLine(video.name))
                               : util::toShownLine(video.name);
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
    m_rowOf.clear();
    for (std::size_t row = 0; row < m_rows.size(); ++row)
        m_rowOf.emplace(m_rows[row].path, row);
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
