// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/StepStretches.h"

#include <algorithm>
#include <bit>
#include <iterator>
#include <tuple>
#include <utility>

namespace cadrel::core {

void StepStretches::add(const SecondsRange& range, std::size_t step)
{
    m_stretches.push_back({range, step});
}

void StepStretches::sort()
{
    std::sort(m_stretches.begin(), m_stretches.end(), [](const Stretch& a, const Stretch& b) {
        return std::tie(a.range.start, a.range.end, a.step) < std::tie(b.range.start, b.range.end, b.step);
    });
    std::vector<Stretch> apart;
    for (Stretch stretch : m_stretches) {
        if (!apart.empty())
            stretch.range.start = std::max(stretch.range.start, apart.back().range.end);
        const bool isThere = !apart.empty() && apart.back().range == stretch.range;
        if (!isThere && stretch.range.start <= stretch.range.end)
            apart.push_back(stretch);
    }
    m_stretches = std::move(apart);

    m_longest.assign(1, {});
    for (std::size_t index = 0; index < m_stretches.size(); ++index)
        m_longest[0].push_back(index);
    for (std::size_t count = 1; 2 * count <= m_stretches.size(); count *= 2) {
        const std::vector<std::size_t>& halves = m_longest.back();
        std::vector<std::size_t> wholes;
        for (std::size_t index = 0; index + 2 * count <= m_stretches.size(); ++index) {
            const std::size_t a = halves[index];
            const std::size_t b = halves[index + count];
            wholes.push_back(m_stretches[b].length() > m_stretches[a].length() ? b : a);
        }
        m_longest.push_back(std::move(wholes));
    }
}

std::size_t StepStretches::longest(std::size_t first, std::size_t end) const
{
    const auto level = static_cast<std::size_t>(std::bit_width(end - first)) - 1;
    const std::size_t a = m_longest[level][first];
    const std::size_t b = m_longest[level][end - (std::size_t(1) << level)];
    return m_stretches[b].length() > m_stretches[a].length() ? b : a;
}

std::size_t StepStretches::stepOf(const SecondsRange& range) const
{
    // The stretches are apart, so that their ends are in order like their starts.
    const auto first = std::partition_point(m_stretches.begin(), m_stretches.end(), [&](const Stretch& stretch) {
        return stretch.range.end < range.start - SameInstant;
    });
    const auto end = std::partition_point(first, m_stretches.end(), [&](const Stretch& stretch) {
        return stretch.range.start <= range.end + SameInstant;
    });
    const auto from = static_cast<std::size_t>(first - m_stretches.begin());
    const auto to = static_cast<std::size_t>(end - m_stretches.begin());
    if (from == to)
        return nearest(range, from);
    const auto sharedBy = [&](std::size_t index) {
        const SecondsRange& stretch = m_stretches[index].range;
        return std::min(stretch.end, range.end) - std::max(stretch.start, range.start);
    };
    // Only the first and the last can reach out of the range.
    std::size_t best = from;
    if (from + 2 < to) {
        if (const std::size_t inner = longest(from + 1, to - 1); sharedBy(inner) > sharedBy(best) + SameInstant)
            best = inner;
    }
    if (sharedBy(to - 1) > sharedBy(best) + SameInstant)
        best = to - 1;
    return m_stretches[best].step;
}

std::size_t StepStretches::nearest(const SecondsRange& range, std::size_t after) const
{
    double distance = Reach;
    std::size_t step = 0;
    if (after > 0 && range.start - m_stretches[after - 1].range.end <= distance) {
        distance = range.start - m_stretches[after - 1].range.end;
        step = m_stretches[after - 1].step;
    }
    if (after < m_stretches.size()) {
        const double toNext = m_stretches[after].range.start - range.end;
        if (step == 0 ? toNext <= distance : toNext < distance)
            step = m_stretches[after].step;
    }
    return step;
}

} // namespace cadrel::core
