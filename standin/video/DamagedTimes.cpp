// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/DamagedTimes.h"

#include <algorithm>
#include <cstddef>

namespace standin {

namespace {

/// More than a decoder holds back, so that older pictures aren't asked for.
constexpr std::size_t MostKept = 64;

template <class T>
void append(std::deque<T>& kept, const T& value)
{
    kept.push_back(value);
    if (kept.size() > MostKept)
        kept.pop_front();
}

} // namespace

void DamagedTimes::feed(std::int64_t ticks, bool isKey)
{
    if (isKey)
        append(m_keys, ticks);
    if (m_stretches.empty() || m_stretches.back().until)
        return;
    Stretch& open = m_stretches.back();
    if (isKey && ticks > open.from)
        open.until = ticks;
    else
        open.from = std::min(open.from, ticks);
}

void DamagedTimes::note(std::int64_t ticks)
{
    if (isAt(ticks))
        return;
    const auto key = std::find_if(m_keys.begin(), m_keys.end(), [ticks](std::int64_t time) { return time > ticks; });
    append(m_stretches, {ticks, key != m_keys.end() ? std::optional(*key) : std::nullopt});
}

bool DamagedTimes::isAt(std::int64_t ticks) const
{
    return std::any_of(m_stretches.begin(), m_stretches.end(), [ticks](const Stretch& stretch) {
        return ticks >= stretch.from && (!stretch.until || ticks < *stretch.until);
    });
}

std::optional<std::int64_t> DamagedTimes::firstBetween(std::int64_t before, std::int64_t after) const
{
    std::optional<std::int64_t> first;
    for (const Stretch& stretch : m_stretches) {
        if (stretch.from > before && stretch.from < after && (!first || stretch.from < *first))
            first = stretch.from;
    }
    return first;
}

} // namespace standin
