// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/tracks/SpanIndex.h"
#include "standin/project/Event.h"
#include "standin/project/Track.h"
#include "velmark/Counted.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

namespace standin {
class Project;
} // namespace standin

namespace desktop {

/// What lies on a track or in a part, in the order in which it is drawn: by the starts, in seconds of the project. It keeps the
/// events alive, and doesn't follow their changes.
class Lane {
public:
    enum class Kind : std::uint8_t { Clip, Part, PointMarker, RangeMarker };

    struct Item {
        Velmark::Counted<standin::Event> event;
        Kind kind;
        std::int32_t content; ///< of a part: the index of its lane in `contents`; -1 for all else
    };

    Lane() = default;
    /// The children of a track or part, which begins at `origin`.
    Lane(const standin::Container& container, double origin);

    std::size_t size() const { return m_items.size(); }
    const Item& item(std::size_t index) const { return m_items[index]; }
    const SpanIndex& spans() const { return m_spans; }
    /// Null for what is no part, and for a part without content.
    const Lane* contentOf(std::size_t index) const
    {
        const std::int32_t content = m_items[index].content;
        return content < 0 ? nullptr : &m_contents[static_cast<std::size_t>(content)];
    }

private:
    std::vector<Item> m_items;
    SpanIndex m_spans;
    std::vector<Lane> m_contents;
};

/// The points of an automation curve.
struct CurvePoints {
    std::int32_t number = 0;   ///< standin::Envelope::Curve
    std::vector<double> times; ///< in seconds of the project, in order
    std::vector<float> values; ///< from 0 to 1
};

/// What kind of markers a track has. Those of a run each have a track of their own.
enum class MarkerLook : std::uint8_t {
    User,
    Destination,
    Insert,
    DissolveWipe,
    AutomationWarning,
    AudioSnippet,
    Overlap,
    Memo
};

/// A track as it is shown.
struct TrackRow {
    Velmark::Counted<standin::Track> track;
    int depth = 0; ///< how many folders it lies in
    Lane lane;
    std::vector<CurvePoints> curves; ///< those with points
    MarkerLook markers = MarkerLook::User;
    bool isNewPicture = false; ///< of the cut to which the tracks are carried over
};

/// All of a project that is drawn, sorted, as it was when this was made.
class TrackIndex {
public:
    TrackIndex() = default;
    explicit TrackIndex(const standin::Project& project);

    const std::vector<TrackRow>& rows() const { return m_rows; }

    struct Stretch {
        double start = 0.0;
        double end = 0.0;
    };
    /// From the first event to the last one of the programme: what a preview has laid about a day later isn't in it. Nothing
    /// without events.
    std::optional<Stretch> programme() const { return m_programme; }
    /// What lies after the programme, more than half a day away. Nothing while there is no such thing.
    std::optional<Stretch> preview() const { return m_preview; }

private:
    void findStretches();

    std::vector<TrackRow> m_rows;
    std::optional<Stretch> m_programme;
    std::optional<Stretch> m_preview;
};

} // namespace desktop
