// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"

#include <filesystem>
#include <stdexcept>
#include <string>
#include <string_view>

namespace cadrel::tests {

inline std::filesystem::path exampleFile(const std::string& name)
{
    return treePath("examples/" + name);
}

/// Writes the film of the example with two short reels, with the old picture on a track and the new one in the pool.
inline void writeHarbourFilm(const std::filesystem::path& file)
{
    std::string film = contentOf(exampleFile("tworeels/tworeels.stage"));
    const auto insertAfter = [&](std::string_view place, std::string_view inserted) {
        const std::size_t at = film.find(place);
        if (at == std::string::npos)
            throw std::runtime_error("the film has another form");
        film.insert(at + place.size(), inserted);
    };
    insertAfter("\"pool\": [", R"(
    {"number": 4, "kind": "video", "name": "harbour_v1", "path": "/pix/harbour_v1.mov", "length": 60},
    {"number": 5, "kind": "video", "name": "harbour_v2", "path": "/pix/harbour_v2.mov", "length": 100},)");
    insertAfter("\"tracks\": [", R"(
    {"kind": "video", "name": "Picture", "events": [
        {"kind": "clip", "start": 60, "end": 96, "clip": 4, "name": "harbour_v1"},
        {"kind": "clip", "start": 3660, "end": 3684, "clip": 4, "offset": 36, "name": "harbour_v1"}
    ]},)");
    writeFile(file, film);
}

} // namespace cadrel::tests
