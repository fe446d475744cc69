// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <string>

namespace cadrel::core::fileio {

/// A line of a file that is to be told of.
struct SourceLine {
    std::uint32_t number = 0; ///< counted from 1
    std::string text;         ///< without blanks at its ends

    bool operator==(const SourceLine&) const = default;
};

} // namespace cadrel::core::fileio
