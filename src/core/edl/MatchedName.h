// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"
#include "core/settings/MatchBy.h"

#include <cstdint>
#include <string>

namespace cadrel::core {

/// The name that decides whether an event is the same material as another: the clip name for MatchBy::ClipName, else the
/// roll name.
inline const std::string& nameBy(std::int32_t matchBy, const EventBase& event)
{
    return matchBy == MatchBy::ClipName ? event.clipName() : event.rollName();
}

} // namespace cadrel::core
