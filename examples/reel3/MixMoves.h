// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/Envelope.h"

#include <string>
#include <vector>

namespace reel3 {

/// A place that an automation curve goes through; "HH:MM:SS:FF".
struct Move {
    const char* at;
    double value; ///< 0 to 1; of a fader 0.75 is unity, of a pan 0.5 the middle, of a mute 1 is silence
};

/// What is written of a curve by hand.
struct Ride {
    const char* track;
    standin::Envelope::Curve::Number curve;
    std::vector<Move> moves;
};

const std::vector<Ride>& rides();

/// The faders of the atmospheres, clip by clip, in the order of the clips.
const std::vector<double>& firstAtmosphereLevels();
const std::vector<double>& secondAtmosphereLevels();

} // namespace reel3
