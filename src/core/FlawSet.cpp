#include "core/FlawSet.h"

#include <algorithm>

namespace cadrel::core {

namespace {

constexpr std::int32_t CommonCount = 32;

bool isCommon(std::int32_t flaw)
{
    return flaw >= 0 && flaw < CommonCount;
}

std::uint32_t bitOf(std::int32_t flaw)
{
    return 1U << static_cast<std::uint32_t>(flaw);
}

} // namespace

bool FlawSet::contains(std::int32_t flaw) const
{
    if (isCommon(flaw))
        return (common_ & bitOf(flaw)) != 0;
    return std::binary_search(others_.begin(), others_.end(), flaw);
}

bool FlawSet::containsAny(std::int32_t first, std::int32_t last) const
{
    const std::uint32_t upToLast = bitOf(last) | (bitOf(last) - 1);
    const std::uint32_t belowFirst = bitOf(first) - 1;
    return (common_ & upToLast & ~belowFirst) != 0;
}

void FlawSet::insert(std::int32_t flaw)
{
    if (isCommon(flaw)) {
        common_ |= bitOf(flaw);
        return;
    }
    const auto place = std::lower_bound(others_.begin(), others_.end(), flaw);
    if (place == others_.end() || *place != flaw)
        others_.insert(place, flaw);
}

void FlawSet::erase(std::int32_t flaw)
{
    if (isCommon(flaw)) {
        common_ &= ~bitOf(flaw);
        return;
    }
    const auto place = std::lower_bound(others_.begin(), others_.end(), flaw);
    if (place != others_.end() && *place == flaw)
        others_.erase(place);
}

void FlawSet::assign(const std::vector<std::int32_t>& flaws)
{
    common_ = 0;
    others_.clear();
    for (const std::int32_t flaw : flaws) {
        if (isCommon(flaw))
            common_ |= bitOf(flaw);
        else
            others_.push_back(flaw);
    }
    std::sort(others_.begin(), others_.end());
    others_.erase(std::unique(others_.begin(), others_.end()), others_.end());
}

std::vector<std::int32_t> FlawSet::values() const
{
    const auto firstPositive = std::lower_bound(others_.begin(), others_.end(), 0);
    std::vector<std::int32_t> all(others_.begin(), firstPositive);
    for (std::int32_t flaw = 0; flaw < CommonCount; ++flaw) {
        if (contains(flaw))
            all.push_back(flaw);
    }
    all.insert(all.end(), firstPositive, others_.end());
    return all;
}

} // namespace cadrel::core
