#pragma once

#include "core/EventBase.h"

#include <cstdint>
#include <string>

namespace cadrel::core {

/// Which name decides that two events are the same material.
struct MatchBy {
    enum Type : std::int32_t { RollName = 0, ClipName = 1 };
};

/// The clip name for MatchBy::ClipName, else the roll name.
inline const std::string& nameBy(std::int32_t matchBy, const EventBase& event)
{
    return matchBy == MatchBy::ClipName ? event.clipName() : event.rollName();
}

} // namespace cadrel::core
