// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>
#include <vector>

namespace standin {

class Node;
class Project;
class Track;

/// What of a project no object of a session can hold: Cadrel's attributes and its own tracks.
class OwnStorage {
public:
    /// The text of a project file that has only that; empty when there is nothing. Throws FileFault.
    static std::string textOf(const Project& project);
    /// The markers on Cadrel's tracks, in the order in which the text has them.
    static std::vector<Node*> markersOf(const Project& project);
    /// Whether it is a track of markers that Cadrel has made.
    static bool isOwnMarkerTrack(const Track& track);
};

} // namespace standin
