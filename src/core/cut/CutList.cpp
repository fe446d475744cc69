// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/cut/CutList.h"

#include "util/Result.h"

#include <algorithm>
#include <utility>

namespace cadrel::core {

using util::Result;

void CutList::add(std::shared_ptr<Cut> cut)
{
    if (!cut)
        throw Result::InvalidArgument;
    m_events.add(cut->event());
    m_cuts.push_back(std::move(cut));
}

void CutList::clear()
{
    m_cuts.clear();
    m_events.clear();
}

double CutList::earliestDstIn() const
{
    if (m_cuts.empty())
        throw Result::OutOfRange;
    double earliest = m_cuts.front()->earliestDstIn();
    for (const auto& cut : m_cuts)
        earliest = std::min(earliest, cut->earliestDstIn());
    return earliest;
}

double CutList::latestDstOut() const
{
    if (m_cuts.empty())
        throw Result::OutOfRange;
    double latest = m_cuts.front()->latestDstOut();
    for (const auto& cut : m_cuts)
        latest = std::max(latest, cut->latestDstOut());
    return latest;
}

std::map<double, std::weak_ptr<Cut>> CutList::orderedByStart() const
{
    std::map<double, std::weak_ptr<Cut>> ordered;
    for (const auto& cut : m_cuts)
        ordered[cut->earliestDstIn()] = cut;
    return ordered;
}

} // namespace cadrel::core
