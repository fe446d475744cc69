// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/cut/Cut.h"

#include "util/Result.h"

#include <algorithm>
#include <utility>

namespace cadrel::core {

using util::Result;

Cut::Cut(std::shared_ptr<EventBase> event, CutEvents cutEvents)
    : m_event(std::move(event)), m_cutEvents(std::move(cutEvents))
{
}

double Cut::earliestDstIn() const
{
    if (m_cutEvents.empty())
        throw Result::OutOfRange;
    double earliest = m_cutEvents.front()->dstIn();
    for (const auto& cutEvent : m_cutEvents)
        earliest = std::min(earliest, cutEvent->dstIn());
    return earliest;
}

double Cut::latestDstOut() const
{
    if (m_cutEvents.empty())
        throw Result::OutOfRange;
    double latest = m_cutEvents.front()->dstOut();
    for (const auto& cutEvent : m_cutEvents)
        latest = std::max(latest, cutEvent->dstOut());
    return latest;
}

} // namespace cadrel::core
