#include "core/CutList.h"

#include "util/Result.h"

#include <algorithm>
#include <utility>

namespace cadrel::core {

using util::Result;

void CutList::add(std::shared_ptr<Cut> cut)
{
    if (!cut)
        throw Result::InvalidArgument;
    events_.add(cut->event());
    cuts_.push_back(std::move(cut));
}

void CutList::clear()
{
    cuts_.clear();
    events_.clear();
}

double CutList::earliestDstIn() const
{
    if (cuts_.empty())
        throw Result::OutOfRange;
    double earliest = cuts_.front()->earliestDstIn();
    for (const auto& cut : cuts_)
        earliest = std::min(earliest, cut->earliestDstIn());
    return earliest;
}

double CutList::latestDstOut() const
{
    if (cuts_.empty())
        throw Result::OutOfRange;
    double latest = cuts_.front()->latestDstOut();
    for (const auto& cut : cuts_)
        latest = std::max(latest, cut->latestDstOut());
    return latest;
}

std::map<double, std::weak_ptr<Cut>> CutList::orderedByStart() const
{
    std::map<double, std::weak_ptr<Cut>> ordered;
    for (const auto& cut : cuts_)
        ordered[cut->earliestDstIn()] = cut;
    return ordered;
}

} // namespace cadrel::core
