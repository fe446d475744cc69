// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/ClipEvent.h"
#include "standin/project/Marker.h"
#include "standin/project/Part.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"

#include <cstddef>
#include <string>
#include <vector>

namespace cadrel::app {

using Tracks = std::vector<const standin::Track*>;

/// From top to bottom, folders before what they hold.
Tracks tracksOf(const standin::Project& project);
/// The folders around a track, the outermost first.
Tracks foldersAround(const standin::Track& track);

/// An event and where it lies, in seconds of the project.
struct PlacedEvent {
    const standin::Event& event;
    double start;
    double end;
    std::size_t depth; ///< how many parts are around it
};

/// How much a track holds, or several.
struct ContentCount {
    std::size_t clips = 0;
    std::size_t parts = 0;
    std::size_t markers = 0;
    std::size_t points = 0;

    std::size_t events() const { return clips + parts + markers; }
    ContentCount& operator+=(const ContentCount& other);
};

ContentCount countContent(const standin::Track& track);

/// "clip", "part", "marker" or "range".
const char* kindOf(const standin::Event& event);

/// Longer names are cut, so that one of them doesn't push the rest off the screen.
inline constexpr std::size_t MostCharactersOfAName = 40;
/// The name of a marker is often a sentence, and nothing comes after it in the row.
inline constexpr std::size_t MostCharactersOfAMarker = 120;

/// The name of a node as a terminal may get it; "(no name)" for none.
std::string printableName(const std::u16string& name, std::size_t mostCharacters = MostCharactersOfAName);

/// The name of a curve, or its number when it has none.
std::string nameOfCurve(std::int32_t number);

/// Calls `visit(PlacedEvent)` for the events of a container that starts at a time of the project, in order.
template <class Visit>
void visitEvents(const standin::Container& container, double start, std::size_t depth, Visit visit)
{
    for (const standin::Node* node = container.firstChild(); node; node = container.childBehind(*node)) {
        const auto& event = static_cast<const standin::Event&>(*node);
        visit(PlacedEvent{event, start + event.start(), start + event.end(), depth});
    }
}

/// The same for all events of a track; those in a part come after it.
template <class Visit>
void visitAllEvents(const standin::Container& container, double start, std::size_t depth, Visit& visit)
{
    visitEvents(container, start, depth, [&visit](const PlacedEvent& placed) {
        visit(placed);
        visitAllEvents(placed.event, placed.start, placed.depth + 1, visit);
    });
}

} // namespace cadrel::app
