// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Timecode.h"

#include <memory>

namespace cadrel::core {

class EventBase;

/// One possible event of the change EDL for the new event in hand.
struct ChangeCandidate {
    std::shared_ptr<EventBase> changeEvent;
    double displacement = 0.0; ///< seconds, new programme time minus old programme time of the stretch
    Timecode newSourceStart;   ///< where the stretch begins in the source, as the new event sees it
    Timecode newSourceEnd;
};

} // namespace cadrel::core
