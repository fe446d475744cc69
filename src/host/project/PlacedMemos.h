// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/SecondsRange.h"
#include "host/project/HighestNumber.h"
#include "host/track/HostEvent.h"
#include "host/track/Instant.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <set>
#include <tuple>
#include <vector>

namespace cadrel::host {

class Track;

/// A memo where it stands, in seconds of the project's clock.
struct PlacedMemo {
    HostEvent event;
    core::SecondsRange span;
    std::int64_t id;
};

/// The memos of a track where they stood when they were read, in the order of their starts.
class PlacedMemos {
public:
    explicit PlacedMemos(const Track& track) : m_memos(read(track)), m_ends(endsOf(m_memos)) {}

    const std::vector<PlacedMemo>& all() const { return m_memos; }
    /// Gives those that may have something in a range.
    template <class Visit>
    void visitTouching(const core::SecondsRange& range, const Visit& visit) const
    {
        const auto last = std::ranges::partition_point(
            m_memos, [&range](const PlacedMemo& memo) { return isBefore(memo.span.start, range.end); });
        m_ends.visit(range.start - core::SameInstant, static_cast<std::size_t>(last - m_memos.begin()),
                     [&](std::size_t index) { visit(m_memos[index]); });
    }

private:
    static std::vector<PlacedMemo> read(const Track& track);
    static HighestNumber endsOf(const std::vector<PlacedMemo>& memos);

    std::vector<PlacedMemo> m_memos;
    HighestNumber m_ends;
};

/// Memos of a range in an order, from which those of an id are taken.
class MemosById {
public:
    MemosById(std::vector<PlacedMemo> memos, const core::SecondsRange& range);

    std::size_t size() const { return m_indexes.size(); }
    /// The one of that id of which the part in the range starts nearest to a time; nothing when there is none, and for what has
    /// no id yet.
    std::optional<PlacedMemo> take(std::int64_t id, double start);
    /// Those that are left.
    std::vector<PlacedMemo> rest() const;

private:
    std::vector<std::optional<PlacedMemo>> m_memos;
    std::set<std::tuple<std::int64_t, double, std::size_t>> m_indexes; ///< by id and start
};

} // namespace cadrel::host
