// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/PictureCarrying.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/keep/ChangeStretch.h"

#include <algorithm>
#include <utility>

namespace cadrel::core {

PictureCarrying::PictureCarrying(const PictureLine& oldLine, const PictureLine& newLine, const Reels& reels,
                                 CarriedStretches& carried)
    : m_new(newLine), m_reels(reels), m_comparison(oldLine, newLine), m_carried(carried)
{
}

void PictureCarrying::run(const EventList& changeEvents, const Framerate& framerate)
{
    const std::vector<ChangeStretch> stretches = unhealedStretches(changeEvents, framerate);
    carryReelEnds();
    carryLongerThanInPlace(stretches);
    carryInPlace();
    carryChangeEvents(changeEvents, stretches, framerate);
    carryHoles();
}

// Of material that stands twice, one place can have come to stand where the other was, and the change EDL can send a shot
// onto its twin. Where only one thing has changed, all before it is as it was against the reel's start, and all after it
// against the reel's end.
void PictureCarrying::carryReelEnds()
{
    for (const ReelPair& pair : m_reels.pairs()) {
        const auto common = [&pair](std::int32_t shift) {
            return intersect(pair.newFrames, pair.oldFrames.shiftedBy(shift));
        };
        const FrameRange fromStart = common(pair.startShift());
        const FrameRanges afterHead = m_comparison.differencesUnder(pair.startShift(), fromStart);
        const std::int32_t headEnd = afterHead.empty() ? fromStart.end : afterHead.front().start;
        carryEqual(pair.startShift(), {fromStart.start, headEnd});

        const FrameRange upToEnd = common(pair.endShift());
        const FrameRanges beforeTail = m_comparison.differencesUnder(pair.endShift(), upToEnd);
        const std::int32_t tailStart = beforeTail.empty() ? upToEnd.start : beforeTail.back().end;
        carryEqual(pair.endShift(), {tailStart, upToEnd.end});
    }
}

// Between two changes a frame can show what its twin happened to show there. That is less than the stretch it goes along with,
// while a stretch that the change EDL sends onto its twin is less than what is the same around it.
void PictureCarrying::carryLongerThanInPlace(const std::vector<ChangeStretch>& stretches)
{
    std::vector<FrameRange> equal;
    for (const FrameRange& reel : m_reels.ofNew()) {
        for (const PicturePiece& piece : m_comparison.equalUnder(0, reel))
            equal.push_back(piece.frames);
    }
    const FrameRanges inPlace = united(std::move(equal));
    for (const ChangeStretch& stretch : joinedByShift(stretches)) {
        const FrameRange& bounds = stretch.destination;
        auto range = std::partition_point(inPlace.begin(), inPlace.end(),
                                          [&bounds](const FrameRange& other) { return other.end <= bounds.start; });
        for (; range != inPlace.end() && range->start < bounds.end; ++range) {
            if (stretch.shift != 0 && bounds.length() > range->length())
                carryEqual(stretch.shift, intersect(bounds, *range));
        }
    }
}

void PictureCarrying::carryInPlace()
{
    for (const FrameRange& reel : m_reels.ofNew())
        carryEqual(0, reel);
}

void PictureCarrying::carryChangeEvents(const EventList& changeEvents, const std::vector<ChangeStretch>& stretches,
                                        const Framerate& framerate)
{
    // Of several layers that claim one frame, that one is right under which the whole picture is the same.
    for (const ChangeStretch& stretch : stretches)
        carryEqual(stretch.shift, stretch.destination, CarriedFrom::Cut);
    for (const ChangeStretch& stretch : stretches)
        m_carried.carry(m_comparison.litUnder(stretch.shift, stretch.destination), stretch.shift, CarriedFrom::Cut);
    // What was healed over a gap between two shots goes along, but not into black and not out of it.
    for (const auto& event : changeEvents.events()) {
        if (event->eventKind() != EventKind::Healed)
            continue;
        if (const auto stretch = changeStretchOf(*event, framerate))
            m_carried.carry(m_comparison.litUnder(stretch->shift, stretch->destination), stretch->shift,
                            CarriedFrom::Cut);
    }
}

void PictureCarrying::carryEqual(std::int32_t shift, const FrameRange& bounds)
{
    carryEqual(shift, bounds, shift == 0 ? CarriedFrom::Unchanged : CarriedFrom::Cut);
}

void PictureCarrying::carryHoles()
{
    for (const Hole& hole : findHoles()) {
        if (hole.leftShift)
            carryEqual(*hole.leftShift, hole.frames, CarriedFrom::Hole);
        if (hole.rightShift)
            carryEqual(*hole.rightShift, hole.frames, CarriedFrom::Hole);
    }
}

void PictureCarrying::carryEqual(std::int32_t shift, const FrameRange& bounds, CarriedFrom from)
{
    m_carried.carry(m_comparison.equalUnder(shift, bounds), shift, from);
}

std::vector<PictureCarrying::Hole> PictureCarrying::findHoles() const
{
    std::vector<Hole> holes;
    for (const FrameRange& reel : m_reels.ofNew()) {
        const std::vector<Hole> found = holesOf(reel, m_reels.pairAtNew(reel.start));
        holes.insert(holes.end(), found.begin(), found.end());
    }
    return holes;
}

std::vector<PictureCarrying::Hole> PictureCarrying::holesOf(const FrameRange& newReel, const ReelPair* pair) const
{
    std::vector<Hole> holes;
    const auto orOf = [](std::optional<std::int32_t> shift, std::optional<std::int32_t> other) {
        return shift ? shift : other;
    };
    const std::optional<std::int32_t> startShift = pair ? std::optional(pair->startShift()) : std::nullopt;
    const std::optional<std::int32_t> endShift = pair ? std::optional(pair->endShift()) : std::nullopt;
    for (const FrameRange& free : m_carried.freeIn(newReel)) {
        const auto left = orOf(m_carried.shiftBefore(free.start, newReel), startShift);
        const auto right = orOf(m_carried.shiftAfter(free.end, newReel), endShift);
        for (const FrameRange& lit : within(free, m_new.lit()))
            holes.push_back({lit, left, right});
    }
    return holes;
}

} // namespace cadrel::core
