// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/PlacedMemos.h"

#include "host/track/Track.h"

namespace cadrel::host {

std::vector<PlacedMemo> PlacedMemos::read(const Track& track)
{
    std::vector<PlacedMemo> memos;
    for (HostEvent& event : track.clipEvents()) {
        const core::SecondsRange span{event.getStart(), event.getEnd()};
        const std::int64_t id = event.getUserId();
        memos.push_back({std::move(event), span, id});
    }
    std::ranges::stable_sort(memos, {}, [](const PlacedMemo& memo) { return memo.span.start; });
    return memos;
}

HighestNumber PlacedMemos::endsOf(const std::vector<PlacedMemo>& memos)
{
    std::vector<double> ends;
    for (const PlacedMemo& memo : memos)
        ends.push_back(memo.span.end);
    return HighestNumber(ends);
}

MemosById::MemosById(std::vector<PlacedMemo> memos)
{
    for (PlacedMemo& memo : memos) {
        m_indexes.emplace(memo.id, m_memos.size());
        m_memos.emplace_back(std::move(memo));
    }
}

std::optional<PlacedMemo> MemosById::take(std::int64_t id)
{
    const auto found = m_indexes.lower_bound({id, 0});
    if (found == m_indexes.end() || found->first != id)
        return std::nullopt;
    std::optional<PlacedMemo> memo = std::exchange(m_memos[found->second], std::nullopt);
    m_indexes.erase(found);
    return memo;
}

std::vector<PlacedMemo> MemosById::rest() const
{
    std::vector<PlacedMemo> memos;
    for (const std::optional<PlacedMemo>& memo : m_memos) {
        if (memo)
            memos.push_back(*memo);
    }
    return memos;
}

} // namespace cadrel::host
