// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <filesystem>
#include <optional>
#include <string>

namespace cadrel::util {

/// No name of a file has more bytes, on the file systems in use.
inline constexpr std::size_t LongestFileName = 255;

/// What keeps a file from being written, as far as that can be told without writing it.
struct WriteObstacle {
    std::string problem;
    std::string remedy;

    /// Nothing where none is known; the disk may be full all the same.
    static std::optional<WriteObstacle> of(const std::filesystem::path& file);
};

} // namespace cadrel::util
