// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <memory>
#include <vector>

namespace desktop {

/// Which of some files are missing, as far as is known. They are looked for on a thread of its own, since a disk of the net that
/// has gone may keep whoever asks it waiting for ever.
class MissingFiles {
public:
    MissingFiles();
    MissingFiles(const MissingFiles&) = delete;
    MissingFiles& operator=(const MissingFiles&) = delete;
    /// Waits for nothing.
    ~MissingFiles();

    /// Looks for the files, unless a look goes on. What was known before counts until each of them was found or not.
    void look(std::vector<std::filesystem::path> files);
    bool isLooking() const;
    /// False for a file that wasn't looked for yet.
    bool isMissing(const std::filesystem::path& file) const;

private:
    struct Shared;

    std::shared_ptr<Shared> m_shared; ///< with the thread, which may outlive this
};

} // namespace desktop
