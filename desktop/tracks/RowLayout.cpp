// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/RowLayout.h"

#include "desktop/tracks/TrackIndex.h"

#include <algorithm>
#include <array>

namespace desktop {

using standin::Track;

RowLayout::RowLayout(std::span<const TrackRow> rows, Size size)
{
    m_tops.reserve(rows.size() + 1);
    for (const TrackRow& row : rows)
        m_tops.push_back(m_tops.back() + heightOf(row.track->kind(), size));
}

int RowLayout::heightOf(Track::Kind kind, Size size)
{
    const auto choose = [size](int small, int medium, int large) {
        return std::array{small, medium, large}[static_cast<std::size_t>(size)];
    };
    switch (kind) {
    case Track::Kind::Audio:
        return choose(22, 40, 72);
    case Track::Kind::Video:
        return choose(36, 56, 96);
    case Track::Kind::Marker:
    case Track::Kind::Ruler:
        return choose(20, 24, 24);
    case Track::Kind::Folder:
        return choose(18, 22, 22);
    }
    return 0;
}

std::optional<std::size_t> RowLayout::rowAt(int y) const
{
    if (y < 0 || y >= height())
        return std::nullopt;
    return firstBelow(y);
}

std::size_t RowLayout::firstBelow(int y) const
{
    const auto found = std::upper_bound(m_tops.begin() + 1, m_tops.end(), y);
    return static_cast<std::size_t>(found - (m_tops.begin() + 1));
}

} // namespace desktop
