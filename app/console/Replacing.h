// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace cadrel::app {

/// What the user wants where a file exists under the name of an output.
struct Replacing {
    bool isAllowed = false;
    bool keepsFormer = false; ///< under a name of its own
};

/// Throws Failure for the first of the files that exists, unless they may be replaced. Devices and pipes may always be
/// written.
void requireReplaceable(const std::vector<std::string>& files, const Replacing& replacing);

/// Second names of files that are about to be replaced: reel3_backup_1.stage for reel3.stage, and so on with the first number
/// that is free. The names go again unless they are kept.
class Backups {
public:
    /// Of those that exist. Throws Failure when one can't be made.
    explicit Backups(const std::vector<std::string>& files);
    Backups(const Backups&) = delete;
    Backups& operator=(const Backups&) = delete;
    ~Backups();

    std::vector<std::string> names() const;
    void keep() { m_isKept = true; }

private:
    void removeAll();

    std::vector<std::filesystem::path> m_files;
    bool m_isKept = false;
};

} // namespace cadrel::app
