#include "core/Cut.h"

#include "util/Result.h"

#include <algorithm>
#include <utility>

namespace cadrel::core {

using util::Result;

Cut::Cut(std::shared_ptr<EventBase> event, CutEvents cutEvents)
    : event_(std::move(event)), cutEvents_(std::move(cutEvents))
{
}

double Cut::earliestDstIn() const
{
    if (cutEvents_.empty())
        throw Result::OutOfRange;
    double earliest = cutEvents_.front()->dstIn();
    for (const auto& cutEvent : cutEvents_)
        earliest = std::min(earliest, cutEvent->dstIn());
    return earliest;
}

double Cut::latestDstOut() const
{
    if (cutEvents_.empty())
        throw Result::OutOfRange;
    double latest = cutEvents_.front()->dstOut();
    for (const auto& cutEvent : cutEvents_)
        latest = std::max(latest, cutEvent->dstOut());
    return latest;
}

} // namespace cadrel::core
