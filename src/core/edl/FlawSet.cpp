// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/FlawSet.h"

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
        return (m_common & bitOf(flaw)) != 0;
    return std::binary_search(m_others.begin(), m_others.end(), flaw);
}

bool FlawSet::containsAny(std::int32_t first, std::int32_t last) const
{
    const std::uint32_t upToLast = bitOf(last) | (bitOf(last) - 1);
    const std::uint32_t belowFirst = bitOf(first) - 1;
    return (m_common & upToLast & ~belowFirst) != 0;
}

void FlawSet::insert(std::int32_t flaw)
{
    if (isCommon(flaw)) {
        m_common |= bitOf(flaw);
        return;
    }
    const auto place = std::lower_bound(m_others.begin(), m_others.end(), flaw);
    if (place == m_others.end() || *place != flaw)
        m_others.insert(place, flaw);
}

void FlawSet::erase(std::int32_t flaw)
{
    if (isCommon(flaw)) {
        m_common &= ~bitOf(flaw);
        return;
    }
    const auto place = std::lower_bound(m_others.begin(), m_others.end(), flaw);
    if (place != m_others.end() && *place == flaw)
        m_others.erase(place);
}

void FlawSet::assign(const std::vector<std::int32_t>& flaws)
{
    m_common = 0;
    m_others.clear();
    for (const std::int32_t flaw : flaws) {
        if (isCommon(flaw))
            m_common |= bitOf(flaw);
        else
            m_others.push_back(flaw);
    }
    std::sort(m_others.begin(), m_others.end());
    m_others.erase(std::unique(m_others.begin(), m_others.end()), m_others.end());
}

std::vector<std::int32_t> FlawSet::values() const
{
    const auto firstPositive = std::lower_bound(m_others.begin(), m_others.end(), 0);
    std::vector<std::int32_t> all(m_others.begin(), firstPositive);
    if (isEmpty())
        return all;
    for (std::int32_t flaw = 0; flaw < CommonCount; ++flaw) {
        if (contains(flaw))
            all.push_back(flaw);
    }
    all.insert(all.end(), firstPositive, m_others.end());
    return all;
}

} // namespace cadrel::core
