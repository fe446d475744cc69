// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/project/ProjectContent.h"

#include "app/console/Printable.h"
#include "standin/base/Utf16.h"

#include <algorithm>
#include <string_view>

namespace cadrel::app {

using standin::Track;

Tracks tracksOf(const standin::Project& project)
{
    const std::vector<Track*> tracks = project.allTracks();
    return {tracks.begin(), tracks.end()};
}

Tracks foldersAround(const Track& track)
{
    Tracks folders;
    for (const auto* folder = dynamic_cast<const Track*>(track.parent()); folder;
         folder = dynamic_cast<const Track*>(folder->parent()))
        folders.push_back(folder);
    std::reverse(folders.begin(), folders.end());
    return folders;
}

ContentCount& ContentCount::operator+=(const ContentCount& other)
{
    clips += other.clips;
    parts += other.parts;
    markers += other.markers;
    points += other.points;
    return *this;
}

ContentCount countContent(const Track& track)
{
    ContentCount count;
    if (track.isFolder())
        return count;
    const auto visit = [&count](const PlacedEvent& placed) {
        if (dynamic_cast<const standin::Part*>(&placed.event))
            ++count.parts;
        else if (dynamic_cast<const standin::Marker*>(&placed.event))
            ++count.markers;
        else
            ++count.clips;
    };
    visitAllEvents(track, 0.0, 0, visit);
    for (const auto& [number, curve] : track.curves())
        count.points += curve->childCount();
    return count;
}

const char* kindOf(const standin::Event& event)
{
    if (dynamic_cast<const standin::Part*>(&event))
        return "part";
    if (const auto* marker = dynamic_cast<const standin::Marker*>(&event))
        return marker->isRange() ? "range" : "marker";
    return "clip";
}

std::string printableName(const std::u16string& name, std::size_t mostCharacters)
{
    if (name.empty())
        return "(no name)";
    // What can't be shown isn't converted either: of a column, a letter and its accents have no more units.
    constexpr std::size_t MostUnitsOfAColumn = 8;
    std::u16string_view start = std::u16string_view(name).substr(0, MostUnitsOfAColumn * (mostCharacters + 1));
    const bool endsInHalf = start.back() >= 0xd800 && start.back() <= 0xdbff;
    start.remove_suffix(endsInHalf ? 1 : 0);
    return toPrintable(standin::toUtf8(start), mostCharacters).text;
}

std::string nameOfCurve(std::int32_t number)
{
    const std::string_view name = standin::Envelope::Curve::nameOf(number);
    return name.empty() ? "curve " + std::to_string(number) : std::string(name);
}

} // namespace cadrel::app
