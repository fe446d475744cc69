// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/RegionFades.h"

#include "standin/ardour/ListText.h"
#include "standin/ardour/XmlText.h"

#include <pugixml.hpp>

#include <algorithm>
#include <array>
#include <cmath>
#include <numbers>
#include <set>

namespace standin {

namespace {

constexpr std::int64_t DefaultFade = ArdourSession::DefaultFade;
/// Between the points of a list that is written it runs straight. So near it comes to what the user has drawn, and to a fade
/// over a cut.
constexpr double NearDrawn = 5e-7;
constexpr double NearDip = 2e-3;

/// A curve is halved so often between two of its points, and not at all where it has more of them than any user draws.
constexpr int DeepestRefinement = 12;
constexpr std::size_t MostBends = 2000;
/// Just before a sample, in samples.
constexpr double Hair = 1e-6;
/// No fade of the user's is louder.
constexpr double Loudest = 16.0;

/// One end of a region: its fade and the names that go with it.
struct FadeNames {
    const char* active;
    const char* isDefault;
    const char* fade;
    const char* inverse;
    const char* id;
    const char* end;
};

constexpr FadeNames FadeIn{"fade-in-active", "default-fade-in", "FadeIn", "InverseFadeIn", "fadein", "head"};
constexpr FadeNames FadeOut{"fade-out-active", "default-fade-out", "FadeOut", "InverseFadeOut", "fadeout", "tail"};

pugi::xml_node listIn(const pugi::xml_node& element, const char* name)
{
    return element.child(name).child("AutomationList");
}

std::int64_t lengthOf(const pugi::xml_node& element, const FadeNames& names, const SessionClock& clock)
{
    if (!isOn(element, names.active))
        return 0;
    const pugi::xml_node list = listIn(element, names.fade);
    if (isOn(element, names.isDefault) || !list)
        return DefaultFade;
    const std::vector<ListPoint> points = readPoints(list, clock);
    return points.empty() ? DefaultFade : clock.samplesOf(points.back().seconds);
}

/// How loud what a cut fades out is, `sample` samples from the edge, and how loud what it lets through.
double dipAt(double sample, std::int64_t length)
{
    const auto end = static_cast<double>(length);
    return sample >= end ? 1.0 : std::sin(std::max(sample / end, 0.0) * std::numbers::pi / 2.0);
}

double throughDipAt(double sample, std::int64_t length)
{
    const auto end = static_cast<double>(length);
    return sample >= end ? 0.0 : std::cos(std::max(sample / end, 0.0) * std::numbers::pi / 2.0);
}

/// How long an earlier cut fades an edge, in samples.
std::int64_t markedDip(const std::optional<CutMark>& mark)
{
    return mark && mark->edge == RegionEdge::New ? mark->fade : 0;
}

void removeFade(pugi::xml_node& element, const FadeNames& names)
{
    element.remove_child(names.fade);
    element.remove_child(names.inverse);
    set(element, names.isDefault, "1");
}

pugi::xml_node addList(pugi::xml_node& element, const FadeNames& names, const char* name, const SessionClock& clock,
                       SessionId id)
{
    pugi::xml_node list = element.append_child(name).append_child("AutomationList");
    list.append_attribute("automation-id").set_value(names.id);
    list.append_attribute("id").set_value(std::to_string(id).c_str());
    list.append_attribute("interpolation-style").set_value("Linear");
    if (clock.hasUnits())
        list.append_attribute("time-domain").set_value("AudioTime");
    list.append_attribute("state").set_value("Off");
    return list;
}

/// Adds samples between two until what is straight between those is near to a curve, which may step at the last.
template <class Curve>
void refine(std::vector<std::int64_t>& samples, std::int64_t first, std::int64_t last, const Curve& valueAt,
            double near, int depth)
{
    if (last - first < 2 || depth == 0)
        return;
    const double from = valueAt(static_cast<double>(first));
    const double to = valueAt(static_cast<double>(last) - Hair);
    const std::int64_t width = last - first;
    const bool isStraight = std::ranges::all_of(std::array{1, 2, 3}, [&](int quarter) {
        const std::int64_t sample = first + width * quarter / 4;
        const double share = static_cast<double>(sample - first) / static_cast<double>(width);
        return std::abs(valueAt(static_cast<double>(sample)) - std::lerp(from, to, share)) < near;
    });
    if (isStraight)
        return;
    const std::int64_t middle = first + width / 2;
    refine(samples, first, middle, valueAt, near, depth - 1);
    samples.push_back(middle);
    refine(samples, middle, last, valueAt, near, depth - 1);
}

} // namespace

/// The fades of one piece.
class RegionFades::Piece {
public:
    Piece(const RegionFades& region, const RegionPiece& piece, std::int64_t edgeFade)
        : m_fades(region), m_start(piece.start - region.m_region.start), m_length(piece.length),
          m_inEnd(region.m_in.length - m_start), m_outBegin(region.m_region.length - region.m_out.length - m_start)
    {
        const auto dipOf = [&](RegionEdge edge, bool isKept, const std::optional<CutMark>& mark) {
            const std::int64_t dip = edge != RegionEdge::New ? 0 : isKept ? markedDip(mark) : edgeFade;
            return std::min(dip, m_length / 2);
        };
        m_headDip = dipOf(piece.head, piece.keepsHead(), region.m_region.head);
        m_tailDip = dipOf(piece.tail, piece.keepsTail(), region.m_region.tail);
        m_in = std::max({m_inEnd, m_headDip, std::int64_t{0}});
        m_out = std::min({m_outBegin, m_length - m_tailDip, m_length});
        if (m_in > m_out)
            m_in = m_out = std::clamp(m_in, m_headDip, m_length - m_tailDip);
    }

    void writeIn(pugi::xml_node& element, bool isKept, const std::function<SessionId()>& newId) const
    {
        const bool isWhole = m_start == 0 && m_in == m_inEnd && m_outBegin >= m_in;
        if (isKept && (isWhole || m_in == 0))
            return;
        write(element, FadeIn, 0, m_in, m_inEnd <= 0 && m_outBegin >= m_in ? m_headDip : 0, newId);
    }
    void writeOut(pugi::xml_node& element, bool isKept, const std::function<SessionId()>& newId) const
    {
        const bool isWhole = m_start + m_length == m_fades.m_region.length && m_out == m_outBegin && m_inEnd <= m_out;
        if (isKept && (isWhole || (m_out == m_length && m_outBegin >= m_length)))
            return;
        write(element, FadeOut, m_out, m_length, m_outBegin >= m_length && m_inEnd <= m_out ? m_tailDip : 0, newId);
    }

    std::int64_t headDip() const { return m_headDip; }
    std::int64_t tailDip() const { return m_tailDip; }

private:
    double gainAt(double sample) const
    {
        return m_fades.at(sample + static_cast<double>(m_start)).own * dipAt(sample, m_headDip) *
               dipAt(static_cast<double>(m_length) - sample, m_tailDip);
    }
    double belowAt(double sample) const
    {
        double below = m_fades.at(sample + static_cast<double>(m_start)).below;
        below += (1.0 - below) * throughDipAt(sample, m_headDip);
        return below + (1.0 - below) * throughDipAt(static_cast<double>(m_length) - sample, m_tailDip);
    }

    /// Over a stretch of the piece. With a `dip` there is nothing else there.
    void write(pugi::xml_node& element, const FadeNames& names, std::int64_t begin, std::int64_t end, std::int64_t dip,
               const std::function<SessionId()>& newId) const
    {
        removeFade(element, names);
        set(element, names.active, begin < end ? "1" : "0");
        if (begin == end || dip == DefaultFade)
            return;
        set(element, names.isDefault, "0");
        const double near = dip > 0 ? NearDip : NearDrawn;
        writeList(addList(element, names, names.fade, m_fades.m_clock, newId()), begin, end, &Piece::gainAt, near);
        if (dip > 0 || m_fades.m_in.hasBelow || m_fades.m_out.hasBelow)
            writeList(addList(element, names, names.inverse, m_fades.m_clock, newId()), begin, end, &Piece::belowAt,
                      near);
    }

    void writeList(pugi::xml_node list, std::int64_t begin, std::int64_t end, double (Piece::*curve)(double) const,
                   double near) const
    {
        const auto valueAt = [&](double sample) { return std::clamp((this->*curve)(sample), 0.0, Loudest); };
        std::set<std::int64_t> bends{begin, end};
        const auto add = [&](double sample) {
            const auto whole = std::llround(sample) - m_start;
            if (whole > begin && whole < end)
                bends.insert(whole);
        };
        const auto outBegin = static_cast<double>(m_outBegin + m_start);
        for (const auto* const each : {&m_fades.m_in.gain, &m_fades.m_in.below}) {
            for (const double time : each->times())
                add(time);
        }
        for (const auto* const each : {&m_fades.m_out.gain, &m_fades.m_out.below}) {
            for (const double time : each->times())
                add(outBegin + time);
        }
        for (const std::int64_t edge : {m_headDip, m_length - m_tailDip})
            add(static_cast<double>(edge + m_start));
        std::vector<ListPoint> points;
        const auto put = [&](std::int64_t sample, double value) {
            points.push_back({m_fades.m_clock.secondsOf(sample - begin), value});
        };
        for (auto bend = bends.begin(); std::next(bend) != bends.end(); ++bend) {
            const std::int64_t next = *std::next(bend);
            std::vector<std::int64_t> samples{*bend};
            refine(samples, *bend, next, valueAt, near, bends.size() > MostBends ? 0 : DeepestRefinement);
            for (const std::int64_t sample : samples)
                put(sample, valueAt(static_cast<double>(sample)));
            // Where fades overlap, Ardour's sound steps at the ends of both.
            const double before = valueAt(static_cast<double>(next) - Hair);
            const double after = valueAt(static_cast<double>(next));
            const bool isStep = std::abs(before - after) > 10.0 * near;
            if (isStep)
                put(next, before);
            if (next == end && !isStep)
                put(next, after);
        }
        writePoints(list, points, m_fades.m_clock);
    }

    const RegionFades& m_fades;
    std::int64_t m_start; ///< from that of the region
    std::int64_t m_length;
    std::int64_t m_inEnd;    ///< of what the region has
    std::int64_t m_outBegin; ///< of what the region has
    std::int64_t m_headDip = 0;
    std::int64_t m_tailDip = 0;
    std::int64_t m_in = 0;  ///< where the fade of the head ends
    std::int64_t m_out = 0; ///< where that of the tail begins
};

RegionFades::RegionFades(const pugi::xml_node& element, const ArdourSession::Region& region, const SessionClock& clock)
    : m_region(region), m_clock(clock), m_in(fadeOf(element, true)), m_out(fadeOf(element, false))
{
}

std::int64_t RegionFades::lengthIn(const pugi::xml_node& element, const SessionClock& clock)
{
    return lengthOf(element, FadeIn, clock);
}

std::int64_t RegionFades::lengthOut(const pugi::xml_node& element, const SessionClock& clock)
{
    return lengthOf(element, FadeOut, clock);
}

RegionFades::Fade RegionFades::fadeOf(const pugi::xml_node& element, bool isIn) const
{
    const FadeNames& names = isIn ? FadeIn : FadeOut;
    const std::int64_t dip = markedDip(isIn ? m_region.head : m_region.tail);
    Fade fade;
    fade.length = std::min(lengthOf(element, names, m_clock), m_region.length);
    // What is there because of a cut alone is none of the user's.
    if (fade.length <= dip)
        fade.length = 0;
    if (fade.length == 0)
        return fade;
    const pugi::xml_node list = listIn(element, names.fade);
    if (isOn(element, names.isDefault) || !list) {
        fade.gain = FadeCurve::constantPower(fade.length, isIn);
        fade.below = FadeCurve::constantPower(fade.length, !isIn);
        fade.hasBelow = true;
        return fade;
    }
    fade.gain = FadeCurve(list, m_clock);
    if (const pugi::xml_node inverse = listIn(element, names.inverse)) {
        fade.below = FadeCurve(inverse, m_clock);
        fade.hasBelow = true;
    }
    return fade;
}

RegionFades::Loudness RegionFades::drawnAt(double sample) const
{
    // Between its fades nothing is heard of what lies below.
    Loudness loudness{1.0, 0.0};
    const auto length = static_cast<double>(m_region.length);
    const auto outBegin = length - static_cast<double>(m_out.length);
    const bool isIn = sample < static_cast<double>(m_in.length);
    if (isIn)
        loudness = {m_in.gain.at(sample), m_in.below.at(sample)};
    if (m_out.length > 0 && sample >= outBegin) {
        const double through = m_out.below.at(sample - outBegin);
        // Ardour plays the one fade and then the other on top of it.
        loudness.own = m_out.gain.at(sample - outBegin) + (isIn ? loudness.own * through : 0.0);
        loudness.below = isIn ? loudness.below * through : through;
    }
    return loudness;
}

RegionFades::Loudness RegionFades::at(double sample) const
{
    Loudness loudness = drawnAt(sample);
    // Without what the cuts of earlier runs have put over it. At the very edge nothing is left to be told.
    const auto length = static_cast<double>(m_region.length);
    const auto undo = [&](std::int64_t dip, double fromEdge, double inwards) {
        if (dip == 0 || fromEdge >= static_cast<double>(dip))
            return;
        const double there = fromEdge < 1.0 ? 1.0 : fromEdge;
        const double through = throughDipAt(there, dip);
        const Loudness dipped = drawnAt(sample + inwards * (there - fromEdge));
        loudness.own = dipped.own / dipAt(there, dip);
        loudness.below = (dipped.below - through) / (1.0 - through);
    };
    undo(m_in.length > 0 ? markedDip(m_region.head) : 0, sample, 1.0);
    undo(m_out.length > 0 ? markedDip(m_region.tail) : 0, length - sample, -1.0);
    return loudness;
}

void RegionFades::cut(pugi::xml_node& element, const RegionPiece& piece, std::int64_t edgeFade,
                      const std::function<SessionId()>& newId) const
{
    const Piece fades(*this, piece, edgeFade);
    fades.writeIn(element, piece.keepsHead(), newId);
    fades.writeOut(element, piece.keepsTail(), newId);
    const auto note = [&](const char* end, RegionEdge edge, std::int64_t dip, std::int64_t place, std::int64_t length) {
        if (edge == RegionEdge::Old)
            CutMark::remove(element, end);
        else
            CutMark{edge, static_cast<std::int32_t>(dip)}.write(element, end, place, length);
    };
    note(FadeIn.end, piece.head, fades.headDip(), piece.start, lengthIn(element, m_clock));
    note(FadeOut.end, piece.tail, fades.tailDip(), piece.start + piece.length, lengthOut(element, m_clock));
}

} // namespace standin
