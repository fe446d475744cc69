// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/ardour/CurveScale.h"
#include "standin/ardour/CutMark.h"
#include "standin/ardour/SessionClock.h"
#include "standin/ardour/SessionKey.h"
#include "standin/ardour/XmlText.h"

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace standin {

class Node;
class Project;

/// An id in a session, under which no other object of it stands.
using SessionId = std::int64_t;

/// The name of the location that stands for a marker on a track of Cadrel's: with the kind of the marker, which is the name of
/// its track, but once.
std::u16string ownLocationName(const std::u16string& track, const std::u16string& marker);

/// Whether a location's name begins with the kind, whatever letters are large.
bool hasKind(std::u16string_view location, std::u16string_view track);

/// The id that an attribute of a node holds; 0 without one.
SessionId attributeId(const Node& node, const char* key);

/// Where the last clip of a project ends, in seconds.
double contentEnd(const Project& project);

/// Where the session of a project ends, in seconds; it stands in an attribute, so that a run can move it. Nothing without one
/// that is a time of a project.
std::optional<double> sessionEnd(const Project& project);
void setSessionEnd(Project& project, double seconds);

/// The text of a session, and where in it stands what a project can change.
struct ArdourSession {
    /// The length of a fade that a region doesn't describe, in samples.
    static constexpr std::int64_t DefaultFade = 64;

    /// All in samples.
    struct Region {
        TextRange text{};
        std::int64_t position = 0;
        std::int64_t length = 0;
        std::int64_t start = 0; ///< in the source
        SessionId source = 0;
        std::optional<CutMark> head{}; ///< of an edge at which an earlier run has cut
        std::optional<CutMark> tail{};
        bool isMusical = false; ///< one of its times was told in beats
    };
    struct List {
        TextRange text;
        CurveScale scale;
        std::vector<std::pair<double, double>> points; ///< seconds and share, as the project got them
    };
    struct Location {
        TextRange text;
        bool isRange = false;
        std::int64_t start = 0; ///< in samples
        std::int64_t end = 0;
        std::string name;
    };
    struct Playlist {
        std::vector<SessionId> regions; ///< in the order of the text
    };

    std::string text;
    SessionClock clock;
    SessionId largestId = 0;
    TextRange element; ///< of the session itself
    std::map<SessionId, Region> regions;
    std::map<SessionId, Playlist> playlists; ///< by the routes that have them
    /// By route, and by the number of the curve.
    std::map<std::pair<SessionId, int>, List> lists;
    std::map<SessionId, Location> locations;
    TextRange locationsElement;
    std::optional<Location> sessionRange;
    TextRange extra;                   ///< empty without one
    TextRange own;                     ///< what Cadrel has put there; empty without
    std::string ownText;               ///< in it
    std::vector<SessionId> ownMarkers; ///< the locations of the markers in that text, in their order
    bool isOwnBroken = false;
    std::string ownAsRead; ///< what would be put there for the project as it was read
    /// The length of the fade at a new edge, in samples; 64 is Ardour's own.
    std::int64_t edgeFade = DefaultFade;
    std::vector<std::string> staying; ///< what no run moves, in words
};

} // namespace standin
