// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>

namespace cadrel::core {

/// Which name decides that two events are the same material.
struct MatchBy {
    enum Type : std::int32_t { RollName = 0, ClipName = 1 };
};

} // namespace cadrel::core
