// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/base/Attribute.h"
#include "standin/stage/JsonWriter.h"
#include "standin/stage/ProjectKeys.h"

#include <functional>
#include <string>
#include <string_view>

namespace standin {

class AttributeList;
class AutomationPoint;
class Container;
class Envelope;
class Event;
class MediaClip;
class MediaPool;
class Node;
class Project;
class Track;

/// Writes the text of a project file. Whatever it writes can be read again.
class ProjectWriter {
public:
    /// Throws FileFault for what no file can hold, such as a time beyond all bounds; only a program that sets it past the
    /// interfaces can bring that about.
    static std::string textOf(const Project& project);

    /// Which clips, tracks, curves and events a text has. What isn't written has nothing of what is in it written either.
    using Choice = std::function<bool(const Node&)>;
    /// The text of a project that has only these. What is written must not need what isn't.
    static std::string textOf(const Project& project, const Choice& isWritten);

private:
    ProjectWriter(const Project& project, const Choice& isWritten) : m_project(project), m_isWritten(isWritten) {}

    void writeProject();
    void writeClock();
    void writePool();
    void writeClip(const MediaClip& clip);
    void writeTracks(const Container& parent);
    void writeTrack(const Track& track);
    void writeCurves(const Track& track);
    void writeCurve(const Envelope& curve);
    void writePoint(const AutomationPoint& point);
    void writeEvents(const Container& container);
    void writeEvent(const Event& event);
    void writeReference(const MediaClip& clip);

    void writeName(const Node& node);
    /// What any node may have after its own members: selection, attributes and unknown members.
    void writeDetails(const Node& node, KnownKeys known, JsonWriter::Layout layout);
    void writeAttributes(const Node& node, JsonWriter::Layout layout);
    void writeAttribute(const Attribute& attribute, JsonWriter::Layout layout);
    void writeUnknownMembers(const Node& node, KnownKeys known);

    void writeSeconds(std::string_view key, double seconds, double least = 0.0);
    void writeNumber(std::string_view key, double number, double least, double most);
    void writeCount(std::string_view key, int number);
    void writeText(std::string_view key, std::string_view text);
    void writeText(std::string_view key, std::u16string_view text);
    void writeFlag(std::string_view key, bool flag);
    void writeKey(std::string_view key);
    void enter();
    [[noreturn]] void refuse(const std::string& fault) const;

    const Project& m_project;
    const Choice& m_isWritten;
    JsonWriter m_json;
    int m_depth = 0; ///< of containers in one another
};

} // namespace standin
