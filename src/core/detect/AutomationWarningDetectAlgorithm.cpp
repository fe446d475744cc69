// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/detect/AutomationWarningDetectAlgorithm.h"

#include "core/cut/CadrelRunState.h"
#include "core/cut/CutList.h"
#include "core/cut/ProgrammeShift.h"
#include "core/settings/Settings.h"
#include "core/time/SecondsRange.h"
#include "core/time/Timecode.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <cmath>
#include <compare>
#include <cstddef>
#include <limits>
#include <map>
#include <optional>
#include <utility>

namespace cadrel::core {

namespace {

/// A larger step of a curve can be heard. Values from 0 to 1 that a host stores as 32-bit floats may differ a little
/// more, because of rounding.
constexpr double LargestSmoothStep = 0.01;
constexpr double ValueRounding = 1e-7;

/// Points that are no further away from a time than this stand at it, in seconds.
constexpr double AtOneTime = 2.0 * SameInstant;

enum class Side { Before, Behind };

/// The values of curves, by number.
using Values = std::map<std::int32_t, double>;

/// Where the curves of a track may jump: where a cut begins or ends to be written, or at the edge of what is replaced.
struct Edge {
    /// Of one edge on all tracks, though the cuts end a little differently there. Of several at one time the greatest
    /// counts.
    struct Key {
        bool isStart;
        std::size_t cut;

        auto operator<=>(const Key&) const = default;
    };
    static constexpr std::size_t OfRange = std::numeric_limits<std::size_t>::max();

    double time;
    Key key;
};

struct Point {
    double time;
    double value;
};

/// The value of a curve, held before its first and after its last point; nothing for a curve without points. Of two
/// points at the same time the left one comes first.
std::optional<double> valueAt(const AutomationState& state, double time)
{
    const auto isPoint = [](const Point& point) { return point.time != -1.0 || point.value != -1.0; };
    Point a{state.leftTime, state.leftValue};
    Point b{state.rightTime, state.rightValue};
    if (!isPoint(a))
        a = b;
    if (!isPoint(b))
        b = a;
    if (!isPoint(a))
        return std::nullopt;
    if (b.time < a.time)
        std::swap(a, b);
    if (time <= a.time)
        return a.value;
    if (time > b.time)
        return b.value;
    return a.value + (b.value - a.value) * (time - a.time) * (1.0 / (b.time - a.time));
}

/// What the curves come to at a time, or go on with from there.
Values valuesAt(CutEventBase& track, double time, Side side)
{
    Values values;
    const double beside = side == Side::Before ? time - AtOneTime : time + AtOneTime;
    for (const auto& [number, state] : track.update(beside).automation) {
        if (const std::optional<double> value = valueAt(state, time))
            values.emplace(number, *value);
    }
    return values;
}

bool isJump(double from, double to)
{
    return std::abs(from - to) > LargestSmoothStep + ValueRounding;
}

/// What the run replaces. Before and after it the old programme stays.
SecondsRange replacedRange(const CadrelRunState& state)
{
    const Settings& settings = *state.settings;
    if (!settings.restrictRange())
        return {state.timeOrigin, std::numeric_limits<double>::infinity()};
    return {std::max(settings.preserveMaterialBefore(), state.timeOrigin), settings.preserveMaterialAfter()};
}

bool isSame(double time, double other)
{
    return std::abs(time - other) < SameInstant;
}

/// The curves of one track of the new programme, as they stand in the preview stretch, beside those of the old one.
class TrackCurves {
public:
    TrackCurves(const CutList& cuts, std::size_t track, const CadrelRunState& state)
        : m_range(replacedRange(state)), m_offset(state.previewOffset),
          m_hasBefore(m_range.start - state.timeOrigin >= SameInstant)
    {
        if (m_hasBefore)
            m_edges.push_back({m_range.start, {true, Edge::OfRange}});
        for (std::size_t index = 0; index < cuts.size(); ++index) {
            const Cut::CutEvents& cutEvents = cuts.cutAt(index)->cutEvents();
            if (track >= cutEvents.size())
                continue;
            m_track = cutEvents[track].get();
            const SecondsRange place = m_track->written();
            m_shift.add(place.start, place.end, place.start - m_track->srcIn());
            if (place.end - place.start >= SameInstant) {
                m_edges.push_back({place.start, {true, index}});
                m_edges.push_back({place.end, {false, index}});
            }
        }
        m_edges.push_back({m_range.end, {false, Edge::OfRange}});
        std::erase_if(m_edges, [this](const Edge& edge) { return !isReplacedAround(edge.time); });
        std::ranges::sort(m_edges, {}, &Edge::time);
    }

    /// The edges at which some curve jumps as none did in the old programme.
    std::vector<Edge> newJumps() const
    {
        std::vector<Edge> found;
        for (auto edge = m_edges.begin(); edge != m_edges.end();) {
            const auto next =
                std::find_if(edge, m_edges.end(), [&](const Edge& other) { return !isSame(other.time, edge->time); });
            if (jumpsAnew(edge->time))
                found.push_back({edge->time, std::max_element(edge, next, [](const Edge& a, const Edge& b) {
                                                 return a.key < b.key;
                                             })->key});
            edge = next;
        }
        return found;
    }

    std::string name() const { return util::StringUtil::toUtf8(m_track->getTrackName()); }

private:
    bool isReplacedAround(double time) const
    {
        const bool isBeforeEnd = time - m_range.end < SameInstant && !std::isinf(time);
        // At its beginning a programme comes from nothing.
        return isBeforeEnd && m_range.start <= m_range.end &&
               (m_hasBefore ? m_range.start - time < SameInstant : time - m_range.start >= SameInstant);
    }

    bool jumpsAnew(double time) const
    {
        const bool isFromOld = isSame(time, m_range.start);
        const bool isToOld = isSame(time, m_range.end);
        const Values before = valuesAt(*m_track, isFromOld ? time : time + m_offset, Side::Before);
        if (before.empty())
            return false;
        const Values behind = valuesAt(*m_track, isToOld ? time : time + m_offset, Side::Behind);
        const auto sourceBefore = isFromOld ? std::optional(time) : sourceOf(time, Side::Before);
        const auto sourceBehind = isToOld ? std::optional(time) : sourceOf(time, Side::Behind);
        return std::ranges::any_of(before, [&](const auto& curve) {
            const auto to = behind.find(curve.first);
            return to != behind.end() && isJump(curve.second, to->second) &&
                   !jumpsInOld(sourceBefore, curve, to->second) && !jumpsInOld(sourceBehind, curve, to->second);
        });
    }

    /// Which instant of the old programme has become this one, of what ends there or of what begins; nothing where nothing is
    /// written.
    std::optional<double> sourceOf(double time, Side side) const
    {
        const double beside = SameInstant / 2.0;
        const std::optional<double> shift = m_shift.at(side == Side::Before ? time - beside : time + beside);
        return shift ? std::optional(time - *shift) : std::nullopt;
    }

    /// Whether the old programme has the same jump of a curve at a time.
    bool jumpsInOld(const std::optional<double>& time, const Values::value_type& from, double to) const
    {
        if (!time)
            return false;
        const Values before = valuesAt(*m_track, *time, Side::Before);
        const Values behind = valuesAt(*m_track, *time, Side::Behind);
        const auto oldFrom = before.find(from.first);
        const auto oldTo = behind.find(from.first);
        return oldFrom != before.end() && oldTo != behind.end() && !isJump(oldFrom->second, from.second) &&
               !isJump(oldTo->second, to);
    }

    SecondsRange m_range;
    double m_offset;
    bool m_hasBefore;
    CutEventBase* m_track = nullptr;
    ProgrammeShift m_shift;
    std::vector<Edge> m_edges; ///< in order of time
};

/// A marker at the end of the range would not be in it.
double markerStart(double time, const CadrelRunState& state)
{
    const SecondsRange range = replacedRange(state);
    if (!isSame(time, range.end))
        return time;
    return std::max(time - Timecode(0, 0, 0, 1).toSeconds(state.framerate), range.start);
}

std::size_t trackCount(const CutList& cuts)
{
    std::size_t count = 0;
    for (std::size_t index = 0; index < cuts.size(); ++index)
        count = std::max(count, cuts.cutAt(index)->cutEvents().size());
    return count;
}

} // namespace

std::vector<MarkerEntry> AutomationWarningDetectAlgorithm::detect(const CutList& cuts, const CadrelRunState& state,
                                                                  ProgressHandlerBase* progress) const
{
    std::map<Edge::Key, MarkerEntry> warnings;
    const std::size_t count = trackCount(cuts);
    for (std::size_t track = 0; track < count; ++track) {
        const TrackCurves curves(cuts, track, state);
        for (const Edge& edge : curves.newJumps()) {
            const double start = markerStart(edge.time, state);
            MarkerEntry& entry =
                warnings
                    .try_emplace(edge.key, MarkerEntry{start, edge.time, util::StringUtil::toUtf8(NameStart),
                                                       MarkerKind::AutomationWarning})
                    .first->second;
            entry.start = std::min(entry.start, start);
            entry.end = std::max(entry.end, edge.time);
            entry.name += curves.name() + " ";
        }
        report(progress, cuts.size());
        stopIfCancelled(progress);
    }
    std::vector<MarkerEntry> entries;
    for (auto& [key, entry] : warnings)
        entries.push_back(std::move(entry));
    std::ranges::stable_sort(entries, {}, &MarkerEntry::start);
    return entries;
}

std::uint64_t AutomationWarningDetectAlgorithm::estimateSteps(std::uint64_t eventCount, std::uint64_t trackCount) const
{
    return eventCount * trackCount;
}

} // namespace cadrel::core
