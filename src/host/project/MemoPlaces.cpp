// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/MemoPlaces.h"

#include "host/track/Instant.h"

#include <algorithm>
#include <numeric>

using cadrel::core::SecondsRange;

namespace cadrel::host {

namespace {

std::vector<std::size_t> sorted(const std::vector<SecondsRange>& stretches)
{
    std::vector<std::size_t> order(stretches.size());
    std::iota(order.begin(), order.end(), std::size_t{0});
    std::ranges::sort(order, {}, [&](std::size_t at) { return stretches[at].start; });
    return order;
}

HighestNumber preferences(const std::vector<std::size_t>& order)
{
    std::vector<double> preferences;
    for (const std::size_t at : order)
        preferences.push_back(-static_cast<double>(at));
    return HighestNumber(preferences);
}

void prefer(std::optional<std::size_t>& found, double preference)
{
    if (preference == HighestNumber::None)
        return;
    const auto at = static_cast<std::size_t>(-preference);
    found = std::min(found.value_or(at), at);
}

} // namespace

bool reachesInto(const SecondsRange& memo, const SecondsRange& range)
{
    return isBefore(memo.start, range.end) && isBefore(range.start, memo.end);
}

bool liesIn(const SecondsRange& memo, const SecondsRange& range)
{
    return countsAsIn(memo, range) && isBefore(memo.start, range.end);
}

MemoPlaces::MemoPlaces(const std::vector<SecondsRange>& stretches)
    : m_order(sorted(stretches)), m_stretches(stretches), m_preference(preferences(m_order))
{
}

MemoPlaces::Belongs MemoPlaces::find(const SecondsRange& memo) const
{
    const auto first = static_cast<std::size_t>(
        std::ranges::partition_point(m_order,
                                     [&](std::size_t at) { return isBefore(m_stretches[at].end, memo.start); }) -
        m_order.begin());
    const auto last = static_cast<std::size_t>(
        std::ranges::partition_point(m_order,
                                     [&](std::size_t at) { return !isBefore(memo.end, m_stretches[at].start); }) -
        m_order.begin());
    Belongs found;
    // Between those at its ends, it sticks out of each on both sides.
    constexpr std::size_t Ends = 3;
    const std::size_t middle = std::min(first + Ends, last);
    const std::size_t middleEnd = std::max(middle, last - std::min(last, Ends));
    for (std::size_t index = first; index < middle; ++index)
        look(memo, index, found);
    for (std::size_t index = middleEnd; index < last; ++index)
        look(memo, index, found);
    prefer(found.touched, m_preference.among(middle, middleEnd));
    const auto from = [this](std::size_t index) { return m_order.begin() + static_cast<std::ptrdiff_t>(index); };
    const auto most = std::partition_point(from(middle), from(middleEnd),
                                           [&](std::size_t at) { return !liesIn(memo, m_stretches[at]); });
    prefer(found.inside, m_preference.among(static_cast<std::size_t>(most - m_order.begin()), middleEnd));
    return found;
}

void MemoPlaces::look(const SecondsRange& memo, std::size_t index, Belongs& found) const
{
    const std::size_t at = m_order[index];
    if (liesIn(memo, m_stretches[at]))
        found.inside = std::min(found.inside.value_or(at), at);
    if (reachesInto(memo, m_stretches[at]))
        found.touched = std::min(found.touched.value_or(at), at);
}

} // namespace cadrel::host
