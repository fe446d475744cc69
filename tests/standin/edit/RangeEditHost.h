// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/support/standin/TestHost.h"

#include <initializer_list>
#include <string>

namespace standin::tests {

/// A host whose edits of ranges are seen as small texts.
class RangeEditHost : public TestHost {
public:
    /// The operations, each in a transaction of its own. They throw std::runtime_error when the host refuses.
    void copyRange(std::initializer_list<Node> tracks, double start, double end, double destination);
    void deleteRange(double start, double end);
    void copyAllAndPaste(double start, double end, double destination);
    /// Whether anything was joined.
    bool closeRange(std::initializer_list<Node> tracks, double start, double end);

    /// Clip events that play from an offset.
    Node addClipFrom(const Node& parent, const char16_t* name, double start, double end, double offset);
    /// Points of the volume.
    void addVolume(const Node& track, std::initializer_list<std::pair<double, float>> points);

    /// What lies on a track or in a part, in seconds of the project: "line 2-5 +10" for a clip that plays from second 10 of
    /// its media, "memo 4" for a point marker, "scene 2-5" for a range marker, "part 2-8 (line 2-5 +10)".
    static std::string eventsOf(const Node& parent);
    /// The points of the volume: "2=0.5 4=1".
    std::string volumeOf(const Node& track);
    std::string curveTextOf(const Node& track, Velmark::int32 number);

private:
    Velmark::Counted<Velmark::IObjectList> listOf(std::initializer_list<Node> tracks);
};

} // namespace standin::tests
