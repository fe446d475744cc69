// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>

namespace cadrel::examples {

/// Writes both cuts of a film of 20 reels, a file a reel: `film_v03_r01.edl` to `film_v03_r20.edl`, and `film_v04_...`. The
/// same film each time.
void makeFilm(const std::filesystem::path& folder);

} // namespace cadrel::examples
