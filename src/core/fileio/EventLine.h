// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"

#include <array>
#include <cstddef>
#include <optional>
#include <string_view>

namespace cadrel::core::fileio {

/// The columns of an event line, which are separated by blanks. Only a dissolve or wipe has a duration, before the four
/// timecodes:
///
///     001  A001C003 V     C        10:00:00:00 10:00:04:00 01:00:00:00 01:00:04:00
///     002  A002C001 V     D    024 11:00:00:00 11:00:03:00 01:00:04:00 01:00:07:00
struct EventLine {
    enum class Separators { Blanks, BlanksAndTabs };

    /// Finds the columns of a trimmed line, of which the views are parts. Columns after the end of the line stay empty.
    explicit EventLine(std::string_view line, Separators separators = Separators::Blanks);

    /// The columns of a line whose columns may also be separated by tabs. They count as separators where a column would be
    /// missing without them.
    static EventLine withTabs(std::string_view line);

    /// Whether no column is missing.
    bool isComplete() const { return timecodeCount == timecodes.size(); }
    /// Where the last column ends in `line`, from which a complete line was made.
    std::size_t lengthIn(std::string_view line) const;

    std::string_view number;
    std::string_view rollName;
    std::string_view channel;
    std::optional<TransitionType::Type> transitionType; ///< nothing for an unknown letter
    std::optional<std::string_view> duration;
    std::array<std::string_view, 4> timecodes; ///< SRC IN, SRC OUT, DST IN, DST OUT
    std::size_t timecodeCount = 0;             ///< how many of them the line has
};

} // namespace cadrel::core::fileio
