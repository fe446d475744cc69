// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <string_view>

namespace desktop {

/// A file in the folder of another, named after it. Where the name gets longer than a file's name may be, its middle is the
/// hash of what had to go.
std::filesystem::path fileBeside(const std::filesystem::path& file, std::string_view before, std::string_view after);

} // namespace desktop
