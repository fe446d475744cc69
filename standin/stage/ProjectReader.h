// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/stage/JsonMembers.h"
#include "standin/stage/ProjectKeys.h"
#include "velmark/Counted.h"

#include <string>
#include <string_view>

namespace standin {

struct Attribute;
class ChangeLog;
class Container;
class Envelope;
class Event;
class Node;
class Project;
class Track;

/// Reads the text of a project file. Nothing in it is trusted.
class ProjectReader {
public:
    /// Throws FileFault. Nothing of the project counts as changed.
    static Velmark::Counted<Project> read(std::string_view text, ChangeLog& log);

private:
    explicit ProjectReader(Project& project) : m_project(project) {}

    void readProject(const JsonMembers& members);
    void readClock(const JsonMembers& members);
    void readClip(const JsonMembers& members);
    /// `level` is that of the track or of the container of the events: how many containers lie in one another down to it.
    void readTrack(const JsonMembers& members, Container& parent, int level);
    void readCurves(const JsonMembers& members, Track& track);
    void readCurve(const JsonMembers& members, Envelope& curve);
    void readPoint(const JsonMembers& members, Envelope& curve);
    void readEvents(const JsonMembers& members, Container& container, int level);
    void readEvent(const JsonMembers& members, Container& container, int level);
    Velmark::Counted<Event> newEvent(const JsonMembers& members);
    Velmark::Counted<Event> newClipEvent(const JsonMembers& members);

    /// What any node may have, besides what it is.
    static void readDetails(const JsonMembers& members, Node& node, KnownKeys known);
    static Attribute attributeOf(JsonValue value, const JsonPlace& place);

    Project& m_project;
};

} // namespace standin
