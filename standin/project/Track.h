// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/Container.h"
#include "standin/project/Envelope.h"
#include "velmark/Tracks.h"

#include <map>
#include <optional>
#include <string_view>

namespace standin {

/// A track: of sound, picture or markers, a ruler, or a folder that holds tracks.
class Track : public Velmark::Implements<Track, Container, Velmark::ITrackNode> {
public:
    static constexpr const char* ClassName = "Track";

    enum class Kind { Audio, Video, Marker, Ruler, Folder };

    /// A new track, not inserted: a MarkerTrack for that kind. Sound has curves for volume, pan and mute.
    static Velmark::Counted<Track> create(Kind kind);
    /// By its type word; nothing for an unknown one.
    static std::optional<Kind> kindOf(std::string_view word);
    static const char* wordOf(Kind kind);

    ~Track() override;

    bool isType(const char* word) override;
    Velmark::int32 setFlag(const char* name, bool value) override;
    Velmark::int32 getFlag(const char* name) override;
    /// Null for a folder, a ruler and a marker track.
    Velmark::IObjectList* getAutomation() override;

    Track* track() override { return this; }
    bool accepts(const Node& child) const override;

    Kind kind() const { return m_kind; }
    /// Of its last event or marker or, for a folder, of that of its tracks; in seconds of the project.
    double lastEnd() const override;
    bool isFolder() const { return m_kind == Kind::Folder; }
    bool hasAutomation() const { return m_kind == Kind::Audio || m_kind == Kind::Video; }
    bool isLocked() const { return m_isLocked; }
    void setLocked(bool locked);
    /// By their numbers.
    const std::map<Velmark::int32, Velmark::Counted<Envelope>>& curves() const { return m_curves; }
    /// The curve of the number, which is made when the track hasn't got it.
    Envelope& curve(Velmark::int32 number);

protected:
    explicit Track(Kind kind) : m_kind(kind) {}

    void markRemoved(ChangeNotes& changes) override;

private:
    bool exchangeLocked(bool locked);

    Kind m_kind;
    bool m_isLocked = false;
    std::map<Velmark::int32, Velmark::Counted<Envelope>> m_curves;
};

/// A track of markers.
class MarkerTrack : public Velmark::Implements<MarkerTrack, Track, Velmark::IMarkerTrack> {
public:
    static constexpr const char* ClassName = "MarkerTrack";

    MarkerTrack() : Implements(Kind::Marker) {}
};

} // namespace standin
