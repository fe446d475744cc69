// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Timecode.h"

#include <cstddef>
#include <map>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

namespace cadrel::core {
class MediaPoolInterface;
class VideoList;
} // namespace cadrel::core

namespace cadrel::gui {

/// The columns of the table of the new videos, by their ids.
struct VideoColumn {
    enum Id : int { Name = 1, Use = 2, Start = 3, End = 4, Length = 5 };

    int id;
    const wchar_t* header; ///< not translated
    int width;             ///< in pixels, also the smallest
    int maximumWidth;

    /// In the order of the table.
    static const std::vector<VideoColumn>& all();
};

/// The rows of the table of the new videos: each video of the media pool, with its place in the list of the new videos, or with
/// a place that is proposed for it. A video of the list that isn't in the pool any more has a row, too, until it is used no
/// longer. A video is known by its path. The rows are always in their order.
class VideoRows {
public:
    struct Row {
        std::string path;
        std::string name; ///< that it has in the pool, or that of its file
        core::Timecode start;
        core::Timecode length;
        core::Timecode end; ///< the last timecode of the day for a video that goes on beyond it
        bool isUsed = false;
        bool isMissing = false; ///< from the pool
    };

    /// Neither is owned. It has no rows before `refill`, and none without a pool.
    VideoRows(core::VideoList& list, core::MediaPoolInterface* pool) : m_list(list), m_pool(pool) {}

    void setMediaPool(core::MediaPoolInterface* pool) { m_pool = pool; }
    /// Where the project's clock begins, in seconds. A time outside of the day counts as zero.
    void setTimeOrigin(double seconds) { m_timeOrigin = seconds; }
    /// Reads pool and list anew. A video that isn't used has the start that the user has given it since it was used last; else
    /// the end of the last one that is used, or the time origin where there is none. A video that the pool can't tell the path
    /// or the length of has no row.
    void refill();

    std::size_t count() const { return m_rows.size(); }
    /// Throws Result::InvalidArgument at or past the count.
    const Row& at(std::size_t row) const;
    std::optional<std::size_t> find(const std::string& path) const;
    /// What the table paints in a cell. Nothing for the columns Use and Start, which are inputs.
    std::wstring text(std::size_t row, int column) const;

    /// With `forwards` values fall. Rows with the same value rise by name, as all do for Use and End, which have none to sort by. A
    /// number that is no column stands for Start. It starts as Name, rising.
    void sort(int column, bool forwards);

    /// These two are entries of the undo list where they change the list, and leave the rows as they are: `refill` comes after
    /// them. A path without a row does nothing. They throw Result::PositionOccupied where another video that is used has the
    /// start, and what the undo list throws, with everything as it was.
    void setStart(const std::string& path, const core::Timecode& start);
    void setUsed(const std::string& path, bool isUsed);

private:
    class UsedVideos;

    std::optional<Row> readRow(std::size_t index, const core::Timecode& proposal, UsedVideos& used) const;
    core::Timecode proposedStart() const;
    void sortRows();

    core::VideoList& m_list;
    core::MediaPoolInterface* m_pool;
    std::vector<Row> m_rows;
    std::unordered_map<std::string, std::size_t> m_rowOf; ///< by path
    double m_timeOrigin = 0.0;
    std::map<std::string, core::Timecode> m_givenStarts; ///< by path, of videos that aren't used
    int m_sortColumn = VideoColumn::Name;
    bool m_sortForwards = false;
};

} // namespace cadrel::gui
