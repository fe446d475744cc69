// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/RegionPiece.h"

#include "standin/ardour/CurveScale.h"
#include "standin/ardour/ListText.h"
#include "standin/project/ClipEvent.h"

#include <pugixml.hpp>

#include <algorithm>
#include <cmath>
#include <numbers>
#include <set>
#include <string_view>

namespace standin {

namespace {

using ListPoints = std::vector<ListPoint>;

constexpr std::int64_t DefaultFade = ArdourSession::DefaultFade;
/// Of a fade that is written: the sine of a quarter of a circle in so many steps.
constexpr int StepsOfAFade = 16;

void set(pugi::xml_node& element, const char* name, const std::string& value)
{
    pugi::xml_attribute attribute = element.attribute(name);
    if (!attribute)
        attribute = element.append_attribute(name);
    attribute.set_value(value.c_str());
}

bool isOn(const pugi::xml_node& element, const char* name)
{
    return std::string_view(element.attribute(name).value()) == "1";
}

/// One end of a region: its fade and the names that go with it.
struct FadeNames {
    const char* active;
    const char* isDefault;
    const char* fade;
    const char* inverse;
    const char* id;
};

constexpr FadeNames FadeIn{"fade-in-active", "default-fade-in", "FadeIn", "InverseFadeIn", "fadein"};
constexpr FadeNames FadeOut{"fade-out-active", "default-fade-out", "FadeOut", "InverseFadeOut", "fadeout"};

/// In samples.
std::int64_t fadeLength(const pugi::xml_node& element, const FadeNames& names, const SessionClock& clock)
{
    const pugi::xml_node list = element.child(names.fade).child("AutomationList");
    if (isOn(element, names.isDefault) || !list)
        return DefaultFade;
    const ListPoints points = readPoints(list, clock);
    return points.empty() ? DefaultFade : clock.samplesOf(points.back().seconds);
}

/// A fade of constant power over a piece's edge.
void writeFade(pugi::xml_node& element, const FadeNames& names, std::int64_t length, const SessionClock& clock,
               const std::function<SessionId()>& newId)
{
    const auto write = [&](const char* name, bool isRising) {
        element.remove_child(name);
        pugi::xml_node list = element.append_child(name).append_child("AutomationList");
        list.append_attribute("automation-id").set_value(names.id);
        list.append_attribute("id").set_value(std::to_string(newId()).c_str());
        list.append_attribute("interpolation-style").set_value("Curved");
        if (clock.hasUnits())
            list.append_attribute("time-domain").set_value("AudioTime");
        list.append_attribute("state").set_value("Off");
        ListPoints points;
        for (int step = 0; step <= StepsOfAFade; ++step) {
            const double share = static_cast<double>(step) / StepsOfAFade;
            const double value = std::sin((isRising ? share : 1.0 - share) * std::numbers::pi / 2.0);
            points.push_back({clock.secondsOf(length) * share, value});
        }
        writePoints(list, points, clock);
    };
    const bool isIn = &names == &FadeIn;
    write(names.fade, isIn);
    write(names.inverse, !isIn);
    set(element, names.isDefault, "0");
}

void stretchFade(pugi::xml_node& element, const FadeNames& names, double factor, const SessionClock& clock)
{
    for (const char* const name : {names.fade, names.inverse}) {
        pugi::xml_node list = element.child(name).child("AutomationList");
        if (!list)
            continue;
        ListPoints points = readPoints(list, clock);
        for (ListPoint& point : points)
            point.seconds *= factor;
        writePoints(list, points, clock);
    }
}

/// What a fade is to be after a cut, and is made at last so that both of a piece fit in it.
class EdgeFade {
public:
    EdgeFade(pugi::xml_node& element, const FadeNames& names, RegionEdge edge, const SessionClock& clock)
        : m_element(element), m_names(names), m_edge(edge), m_clock(clock)
    {
        if (edge == RegionEdge::Seam)
            set(element, names.active, "0");
        m_length = isOn(element, names.active) ? fadeLength(element, names, clock) : 0;
    }

    std::int64_t length() const { return m_length; }
    bool isOld() const { return m_edge == RegionEdge::Old; }

    /// At a new edge there is no fade of the user's any more.
    void begin(std::int64_t length, const std::function<SessionId()>& newId)
    {
        if (m_edge != RegionEdge::New)
            return;
        m_element.remove_child(m_names.fade);
        m_element.remove_child(m_names.inverse);
        set(m_element, m_names.isDefault, "1");
        set(m_element, m_names.active, length > 0 ? "1" : "0");
        m_length = length;
        if (length > 0 && length != DefaultFade)
            writeFade(m_element, m_names, length, m_clock, newId);
    }
    void shorten(std::int64_t length, const std::function<SessionId()>& newId)
    {
        if (length >= m_length)
            return;
        if (length <= 0)
            set(m_element, m_names.active, "0");
        else if (isOn(m_element, m_names.isDefault) || !m_element.child(m_names.fade))
            writeFade(m_element, m_names, length, m_clock, newId);
        else
            stretchFade(m_element, m_names, static_cast<double>(length) / static_cast<double>(m_length), m_clock);
        m_length = std::max<std::int64_t>(length, 0);
    }

private:
    pugi::xml_node& m_element;
    const FadeNames& m_names;
    RegionEdge m_edge;
    const SessionClock& m_clock;
    std::int64_t m_length = 0;
};

void cutFades(pugi::xml_node& element, const RegionPiece& piece, const SessionClock& clock, std::int64_t edgeFade,
              const std::function<SessionId()>& newId)
{
    EdgeFade in(element, FadeIn, piece.head, clock);
    EdgeFade out(element, FadeOut, piece.tail, clock);
    // Ardour lets the fades that the user has drawn overlap.
    if (in.isOld() && out.isOld())
        return;
    in.begin(edgeFade, newId);
    out.begin(edgeFade, newId);
    if (in.length() + out.length() <= piece.length)
        return;
    // What the user has drawn gives way last.
    EdgeFade& first = in.isOld() && !out.isOld() ? out : in;
    EdgeFade& second = &first == &in ? out : in;
    first.shorten(std::max(piece.length - second.length(), std::min(first.length(), piece.length / 2)), newId);
    second.shorten(piece.length - first.length(), newId);
}

/// The gain envelope counts from the start of the region.
void cutEnvelope(pugi::xml_node& element, const ArdourSession::Region& region, const RegionPiece& piece,
                 const SessionClock& clock)
{
    pugi::xml_node list = element.child("Envelope").child("AutomationList");
    if (!list || (piece.head == RegionEdge::Old && piece.tail == RegionEdge::Old))
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

} // namespace

std::vector<RegionPiece> piecesOf(const ArdourSession::Region& region, const std::vector<const ClipEvent*>& events,
                                  const SessionClock& clock)
{
    std::vector<RegionPiece> pieces;
    const double formerPlace = clock.secondsOf(region.position) - clock.secondsOf(region.start);
    // Where pieces begin and end: in the programme and in the source.
    using Instant = std::pair<std::int64_t, std::int64_t>;
    std::set<Instant> heads;
    std::set<Instant> tails;
    for (const ClipEvent* const event : events) {
        const std::int64_t moved = clock.samplesOf(event->start() - (formerPlace + event->sourceOffset()));
        RegionPiece piece;
        piece.position = clock.samplesOf(event->start());
        piece.length = clock.samplesOf(event->end()) - piece.position;
        piece.start = region.start + piece.position - moved - region.position;
        if (piece.length <= 0)
            continue;
        heads.insert({piece.position, piece.start});
        tails.insert({piece.position + piece.length, piece.start + piece.length});
        pieces.push_back(piece);
    }
    for (RegionPiece& piece : pieces) {
        const Instant head{piece.position, piece.start};
        const Instant tail{piece.position + piece.length, piece.start + piece.length};
        if (piece.start > region.start)
            piece.head = tails.contains(head) ? RegionEdge::Seam : RegionEdge::New;
        if (tail.second < region.start + region.length)
            piece.tail = heads.contains(tail) ? RegionEdge::Seam : RegionEdge::New;
    }
    return pieces;
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
    cutFades(element, piece, clock, edgeFade, newId);
    cutEnvelope(element, region, piece, clock);
}

} // namespace standin
