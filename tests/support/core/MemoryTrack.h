// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/CutEventBase.h"

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

namespace cadrel::tests {

/// A stretch of recorded sound on a track. All times are seconds.
struct MemoryClip {
    std::string material;
    double start = 0.0;
    double end = 0.0;
    double offset = 0.0; ///< the place in the material that sounds at `start`

    bool operator==(const MemoryClip&) const = default;
};

struct MemoryPoint {
    double time = 0.0; ///< seconds
    double value = 0.0;

    bool operator==(const MemoryPoint&) const = default;
};

/// The values of an automation curve by time; those of one time in the order of their coming.
using MemoryCurve = std::multimap<double, double>;

/// A track of clips and automation curves in memory. No two clips overlap: what comes later overwrites what stands
/// there and cuts what hangs over.
///
///     before   |------ A ------|     |-- B --|
///     add                 |---- C ----|
///     after    |--- A ----|---- C ----|- B --|
///
/// Nothing shorter than one instant is kept of a clip. Looking something up takes a time that grows with the logarithm
/// of the clips and points.
class MemoryTrack {
public:
    explicit MemoryTrack(std::wstring name, bool isAudio = true);

    const std::wstring& name() const { return m_name; }
    bool isAudio() const { return m_isAudio; }
    bool isSelected() const { return m_isSelected; }
    void setSelected(bool flag) { m_isSelected = flag; }

    /// Throws Result::InvalidArgument for a clip that starts before 0 or ends before it starts.
    void addClip(const MemoryClip& clip);
    /// Of several points at one time each stands behind those that are there.
    void addPoint(std::int32_t curve, double time, double value);

    /// Copies what stands from `start` to `end`, and the course of each automation curve there, over what stands at
    /// `destination`. The two stretches may overlap. Throws Result::InvalidArgument for a destination before 0 or an
    /// end before the start.
    void copyRange(double start, double end, double destination);
    /// Removes all clips and points from `start` on.
    void removeFrom(double start);

    /// In time order.
    std::vector<MemoryClip> clips() const;
    /// In time order; empty for a curve that doesn't exist.
    std::vector<MemoryPoint> points(std::int32_t curve) const;
    /// What sounds at a time: a clip up to, and without, its end.
    std::optional<MemoryClip> clipAt(double time) const;
    /// The end of the last clip, or the last point behind it; 0 for an empty track.
    double end() const;

    /// The clips and points around a time. Of a clip both bounds count as inside, and of two that touch at the time the
    /// later one lies across it. A curve with points to the left only has a right side that holds the left value at
    /// the time.
    core::CutEventSpans spansAround(double time) const;

private:
    static core::AutomationState stateAround(const MemoryCurve& curve, double time);
    /// The clips that reach into the stretch, whole.
    std::vector<MemoryClip> clipsIn(double start, double end) const;
    void removeClips(double start, double end);

    std::wstring m_name;
    bool m_isAudio;
    bool m_isSelected = false;
    std::map<double, MemoryClip> m_clips; ///< by start
    std::map<std::int32_t, MemoryCurve> m_curves;
};

/// What a change event does to a MemoryTrack, which must outlive it.
class MemoryCutEvent : public core::CutEventBase {
public:
    MemoryCutEvent(MemoryTrack& track, double srcIn, double srcOut, double dstIn, double dstOut);

    MemoryTrack& track() const { return m_track; }

    core::CutEventSpans update(double time) override { return m_track.spansAround(time); }
    std::wstring getTrackName() override { return m_track.name(); }
    bool isAudio() override { return m_track.isAudio(); }

private:
    MemoryTrack& m_track;
};

} // namespace cadrel::tests
