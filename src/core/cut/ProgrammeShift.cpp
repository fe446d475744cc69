// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/cut/ProgrammeShift.h"

#include <iterator>

namespace cadrel::core {

void ProgrammeShift::add(double start, double end, double shift)
{
    if (!(start < end))
        return;
    auto next = m_stretches.lower_bound(start);
    if (next != m_stretches.begin()) {
        Stretch& before = std::prev(next)->second;
        if (before.end > end)
            m_stretches.emplace(end, before);
        if (before.end > start)
            before.end = start;
    }
    while (next != m_stretches.end() && next->first < end) {
        if (next->second.end > end)
            m_stretches.emplace(end, next->second);
        next = m_stretches.erase(next);
    }
    m_stretches.emplace(start, Stretch{end, shift});
}

std::optional<double> ProgrammeShift::at(double time) const
{
    const auto behind = m_stretches.upper_bound(time);
    if (behind == m_stretches.begin())
        return std::nullopt;
    const Stretch& stretch = std::prev(behind)->second;
    return time < stretch.end ? std::optional(stretch.shift) : std::nullopt;
}

} // namespace cadrel::core
