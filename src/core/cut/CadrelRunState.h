// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"

namespace cadrel::core {

class EventList;
class Settings;

/// What the detect algorithms know of the project. Nothing is owned.
struct CadrelRunState {
    const EventList* oldEvents = nullptr;
    const EventList* newEvents = nullptr;
    Framerate framerate;
    const Settings* settings = nullptr;
    double previewOffset = 0.0; ///< seconds
    double timeOrigin = 0.0;    ///< where the project's clock begins, in seconds
};

} // namespace cadrel::core
