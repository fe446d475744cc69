// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/RegionPiece.h"

#include "standin/ardour/CurveScale.h"
#include "standin/ardour/ListText.h"
#include "standin/ardour/RegionFades.h"
#include "standin/ardour/XmlText.h"
#include "standin/project/ClipEvent.h"

#include <pugixml.hpp>

#include <algorithm>
#include <cmath>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <tuple>
#include <utility>

namespace standin {

namespace {

using ListPoints = std::vector<ListPoint>;

/// The gain envelope counts from the start of the region.
void cutEnvelope(pugi::xml_node& element, const ArdourSession::Region& region, const RegionPiece& piece,
                 const SessionClock& clock)
{
    pugi::xml_node list = element.child("Envelope").child("AutomationList");
    if (!list || (piece.start == region.start && piece.length == region.length))
        return;
    const ListPoints points = readPoints(list, clock);
    if (points.empty())
        return;
    std::vector<double> values;
    for (const ListPoint& point : points)
        values.push_back(point.value);
    const CurveScale scale(list.attribute("interpolation-style").value(), values);
    const double start = clock.secondsOf(piece.start - region.start);
    const double end = start + clock.secondsOf(piece.length);
    // Of the points that stand at a time the envelope comes to the first and goes on from the last.
    const auto valueAt = [&](double seconds, bool goesOn) {
        const auto after = goesOn ? std::ranges::upper_bound(points, seconds, {}, &ListPoint::seconds)
                                  : std::ranges::lower_bound(points, seconds, {}, &ListPoint::seconds);
        if (after == points.begin())
            return after->value;
        const ListPoint& before = *std::prev(after);
        if (after == points.end() || scale.holds())
            return before.value;
        const double share = (seconds - before.seconds) / (after->seconds - before.seconds);
        return scale.toValue(std::lerp(scale.toShare(before.value), scale.toShare(after->value), share));
    };
    ListPoints cut{{0.0, valueAt(start, true)}};
    for (const ListPoint& point : points) {
        if (point.seconds > start && point.seconds < end)
            cut.push_back({point.seconds - start, point.value});
    }
    cut.push_back({end - start, valueAt(end, false)});
    writePoints(list, cut, clock);
}

/// What a region was before the run.
RegionPiece formerOf(const ArdourSession::Region& region)
{
    return {region.position, region.length, region.start, region.head ? RegionEdge::New : RegionEdge::Old,
            region.tail ? RegionEdge::New : RegionEdge::Old};
}

struct SourcePiece {
    SessionId source;
    RegionPiece* piece;
};

void findSeams(const std::vector<SourcePiece>& pieces)
{
    // Where pieces begin and end: the source, and the places in the programme and in the source.
    using Instant = std::tuple<SessionId, std::int64_t, std::int64_t>;
    const auto headOf = [](const SourcePiece& of) { return Instant{of.source, of.piece->position, of.piece->start}; };
    const auto tailOf = [](const SourcePiece& of) {
        const std::int64_t length = of.piece->length;
        return Instant{of.source, of.piece->position + length, of.piece->start + length};
    };
    std::set<Instant> heads;
    std::set<Instant> tails;
    for (const SourcePiece& of : pieces) {
        if (of.piece->head == RegionEdge::New)
            heads.insert(headOf(of));
        if (of.piece->tail == RegionEdge::New)
            tails.insert(tailOf(of));
    }
    for (const SourcePiece& of : pieces) {
        if (of.piece->head == RegionEdge::New && tails.contains(headOf(of)))
            of.piece->head = RegionEdge::Seam;
        if (of.piece->tail == RegionEdge::New && heads.contains(tailOf(of)))
            of.piece->tail = RegionEdge::Seam;
    }
}

/// Which samples of a region lie between two times from its start on, in seconds; nothing when there are none, or none but
/// those next to a cut that is near to an edge.
std::optional<std::pair<std::int64_t, std::int64_t>> stretchOf(const ArdourSession::Region& region, double start,
                                                               double end, const SessionClock& clock)
{
    // One without a sample, which nobody can cut.
    if (region.length == 0)
        return std::pair<std::int64_t, std::int64_t>{};
    const auto length = static_cast<double>(region.length);
    // What is as near but for rounding isn't near.
    const double near = std::min(NearToCut, length / 2.0) - 1e-6;
    const auto rate = static_cast<double>(clock.sampleRate());
    const bool begins = start * rate < near;
    const bool ends = end * rate > length - near;
    if (end * rate < near || start * rate > length - near)
        return std::nullopt;
    const std::int64_t first = begins ? 0 : clock.samplesOf(start);
    const std::int64_t last = ends ? region.length : clock.samplesOf(end);
    return last > first ? std::optional(std::pair(first, last)) : std::nullopt;
}

/// The nearest number of samples, the same there and back.
std::int64_t distanceOf(double seconds, const SessionClock& clock)
{
    return seconds < 0.0 ? -clock.samplesOf(-seconds) : clock.samplesOf(seconds);
}

} // namespace

std::vector<RegionPiece> piecesOf(const ArdourSession::Region& region, const std::vector<const ClipEvent*>& events,
                                  const SessionClock& clock)
{
    std::vector<RegionPiece> pieces;
    for (const ClipEvent* const event : events) {
        const double offset = event->sourceOffset() - clock.secondsOf(region.start);
        const std::int64_t moved = distanceOf(event->start() - offset - clock.secondsOf(region.position), clock);
        const auto played = stretchOf(region, offset, offset + event->length(), clock);
        if (!played || (region.length == 0 && moved != 0))
            continue;
        RegionPiece piece;
        const std::int64_t first = region.position + moved + played->first;
        const std::int64_t below = std::max<std::int64_t>(-first, 0);
        piece.position = first + below;
        piece.start = region.start + played->first + below;
        piece.length = played->second - played->first - below;
        if (piece.start > region.start || region.head)
            piece.head = RegionEdge::New;
        if (piece.start + piece.length < region.start + region.length || region.tail)
            piece.tail = RegionEdge::New;
        pieces.push_back(piece);
    }
    return pieces;
}

void findSeams(std::vector<RegionPieces>& playlist)
{
    std::vector<RegionPiece> former;
    std::vector<SourcePiece> formerPlaces;
    former.reserve(playlist.size());
    std::vector<SourcePiece> places;
    for (RegionPieces& of : playlist) {
        former.push_back(formerOf(of.region));
        formerPlaces.push_back({of.region.source, &former.back()});
        for (RegionPiece& piece : of.pieces)
            places.push_back({of.region.source, &piece});
    }
    findSeams(formerPlaces);
    findSeams(places);
    for (std::size_t index = 0; index < playlist.size(); ++index) {
        const RegionPiece& before = former[index];
        for (RegionPiece& piece : playlist[index].pieces) {
            piece.isHeadAsBefore = piece.start == before.start && piece.head == before.head;
            piece.isTailAsBefore =
                piece.start + piece.length == before.start + before.length && piece.tail == before.tail;
        }
    }
}

void giveNewIds(pugi::xml_node& element, const std::function<SessionId()>& newId)
{
    for (pugi::xml_node& part : std::vector<pugi::xml_node>(element.begin(), element.end())) {
        for (pugi::xml_node list : part.children("AutomationList"))
            set(list, "id", std::to_string(newId()));
    }
}

void cutRegion(pugi::xml_node& element, const ArdourSession::Region& region, const RegionPiece& piece,
               const SessionClock& clock, std::int64_t edgeFade, const std::function<SessionId()>& newId)
{
    const std::string start = clock.timeText(piece.start);
    if (clock.hasUnits()) {
        set(element, "length", clock.timeText(piece.length) + "@" + clock.timeText(piece.position));
    } else {
        set(element, "position", clock.timeText(piece.position));
        set(element, "length", clock.timeText(piece.length));
        // It stands at a sample now, not at a beat.
        if (element.attribute("positional-lock-style"))
            set(element, "positional-lock-style", "AudioTime");
    }
    set(element, "start", start);
    const pugi::xml_attribute sync = element.attribute("sync-position");
    if (sync) {
        const std::int64_t place = isOn(element, "sync-marked") ? clock.samples(sync.value()) : -1;
        if (place < piece.start || place > piece.start + piece.length) {
            set(element, "sync-marked", "0");
            set(element, "sync-position", start);
        }
    }
    if (element.attribute("whole-file"))
        set(element, "whole-file", "0");
    if (!piece.keepsHead() || !piece.keepsTail())
        RegionFades(element, region, clock).cut(element, piece, edgeFade, newId);
    cutEnvelope(element, region, piece, clock);
}

} // namespace standin
