// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/PlacedMemos.h"

#include "host/track/Track.h"

#include <iterator>
#include <utility>

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

MemosById::MemosById(std::vector<PlacedMemo> memos, const core::SecondsRange& range)
{
    for (PlacedMemo& memo : memos) {
        m_indexes.emplace(memo.id, std::clamp(memo.span.start, range.start, range.end), m_memos.size());
        m_memos.emplace_back(std::move(memo));
    }
}

std::optional<PlacedMemo> MemosById::take(std::int64_t id, double start)
{
    if (id < 0)
        return std::nullopt;
    const auto isOfId = [&](auto place) { return place != m_indexes.end() && std::get<0>(*place) == id; };
    auto nearest = m_indexes.lower_bound({id, start, 0});
    const auto before = nearest != m_indexes.begin() ? std::prev(nearest) : m_indexes.end();
    if (isOfId(before) && (!isOfId(nearest) || start - std::get<1>(*before) < std::get<1>(*nearest) - start))
        nearest = before;
    if (!isOfId(nearest))
        return std::nullopt;
    const std::size_t index = std::get<2>(*nearest);
    m_indexes.erase(nearest);
    return std::exchange(m_memos[index], std::nullopt);
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
