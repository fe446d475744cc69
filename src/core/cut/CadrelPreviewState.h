// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"

namespace cadrel::core {

class Settings;

/// What the algorithms that trim cuts know of the project.
struct CadrelPreviewState {
    Framerate framerate;
    const Settings* settings = nullptr; ///< not owned
};

} // namespace cadrel::core
