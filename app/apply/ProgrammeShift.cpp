#include "app/apply/ProgrammeShift.h"

#include <iterator>

namespace cadrel::app {

void ProgrammeShift::add(double start, double end, double shift)
{
    if (!(start < end))
        return;
    auto next = stretches_.lower_bound(start);
    if (next != stretches_.begin()) {
        Stretch& before = std::prev(next)->second;
        if (before.end > end)
            stretches_.emplace(end, before);
        if (before.end > start)
            before.end = start;
    }
    while (next != stretches_.end() && next->first < end) {
        if (next->second.end > end)
            stretches_.emplace(end, next->second);
        next = stretches_.erase(next);
    }
    stretches_.emplace(start, Stretch{end, shift});
}

std::optional<double> ProgrammeShift::at(double time) const
{
    const auto behind = stretches_.upper_bound(time);
    if (behind == stretches_.begin())
        return std::nullopt;
    const Stretch& stretch = std::prev(behind)->second;
    return time < stretch.end ? std::optional(stretch.shift) : std::nullopt;
}

} // namespace cadrel::app
