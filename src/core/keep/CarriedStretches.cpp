// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/CarriedStretches.h"

#include "core/picture/PictureComparison.h"

#include <iterator>

namespace cadrel::core {

void CarriedStretches::carry(const CarriedStretch& stretch)
{
    for (const FrameRange& free : freeIn(stretch.destination)) {
        CarriedStretch part = stretch;
        part.destination = free;
        m_byStart.emplace(free.start, part);
    }
}

void CarriedStretches::carry(const std::vector<PicturePiece>& pieces, std::int32_t shift, CarriedFrom from)
{
    for (const PicturePiece& piece : pieces)
        carry({piece.frames, shift, from, static_cast<std::int32_t>(piece.event)});
}

std::vector<CarriedStretch> CarriedStretches::stretches() const
{
    std::vector<CarriedStretch> all;
    all.reserve(m_byStart.size());
    for (const auto& [start, stretch] : m_byStart)
        all.push_back(stretch);
    return all;
}

FrameRanges CarriedStretches::destinations() const
{
    std::vector<FrameRange> all;
    all.reserve(m_byStart.size());
    for (const auto& [start, stretch] : m_byStart)
        all.push_back(stretch.destination);
    return united(std::move(all));
}

FrameRanges CarriedStretches::freeIn(const FrameRange& bounds) const
{
    FrameRanges free;
    std::int32_t frame = bounds.start;
    auto next = m_byStart.upper_bound(frame);
    if (next != m_byStart.begin())
        frame = std::max(frame, std::prev(next)->second.destination.end);
    for (; next != m_byStart.end() && next->first < bounds.end; ++next) {
        if (frame < next->first)
            free.push_back({frame, next->first});
        frame = next->second.destination.end;
    }
    if (frame < bounds.end)
        free.push_back({frame, bounds.end});
    return free;
}

std::optional<std::int32_t> CarriedStretches::shiftBefore(std::int32_t frame, const FrameRange& bounds) const
{
    const auto next = m_byStart.lower_bound(frame);
    if (next == m_byStart.begin() || std::prev(next)->second.destination.end <= bounds.start)
        return std::nullopt;
    return std::prev(next)->second.shift;
}

std::optional<std::int32_t> CarriedStretches::shiftAfter(std::int32_t frame, const FrameRange& bounds) const
{
    const auto next = m_byStart.lower_bound(frame);
    if (next == m_byStart.end() || next->first >= bounds.end)
        return std::nullopt;
    return next->second.shift;
}

} // namespace cadrel::core
