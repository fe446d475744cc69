// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/settings/MatchBy.h"
#include "core/settings/VfxNameMatcher.h"
#include "core/time/Framerate.h"

#include <cstdint>

namespace cadrel::core {

/// How two programmes are compared.
struct PictureRules {
    Framerate framerate;
    std::int32_t matchBy = MatchBy::RollName; ///< which name tells the material
    VfxNameMatcher versions;                  ///< takes the version out of the names of VFX shots
};

} // namespace cadrel::core
