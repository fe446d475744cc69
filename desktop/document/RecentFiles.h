// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <filesystem>
#include <utility>
#include <vector>

namespace desktop {

/// The projects that were open last, the newest first. They are kept for the user, in a file that several programs may write
/// at a time, and of which nothing is trusted.
class RecentFiles {
public:
    static constexpr std::size_t Most = 20;

    struct Entry {
        std::filesystem::path path;
        bool isMissing = false; ///< there is no such file (any more)
    };

    /// Kept in that file; nothing is kept where the path is empty.
    explicit RecentFiles(std::filesystem::path file = defaultFile()) : m_file(std::move(file)) {}

    /// cadrel/recent.json below XDG_STATE_HOME, or below ~/.local/state; empty where neither is known.
    static std::filesystem::path defaultFile();

    std::vector<Entry> entries() const;
    /// The same without a look at any of the files, each of which may be on a disk that doesn't answer.
    std::vector<std::filesystem::path> paths() const { return read(); }
    /// Puts it first. False where it can't be kept, as for a name that is no UTF-8 text.
    bool add(const std::filesystem::path& path);
    bool remove(const std::filesystem::path& path);
    bool clear();

private:
    using Paths = std::vector<std::filesystem::path>;

    Paths read() const;
    bool write(const Paths& paths) const;

    std::filesystem::path m_file;
};

} // namespace desktop
