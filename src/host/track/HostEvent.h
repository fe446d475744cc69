// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"
#include "velmark/ProjectNode.h"

#include <cstdint>
#include <string>

namespace Velmark {
class FUnknown;
class IEditTransaction;
class IMediaClip;
} // namespace Velmark

namespace cadrel::host {

class Track;

/// A handle on one event or part of a track, or on one that is about to be inserted there; empty without an event.
///
/// Times are those of the project's clock, in seconds. All operations throw Result::NotAvailable on an empty handle and
/// on one whose track has gone; setters throw Result::HostCallFailed when the host refuses. A change belongs to the
/// transaction that is open.
class HostEvent {
public:
    HostEvent() = default;
    /// The track has to outlive the handle.
    HostEvent(const Track& track, Velmark::Counted<Velmark::IProjectNode> event);

    explicit operator bool() const { return m_track && m_event; }
    /// Borrowed; null for an empty handle.
    Velmark::IProjectNode* node() const { return m_event.get(); }
    friend bool operator==(const HostEvent& a, const HostEvent& b) { return a.m_event == b.m_event; }

    /// Whether it is an event that plays a clip.
    bool isClip() const;
    bool isMarker() const;
    /// Whether a marker covers a stretch; it is a point otherwise.
    bool isRange() const;

    /// Null when it has none yet. These throw Result::HostObjectMissing for what isn't a clip event, the last one for
    /// one without a clip, too.
    Velmark::Counted<Velmark::IMediaClip> getClip() const;
    void setClip(Velmark::IMediaClip* clip, std::int32_t flags);
    /// In frames of the project.
    std::uint32_t getClipFrameCount() const;

    double getStart() const;
    void setStart(Velmark::IEditTransaction& transaction, double seconds);
    double getEnd() const;
    void setEnd(Velmark::IEditTransaction& transaction, double seconds);
    void setLength(Velmark::IEditTransaction& transaction, double seconds);
    /// How far into its clip it begins to play, in seconds.
    double getSourceOffset() const;

    std::wstring getName() const;
    void setName(Velmark::IEditTransaction& transaction, const std::wstring& name);

    /// The number by which a marker is known again in the preview: -1 when it has none, 0 when what stands in its place
    /// is no number.
    std::int64_t getUserId() const;
    /// Throws Result::InvalidArgument for a negative one.
    void setUserId(std::int64_t id);

    /// Takes it out of its track.
    void remove(Velmark::IEditTransaction& transaction);

private:
    /// The event, when there is one and its track is alive.
    Velmark::IProjectNode& event() const;
    Velmark::Counted<Velmark::FUnknown> container() const;
    double hostTime(double seconds) const;

    const Track* m_track = nullptr;
    Velmark::Counted<Velmark::IProjectNode> m_event;
};

} // namespace cadrel::host
