// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <string_view>

namespace desktop {

/// What a file that is dropped on the window is, as its content tells.
enum class DroppedFile {
    Project, ///< of any form, or a folder with a session: to be opened
    Edl,     ///< for the module
    Other,
};

/// Reads no more than the beginning.
DroppedFile droppedFile(const std::filesystem::path& path);
/// The same for the first bytes of a file.
DroppedFile droppedFileOf(std::string_view beginning);

} // namespace desktop
