// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/picture/Reels.h"

#include <algorithm>
#include <cmath>

namespace cadrel::core {

std::int32_t partingGap(const Framerate& framerate)
{
    constexpr double Seconds = 60.0;
    return static_cast<std::int32_t>(std::ceil(framerate.rate * Seconds));
}

Reels::Reels(const FrameRanges& oldLit, const FrameRanges& newLit, const Framerate& framerate)
    : m_old(joinedWithin(partingGap(framerate), oldLit)), m_new(joinedWithin(partingGap(framerate), newLit))
{
    for (std::size_t index = 0; canBePaired() && index < m_old.size(); ++index)
        m_pairs.push_back({m_old[index], m_new[index]});
}

const ReelPair* Reels::pairAtNew(std::int32_t frame) const
{
    const auto pair = std::partition_point(m_pairs.begin(), m_pairs.end(),
                                           [frame](const ReelPair& other) { return other.newFrames.end <= frame; });
    return pair != m_pairs.end() && pair->newFrames.contains(frame) ? &*pair : nullptr;
}

} // namespace cadrel::core
