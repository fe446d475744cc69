// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/ArdourWriter.h"

#include "standin/ardour/ListText.h"
#include "standin/ardour/OwnStorage.h"
#include "standin/base/Utf16.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Envelope.h"
#include "standin/project/FileFault.h"
#include "standin/project/Marker.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"

#include <pugixml.hpp>

#include <algorithm>
#include <optional>
#include <set>

namespace standin {

namespace {

/// How deep new elements stand in a session.
constexpr unsigned LocationDepth = 2;
constexpr unsigned ExtraDepth = 2;

std::string indentOf(unsigned depth)
{
    return std::string("\n").append(std::size_t{2} * depth, ' ');
}

/// An element of the session's text, to be changed.
class Element {
public:
    Element(const TextRange& range, std::string_view text)
    {
        const std::string_view element = range.in(text);
        m_document.load_buffer(element.data(), element.size(), pugi::parse_default | pugi::parse_comments,
                               pugi::encoding_utf8);
        node = m_document.document_element();
    }

    pugi::xml_node node;

private:
    pugi::xml_document m_document;
};

std::string listed(const std::vector<SessionId>& ids)
{
    std::string text;
    for (const SessionId id : ids)
        text.append(text.empty() ? "" : " ").append(std::to_string(id));
    return text;
}

} // namespace

ArdourWriter::ArdourWriter(const ArdourSession& session, const Project& project)
    : m_session(session), m_project(project), m_patch(session.text), m_nextId(session.largestId + 1)
{
    for (const Track* const track : project.allTracks()) {
        if (const SessionId route = attributeId(*track, SessionKey::Route))
            m_tracks.emplace(route, track);
    }
}

std::string ArdourWriter::text()
{
    for (const auto& [route, playlist] : m_session.playlists) {
        const auto track = m_tracks.find(route);
        if (track != m_tracks.end())
            writePlaylist(playlist, *track->second);
    }
    writeLists();
    writeLocations();
    writeOwn();
    writeIdCounter();
    return m_patch.result();
}

void ArdourWriter::writePlaylist(const ArdourSession::Playlist& playlist, const Track& track)
{
    std::map<SessionId, std::vector<const ClipEvent*>> events;
    for (const SessionId region : playlist.regions)
        events[region];
    for (const Node* node = track.firstChild(); node; node = track.childBehind(*node)) {
        const auto* const event = dynamic_cast<const ClipEvent*>(node);
        const auto found = events.find(attributeId(*node, SessionKey::Region));
        if (!event || found == events.end()) {
            throw FileFault("the track " + quoted(std::string_view(toUtf8(track.name()))) + " has " +
                            quoted(std::string_view(toUtf8(node->name()))) + ", which the session doesn't have there");
        }
        found->second.push_back(event);
    }
    std::vector<RegionPieces> pieces;
    for (const SessionId id : playlist.regions) {
        const ArdourSession::Region& region = m_session.regions.at(id);
        pieces.push_back({region, piecesOf(region, events.at(id), m_session.clock)});
    }
    findSeams(pieces);
    for (const RegionPieces& of : pieces)
        writeRegion(of.region, of.pieces);
}

void ArdourWriter::writeRegion(const ArdourSession::Region& region, const std::vector<RegionPiece>& pieces)
{
    if (pieces.size() == 1 && pieces.front().isAll(region))
        return;
    if (pieces.empty()) {
        m_patch.remove(region.text);
        return;
    }
    if (pieces.size() == 1 && pieces.front().isWhole(region) && !region.isMusical) {
        moveRegion(region, pieces.front().position);
        return;
    }
    const auto next = [this] { return newId(); };
    const unsigned depth = depthOf(region.text, m_session.text);
    std::string text;
    for (const RegionPiece& piece : pieces) {
        Element element(region.text, m_session.text);
        // The first keeps the ids, which others may know.
        if (!text.empty()) {
            element.node.attribute("id").set_value(std::to_string(newId()).c_str());
            giveNewIds(element.node, next);
            text += indentOf(depth);
        }
        cutRegion(element.node, region, piece, m_session.clock, m_session.edgeFade, next);
        text += printed(element.node, depth);
    }
    m_patch.replace(region.text, std::move(text));
}

void ArdourWriter::moveRegion(const ArdourSession::Region& region, std::int64_t position)
{
    const SessionClock& clock = m_session.clock;
    const std::string place = clock.timeText(position);
    const std::string length = clock.timeText(region.length);
    visitAttributes(startTagOf(region.text, m_session.text), m_session.text,
                    [&](std::string_view name, const TextRange& value) {
                        if (name == "length" && clock.hasUnits())
                            m_patch.replace(value, length + "@" + place);
                        else if (name == "position" && !clock.hasUnits())
                            m_patch.replace(value, place);
                        // It stands at a sample now, not at a beat.
                        else if (name == "positional-lock-style" && !clock.hasUnits())
                            m_patch.replace(value, "AudioTime");
                    });
}

void ArdourWriter::writeLists()
{
    for (const auto& [place, list] : m_session.lists) {
        const auto track = m_tracks.find(place.first);
        if (track == m_tracks.end())
            continue;
        const auto curve = track->second->curves().find(place.second);
        if (curve != track->second->curves().end())
            writeList(list, *curve->second);
    }
}

void ArdourWriter::writeList(const ArdourSession::List& list, const Envelope& curve)
{
    std::vector<std::pair<double, double>> points;
    for (const Node* node = curve.firstChild(); node; node = curve.childBehind(*node))
        points.emplace_back(node->start(), static_cast<const AutomationPoint&>(*node).value());
    if (points == list.points)
        return;
    std::vector<ListPoint> written;
    for (const auto& [seconds, share] : points) {
        const double value = list.scale.toValue(share);
        // A value that holds has no need of the point to which it holds.
        if (!list.scale.holds() || written.empty() || written.back().value != value)
            written.push_back({seconds, value});
    }
    Element element(list.text, m_session.text);
    writePoints(element.node, written, m_session.clock);
    m_patch.replace(list.text, printed(element.node, depthOf(list.text, m_session.text)));
}

void ArdourWriter::writeLocations()
{
    std::string added;
    std::set<SessionId> used;
    const auto write = [&](const Node& marker, const std::string& name) {
        const SessionId former = attributeId(marker, SessionKey::Location);
        const auto found = m_session.locations.find(former);
        const bool isFirst = found != m_session.locations.end() && used.insert(former).second;
        const SessionId id = isFirst ? former : newId();
        const std::int64_t start = m_session.clock.samplesOf(marker.start());
        const std::int64_t end = m_session.clock.samplesOf(marker.end());
        if (isFirst && found->second.start == start && found->second.end == end && found->second.name == name)
            return id;
        pugi::xml_document made;
        std::optional<Element> copied;
        pugi::xml_node node;
        if (found != m_session.locations.end()) {
            node = copied.emplace(found->second.text, m_session.text).node;
        } else {
            node = made.append_child("Location");
            for (const char* const attribute : {"id", "name", "start", "end", "flags", "locked", "timestamp", "cue"})
                node.append_attribute(attribute).set_value("0");
            node.attribute("flags").set_value(static_cast<const Marker&>(marker).isRange() ? "IsRangeMarker"
                                                                                           : "IsMark");
        }
        node.attribute("id").set_value(std::to_string(id).c_str());
        node.attribute("name").set_value(name.c_str());
        node.attribute("start").set_value(m_session.clock.timeText(start).c_str());
        node.attribute("end").set_value(m_session.clock.timeText(end).c_str());
        if (isFirst)
            m_patch.replace(found->second.text, printed(node, LocationDepth));
        else
            added.append(indentOf(LocationDepth)).append(printed(node, LocationDepth));
        return id;
    };
    for (const Track* const track : m_project.allTracks()) {
        const bool isOwn = OwnStorage::isOwnMarkerTrack(*track);
        if (track->kind() != Track::Kind::Marker)
            continue;
        for (const Node* marker = track->firstChild(); marker; marker = track->childBehind(*marker)) {
            const std::u16string name = isOwn ? ownLocationName(track->name(), marker->name()) : marker->name();
            const SessionId id = write(*marker, withoutForbidden(toUtf8(name)));
            if (isOwn)
                m_ownMarkers.push_back(id);
        }
    }
    for (const auto& [id, location] : m_session.locations) {
        if (!used.contains(id))
            m_patch.remove(location.text);
    }
    writeSessionRange();
    if (added.empty())
        return;
    if (m_session.locationsElement.end != 0)
        insertInto(m_session.locationsElement, "Locations", std::move(added));
    else
        insertInto(m_session.element, "Session", "\n  <Locations>" + added + "\n  </Locations>");
}

void ArdourWriter::writeSessionRange()
{
    if (!m_session.sessionRange)
        return;
    const std::optional<double> end = sessionEnd(m_project);
    const std::int64_t samples =
        end ? std::max(m_session.clock.samplesOf(*end), m_session.sessionRange->start) : m_session.sessionRange->end;
    if (samples == m_session.sessionRange->end)
        return;
    Element element(m_session.sessionRange->text, m_session.text);
    element.node.attribute("end").set_value(m_session.clock.timeText(samples).c_str());
    m_patch.replace(m_session.sessionRange->text, printed(element.node, LocationDepth));
}

void ArdourWriter::writeOwn()
{
    const std::string own = OwnStorage::textOf(m_project);
    if (own == m_session.ownAsRead && m_ownMarkers == m_session.ownMarkers)
        return;
    if (own.empty()) {
        m_patch.remove(m_session.own);
        return;
    }
    pugi::xml_document document;
    pugi::xml_node node = document.append_child("Cadrel");
    node.append_attribute("version").set_value("1");
    if (!m_ownMarkers.empty())
        node.append_attribute("markers").set_value(listed(m_ownMarkers).c_str());
    node.text().set(own.c_str());
    std::string text = printed(node, ExtraDepth);
    if (m_session.own.end != 0)
        m_patch.replace(m_session.own, std::move(text));
    else if (m_session.extra.end != 0)
        insertInto(m_session.extra, "Extra", indentOf(ExtraDepth) + text);
    else
        insertInto(m_session.element, "Session",
                   std::string("\n  <Extra>").append(indentOf(ExtraDepth)).append(text).append("\n  </Extra>"));
}

void ArdourWriter::writeIdCounter()
{
    if (m_nextId == m_session.largestId + 1)
        return;
    const std::optional<TextRange> counter =
        valueIn(startTagOf(m_session.element, m_session.text), "id-counter", m_session.text);
    if (!counter)
        throw FileFault("the session doesn't count its ids");
    m_patch.replace(*counter, std::to_string(m_nextId));
}

void ArdourWriter::insertInto(const TextRange& element, const std::string& name, std::string text)
{
    const TextRange tag = startTagOf(element, m_session.text);
    if (tag.end == element.end) {
        // <Name/> becomes <Name>...</Name>.
        const std::size_t slash = m_session.text.rfind('/', tag.end - 1);
        m_patch.replace({slash, tag.end}, std::string(">").append(text).append("\n  </").append(name).append(">"));
        return;
    }
    // Before the blanks that stand before the end tag.
    std::size_t at = m_session.text.rfind("</", element.end - 1);
    while (at > tag.end && std::string_view(" \t\r\n").find(m_session.text[at - 1]) != std::string_view::npos)
        --at;
    m_patch.insert(at, std::move(text));
}

} // namespace standin
