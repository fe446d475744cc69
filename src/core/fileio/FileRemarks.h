// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/fileio/SourceLine.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace cadrel::core::fileio {

/// A line that holds something that was not read.
struct UnreadLine {
    SourceLine line;     ///< a long text only in part
    std::string problem; ///< what follows after "line 12 ", such as "misses a field"

    bool operator==(const UnreadLine&) const = default;
};

/// What a file says besides its events.
struct FileRemarks {
    std::string title;                       ///< of its first TITLE line, in the bytes of the file; empty without one
    std::vector<UnreadLine> unreadLines;     ///< in the order of the file
    std::int32_t dropFrame = -1;             ///< -1 it says nothing, 0 non-drop, 1 drop-frame
    std::optional<SourceLine> dropFrameLine; ///< where it says so
    std::size_t timecodeCount = 0;           ///< those whose frames field is below 60
    std::int32_t highestFrame = 0;           ///< the highest frames field of those
};

} // namespace cadrel::core::fileio
