// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/ardour/ArdourSession.h"
#include "standin/ardour/FadeCurve.h"
#include "standin/ardour/RegionPiece.h"

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

namespace pugi {
class xml_node;
} // namespace pugi

namespace standin {

/// The fades of a region as they were before any cut, and what becomes of them in a piece. A piece has in each of its two
/// fades what the region's had there, with a short fade over an edge at which it was cut. The two never overlap, since Ardour
/// adds what it plays of fades that do:
///
///     region    /--------\______________         fades that the user has drawn
///     pieces    /---|  |-----\___|  |___         cut in the first fade, and after it
///
class RegionFades {
public:
    /// What the element of a region has now. Throws FileFault.
    RegionFades(const pugi::xml_node& element, const ArdourSession::Region& region, const SessionClock& clock);

    /// How long an element fades in and out, in samples; 0 where it doesn't.
    static std::int64_t lengthIn(const pugi::xml_node& element, const SessionClock& clock);
    static std::int64_t lengthOut(const pugi::xml_node& element, const SessionClock& clock);

    /// Gives an element of the region the fades of a piece, and notes where it was cut. At a new edge it fades over `edgeFade`
    /// samples. New lists get their ids from `newId`.
    void cut(pugi::xml_node& element, const RegionPiece& piece, std::int64_t edgeFade,
             const std::function<SessionId()>& newId) const;

private:
    struct Fade {
        FadeCurve gain;
        FadeCurve below; ///< how much of what lies below the region is heard
        bool hasBelow = false;
        std::int64_t length = 0; ///< in samples
    };
    /// How loud it is at a sample from the region's start.
    struct Loudness {
        double own;
        double below;
    };
    class Piece;

    Fade fadeOf(const pugi::xml_node& element, bool isIn) const;
    Loudness drawnAt(double sample) const;
    Loudness at(double sample) const;

    const ArdourSession::Region& m_region;
    const SessionClock& m_clock;
    Fade m_in;
    Fade m_out;
};

} // namespace standin
