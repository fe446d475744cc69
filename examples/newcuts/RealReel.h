// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>

namespace cadrel::examples {

/// Writes the new cut of a real reel, `tests/data/edl/speed_effects.edl`, as an assistant editor would send it two weeks
/// later. README.md lists what changes.
void makeRealReel(const std::filesystem::path& oldCut, const std::filesystem::path& newCut);

} // namespace cadrel::examples
