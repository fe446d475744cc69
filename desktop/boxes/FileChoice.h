// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/services/UserBoxes.h"

#include <filesystem>
#include <vector>

namespace desktop {

using FileFilters = std::vector<standin::UserBoxes::FileFilter>;

/// Whether the name has the extension of one of the filters, in small letters or capitals. Without filters every name fits.
bool fits(const std::filesystem::path& file, const FileFilters& filters);

/// What a file is saved as: with the extension of the first filter, unless the name fits one of them.
std::filesystem::path withExtension(const std::filesystem::path& file, const FileFilters& filters);

/// The folder in which boxes open: the one that is asked for, or else that of the last choice, or else `home`.
class FolderMemory {
public:
    explicit FolderMemory(std::filesystem::path home) : m_last(std::move(home)) {}

    /// A wish that isn't a folder is passed over.
    std::filesystem::path startOf(const std::filesystem::path& wish) const;
    void remember(const std::filesystem::path& chosenFile);

private:
    std::filesystem::path m_last;
};

} // namespace desktop
