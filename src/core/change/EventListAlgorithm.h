// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"

namespace cadrel::core {

class EventList;
class Settings;

/// What healing needs beside the list itself.
struct HealContext {
    const EventList* referenceList; ///< where inserts are found: the new EDL; not owned
    const Settings* settings;       ///< gives the heal mode and the match setting; not owned
    Framerate framerate;            ///< for all conversions to seconds
};

/// An operation that rewrites an EventList in place.
class EventListAlgorithm {
public:
    virtual ~EventListAlgorithm() = default;

    virtual void process(EventList& events, const HealContext& context) const = 0;
};

} // namespace cadrel::core
