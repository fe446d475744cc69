// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/fileio/FileRemarks.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace cadrel::core::fileio {

/// Collects the lines of a CMX EDL with events that were not read. Not only a line that begins with a number can hold one:
/// a few timecodes in a place where none of them are read look like an event, too.
///
///     002  A002C001 V     C        11:00:00:00 11:00:03:00 01:00:04:00                  misses a field
///     O03  A002C001 V     C        11:00:00:00 11:00:03:00 01:00:04:00 01:00:07:00      begins with no number
///     * FROM CLIP NAME: SC14_TK1004  A003C001 V     C        12:00:00:00 ...            stands in a comment
///
/// An event line after "*" is left out on purpose, and is not collected.
class UnreadLines {
public:
    enum class Kind { Comment, Other };

    // Each returns whether it has found an event that was not read.

    /// A line of which an event was made; `taken` bytes of it are the event's.
    bool lookAfterEvent(std::string_view line, std::uint32_t number, std::size_t taken);
    /// A line that begins with a number but makes no event, and why it doesn't.
    bool lookAtDropped(std::string_view line, std::uint32_t number, const std::string& problem);
    /// Any other line.
    bool lookAt(std::string_view line, std::uint32_t number, Kind kind);

    void add(std::string_view line, std::uint32_t number, const std::string& problem);

    std::vector<UnreadLine> release() { return std::move(m_lines); }

private:
    void lookAtFurther(std::string_view line, std::uint32_t number, std::size_t taken);

    std::vector<UnreadLine> m_lines;
};

} // namespace cadrel::core::fileio
