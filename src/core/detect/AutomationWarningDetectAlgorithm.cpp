// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/detect/AutomationWarningDetectAlgorithm.h"

#include "core/cut/CadrelRunState.h"
#include "core/cut/CutList.h"
#include "core/edl/EventBase.h"
#include "core/settings/Settings.h"
#include "core/time/SecondsRange.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <map>
#include <optional>
#include <utility>

namespace cadrel::core {

namespace {

using Automation = std::map<std::int32_t, AutomationState>;

/// A larger step of a curve can be heard. Values from 0 to 1 that a host stores as 32-bit floats may differ a little
/// more, because of rounding.
constexpr double LargestSmoothStep = 0.01;
constexpr double ValueRounding = 1e-7;

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

/// Whether some curve that both have has a different value in the first at `timeA` and in the second at `timeB`.
bool jumps(const Automation& a, double timeA, const Automation& b, double timeB)
{
    return std::any_of(a.begin(), a.end(), [&](const auto& curve) {
        const auto other = b.find(curve.first);
        if (other == b.end())
            return false;
        const std::optional<double> valueA = valueAt(curve.second, timeA);
        const std::optional<double> valueB = valueAt(other->second, timeB);
        return valueA && valueB && std::abs(*valueA - *valueB) > LargestSmoothStep + ValueRounding;
    });
}

/// Whether the second follows the first in the new programme without a frame between them.
bool meet(const EventBase& previous, const EventBase& current)
{
    return current.dstIn() >= previous.dstOut() && current.dstIn() - previous.dstOut() < Timecode(0, 0, 0, 1);
}

/// Where two ranges of a track meet.
SecondsRange seamOf(const CutEventBase& p, const CutEventBase& q)
{
    return {std::min(p.dstOut(), q.dstIn()), std::max(p.dstOut(), q.dstIn())};
}

/// Over a gap a curve keeps its value, so that it jumps where the gap ends.
SecondsRange endOfGap(const CutEventBase& /*p*/, const CutEventBase& q)
{
    return {q.dstIn(), q.dstIn()};
}

/// One marker for all tracks on which a curve jumps from one cut to the next; nothing if there is no such track.
/// `placeOf` gives the place of the jump on a track. Reports a step for each track.
template <typename Place, typename Report>
std::optional<MarkerEntry> warningBetween(const Cut& previous, const Cut& current, Place placeOf, Report reportStep)
{
    std::optional<MarkerEntry> entry;
    const std::size_t trackCount = std::min(previous.cutEvents().size(), current.cutEvents().size());
    for (std::size_t track = 0; track < trackCount; ++track) {
        CutEventBase& p = *previous.cutEvents()[track];
        CutEventBase& q = *current.cutEvents()[track];
        const Automation before = p.update(p.srcOut()).automation;
        const Automation behind = q.update(q.srcIn()).automation;
        if (jumps(before, p.srcOut(), behind, q.srcIn())) {
            const SecondsRange place = placeOf(p, q);
            if (!entry) {
                entry = MarkerEntry{place.start, place.end, util::StringUtil::toUtf8(L"Automation warning in "),
                                    MarkerKind::AutomationWarning};
            }
            entry->start = std::min(entry->start, place.start);
            entry->end = std::max(entry->end, place.end);
            entry->name += util::StringUtil::toUtf8(p.getTrackName()) + " ";
        }
        reportStep();
    }
    return entry;
}

} // namespace

std::vector<MarkerEntry> AutomationWarningDetectAlgorithm::detect(const CutList& cuts, const CadrelRunState& state,
                                                                  ProgressHandlerBase* progress) const
{
    const auto ordered = inTimeOrder(cuts);
    std::vector<MarkerEntry> entries;
    const bool isLedOverGaps = state.settings && state.settings->createVirginTerritories();
    const auto reportStep = [progress] { report(progress, 1); };
    std::size_t latest = 0;
    for (std::size_t i = 1; i < ordered.size(); ++i) {
        const Cut& previous = *ordered[i - 1];
        const Cut& current = *ordered[i];
        const Cut& last = *ordered[latest];
        std::optional<MarkerEntry> warning;
        if (meet(*previous.event(), *current.event()))
            warning = warningBetween(previous, current, seamOf, reportStep);
        else if (!isLedOverGaps && current.event()->dstIn() > last.event()->dstOut())
            warning = warningBetween(last, current, endOfGap, reportStep);
        if (current.event()->dstOut() >= last.event()->dstOut())
            latest = i;
        if (warning)
            entries.push_back(*warning);
        report(progress, warning ? 1 : current.cutEvents().size());
        stopIfCancelled(progress);
    }
    return entries;
}

std::uint64_t AutomationWarningDetectAlgorithm::estimateSteps(std::uint64_t eventCount, std::uint64_t trackCount) const
{
    return eventCount * trackCount;
}

} // namespace cadrel::core
