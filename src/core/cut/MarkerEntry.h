// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <string>

namespace cadrel::core {

/// What a marker points out. Each kind has a marker track of its own; see MarkerTrack.h.
struct MarkerKind {
    enum Type : std::int32_t {
        Insert = 1,
        DissolveWipe = 2,
        AutomationWarning = 3,
        AudioSnippet = 4,
        Overlap = 5,
    };
};

/// A spot of the new programme at which the sound editor should look.
struct MarkerEntry {
    double start = 0.0; ///< seconds
    double end = 0.0;   ///< seconds
    std::string name;
    std::int32_t kind = MarkerKind::Insert; ///< a MarkerKind

    bool operator==(const MarkerEntry&) const = default;
};

} // namespace cadrel::core
