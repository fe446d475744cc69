// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <optional>

namespace pugi {
class xml_node;
} // namespace pugi

namespace standin {

/// How an edge of a piece of a region came to be.
enum class RegionEdge : std::uint8_t {
    Old, ///< it is that of the region, as the user made it
    New, ///< the region was cut there
    Seam ///< it was cut there, and its next piece follows
};

/// What a run notes of an edge at which it has cut a region, so that a later one finds where pieces belong together again. It
/// stands in the region's Extra element, the only place in it where Ardour keeps what it doesn't know.
struct CutMark {
    RegionEdge edge = RegionEdge::New;
    std::int32_t fade = 0; ///< how long it fades there because of the cut, in samples

    /// What an element says of its `end`, "head" or "tail"; nothing where it says nothing, or where the user has moved that
    /// edge or changed its fade since. `place` is where the edge stands in the source, `fadeLength` how long it fades there in
    /// all, both in samples.
    static std::optional<CutMark> read(const pugi::xml_node& region, const char* end, std::int64_t place,
                                       std::int64_t fadeLength);
    void write(pugi::xml_node& region, const char* end, std::int64_t place, std::int64_t fadeLength) const;
    /// Forgets what was noted of an edge.
    static void remove(pugi::xml_node& region, const char* end);
};

} // namespace standin
