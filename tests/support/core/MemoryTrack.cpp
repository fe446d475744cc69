// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/core/MemoryTrack.h"

#include "util/Result.h"

#include <algorithm>
#include <iterator>
#include <limits>
#include <utility>

namespace cadrel::tests {

using util::Result;

namespace {

/// The part of a clip from `start` to `end`.
MemoryClip partOf(const MemoryClip& clip, double start, double end)
{
    MemoryClip part = clip;
    part.start = std::max(clip.start, start);
    part.end = std::min(clip.end, end);
    part.offset += part.start - clip.start;
    return part;
}

bool isHeard(const MemoryClip& clip)
{
    return clip.end - clip.start >= core::SameInstant;
}

/// The value at a time that has no point between it and `next`.
double valueAt(const MemoryCurve& curve, MemoryCurve::const_iterator next, double time)
{
    if (next == curve.begin())
        return next->second;
    const auto [previousTime, previousValue] = *std::prev(next);
    if (next == curve.end())
        return previousValue;
    return previousValue + (next->second - previousValue) * (time - previousTime) / (next->first - previousTime);
}

/// The value to which a curve comes at a time, and that with which it goes on; they differ where it jumps.
double valueBefore(const MemoryCurve& curve, double time)
{
    return valueAt(curve, curve.lower_bound(time - core::SameInstant), time);
}

double valueBehind(const MemoryCurve& curve, double time)
{
    return valueAt(curve, curve.upper_bound(time + core::SameInstant), time);
}

/// Adds a point behind those of the same time, unless the last of them has its value.
void addEdge(MemoryCurve& curve, double time, double value)
{
    const auto next = curve.upper_bound(time);
    if (next == curve.begin() || *std::prev(next) != MemoryCurve::value_type(time, value))
        curve.emplace_hint(next, time, value);
}

/// Copies the stretch of a curve from `start` to `end` over the one that stands `shift` later. Both edges of the
/// stretch get the values of the curve inside and outside, so that no line between two points changes its course.
void copyCurve(MemoryCurve& curve, double start, double end, double shift)
{
    const double valueAtStart = valueBehind(curve, start);
    const double valueAtEnd = valueBefore(curve, end);
    std::vector<MemoryPoint> inside;
    for (auto point = curve.upper_bound(start + core::SameInstant);
         point != curve.end() && point->first < end - core::SameInstant; ++point)
        inside.push_back({point->first + shift, point->second});

    start += shift;
    end += shift;
    const double outsideAtStart = valueBefore(curve, start);
    const double outsideAtEnd = valueBehind(curve, end);
    curve.erase(curve.lower_bound(start - core::SameInstant), curve.upper_bound(end + core::SameInstant));
    addEdge(curve, start, outsideAtStart);
    addEdge(curve, start, valueAtStart);
    for (const MemoryPoint& point : inside)
        curve.emplace(point.time, point.value);
    addEdge(curve, end, valueAtEnd);
    addEdge(curve, end, outsideAtEnd);
}

} // namespace

MemoryTrack::MemoryTrack(std::wstring name, bool isAudio) : m_name(std::move(name)), m_isAudio(isAudio) {}

void MemoryTrack::addClip(const MemoryClip& clip)
{
    if (clip.start < 0.0 || clip.end < clip.start)
        throw Result::InvalidArgument;
    if (!isHeard(clip))
        return;
    removeClips(clip.start, clip.end);
    m_clips.emplace(clip.start, clip);
}

void MemoryTrack::addPoint(std::int32_t curve, double time, double value)
{
    m_curves[curve].emplace(time, value);
}

void MemoryTrack::copyRange(double start, double end, double destination)
{
    if (destination < 0.0 || end < start)
        throw Result::InvalidArgument;
    if (end - start < core::SameInstant)
        return;
    const double shift = destination - start;

    const std::vector<MemoryClip> copied = clipsIn(start, end);
    removeClips(destination, end + shift);
    for (const MemoryClip& clip : copied) {
        const MemoryClip part = partOf(clip, start, end);
        addClip({part.material, part.start + shift, part.end + shift, part.offset});
    }
    for (auto& [number, curve] : m_curves) {
        if (!curve.empty())
            copyCurve(curve, start, end, shift);
    }
}

void MemoryTrack::removeFrom(double start)
{
    removeClips(start, std::numeric_limits<double>::infinity());
    for (auto& [number, curve] : m_curves)
        curve.erase(curve.lower_bound(start - core::SameInstant), curve.end());
}

std::vector<MemoryClip> MemoryTrack::clips() const
{
    std::vector<MemoryClip> found;
    found.reserve(m_clips.size());
    for (const auto& [start, clip] : m_clips)
        found.push_back(clip);
    return found;
}

std::vector<MemoryPoint> MemoryTrack::points(std::int32_t curve) const
{
    std::vector<MemoryPoint> found;
    const auto place = m_curves.find(curve);
    if (place == m_curves.end())
        return found;
    for (const auto& [time, value] : place->second)
        found.push_back({time, value});
    return found;
}

std::optional<MemoryClip> MemoryTrack::clipAt(double time) const
{
    const auto following = m_clips.upper_bound(time);
    if (following == m_clips.begin())
        return std::nullopt;
    const MemoryClip& clip = std::prev(following)->second;
    if (time < clip.end)
        return clip;
    return std::nullopt;
}

double MemoryTrack::end() const
{
    double latest = m_clips.empty() ? 0.0 : m_clips.rbegin()->second.end;
    for (const auto& [number, curve] : m_curves) {
        if (!curve.empty())
            latest = std::max(latest, curve.rbegin()->first);
    }
    return latest;
}

core::CutEventSpans MemoryTrack::spansAround(double time) const
{
    core::CutEventSpans spans;
    auto clip = m_clips.upper_bound(time);
    if (clip != m_clips.end())
        spans.after = {clip->second.start, clip->second.end};
    while (clip != m_clips.begin()) {
        const MemoryClip& earlier = (--clip)->second;
        if (earlier.end < time) {
            spans.before = {earlier.start, earlier.end};
            break;
        }
        if (spans.across == core::SecondsRange{})
            spans.across = {earlier.start, earlier.end};
    }
    for (const auto& [number, curve] : m_curves)
        spans.automation.emplace(number, stateAround(curve, time));
    return spans;
}

void MemoryTrack::removeClips(double start, double end)
{
    const std::vector<MemoryClip> reaching = clipsIn(start, end);
    for (const MemoryClip& clip : reaching)
        m_clips.erase(clip.start);
    for (const MemoryClip& clip : reaching) {
        for (const MemoryClip& rest : {partOf(clip, clip.start, start), partOf(clip, end, clip.end)}) {
            if (isHeard(rest))
                m_clips.emplace(rest.start, rest);
        }
    }
}

std::vector<MemoryClip> MemoryTrack::clipsIn(double start, double end) const
{
    auto clip = m_clips.upper_bound(start);
    if (clip != m_clips.begin() && std::prev(clip)->second.end > start)
        --clip;
    std::vector<MemoryClip> found;
    for (; clip != m_clips.end() && clip->first < end; ++clip)
        found.push_back(clip->second);
    return found;
}

core::AutomationState MemoryTrack::stateAround(const MemoryCurve& curve, double time)
{
    core::AutomationState state;
    const auto right = curve.upper_bound(time);
    if (right != curve.begin()) {
        const auto left = std::prev(right);
        state.leftTime = left->first;
        state.leftValue = left->second;
        state.rightTime = time;
        state.rightValue = left->second;
    }
    if (right != curve.end()) {
        state.rightTime = right->first;
        state.rightValue = right->second;
    }
    return state;
}

MemoryCutEvent::MemoryCutEvent(MemoryTrack& track, double srcIn, double srcOut, double dstIn, double dstOut)
    : m_track(track)
{
    setSrcIn(srcIn);
    setSrcOut(srcOut);
    setDstIn(dstIn);
    setDstOut(dstOut);
}

} // namespace cadrel::tests
