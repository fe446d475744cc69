// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <filesystem>

namespace cadrel::util {

/// Which file a name stood for at one time, and in which state. A program that saves the file changes its stamp.
struct FileStamp {
    bool exists = false;
    std::uint64_t device = 0;
    std::uint64_t inode = 0;
    std::uint64_t size = 0;   ///< bytes
    std::int64_t seconds = 0; ///< of the last writing
    std::int64_t nanoseconds = 0;

    /// Symbolic links are followed. What can't be reached doesn't exist.
    static FileStamp of(const std::filesystem::path& file);

    friend bool operator==(const FileStamp&, const FileStamp&) = default;
};

} // namespace cadrel::util
