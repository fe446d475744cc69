// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/ardour/ArdourSession.h"
#include "standin/ardour/CutMark.h"

#include <cstdint>
#include <functional>
#include <vector>

namespace pugi {
class xml_node;
} // namespace pugi

namespace standin {

class ClipEvent;

/// A stretch of a region at its place in the new programme, in samples.
struct RegionPiece {
    std::int64_t position = 0;
    std::int64_t length = 0;
    std::int64_t start = 0; ///< in the source
    RegionEdge head = RegionEdge::Old;
    RegionEdge tail = RegionEdge::Old;

    /// Whether an edge that an earlier run has cut is of the kind that it was before this one.
    bool isHeadAsBefore = false;
    bool isTailAsBefore = false;

    /// Whether an edge is one of the region, and is as it was.
    bool keepsHead() const { return head == RegionEdge::Old || isHeadAsBefore; }
    bool keepsTail() const { return tail == RegionEdge::Old || isTailAsBefore; }
    /// Whether it is the whole region, wherever it stands now.
    bool isWhole(const ArdourSession::Region& region) const
    {
        return length == region.length && start == region.start && keepsHead() && keepsTail();
    }
    /// Whether nothing has become of the region.
    bool isAll(const ArdourSession::Region& region) const { return position == region.position && isWhole(region); }
};

/// What is left of a region.
struct RegionPieces {
    const ArdourSession::Region& region;
    std::vector<RegionPiece> pieces;
};

/// How near to a cut an edge of a region has to lie, in samples, to lie at that cut. Where a frame isn't a whole number of
/// samples an editor puts the edge up to a sample beside the cut, and what has moved lies up to half a sample beside where
/// it should.
inline constexpr double NearToCut = 2.0;

/// The pieces that play something, in the order of the events. A cut lies at the nearest sample of the region, on both of its
/// sides, and one near to an edge at that edge. All samples of an event are moved by the same number of samples, the nearest
/// to how far the event has moved. Each edge at which this run or an earlier one has cut is new.
std::vector<RegionPiece> piecesOf(const ArdourSession::Region& region, const std::vector<const ClipEvent*>& events,
                                  const SessionClock& clock);

/// Makes seams of the new edges of a playlist where a piece goes on in another that was cut from it, in this run or before,
/// and finds which edges are as they were.
void findSeams(std::vector<RegionPieces>& playlist);

/// Gives the lists in the element of a region other ids.
void giveNewIds(pugi::xml_node& element, const std::function<SessionId()>& newId);

/// Makes the element of a region that of a piece: place, length, fades, gain envelope, sync point. New lists in it get their
/// ids from `newId`. At a new edge it fades over `edgeFade` samples; 0 is no fade.
void cutRegion(pugi::xml_node& element, const ArdourSession::Region& region, const RegionPiece& piece,
               const SessionClock& clock, std::int64_t edgeFade, const std::function<SessionId()>& newId);

} // namespace standin
