// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/VideoSupport.h"

#include <filesystem>
#include <vector>

namespace standin {

/// Where a file of media may be, in the order in which it is looked for: where the project says, which is beside the project
/// file for a path that isn't absolute, and then the name alone beside the project file.
std::vector<std::filesystem::path> placesOf(const MediaReference& file);

/// The first of the places at which there is something. Throws VideoError as Missing.
std::filesystem::path findMedia(const std::vector<std::filesystem::path>& places);

} // namespace standin
