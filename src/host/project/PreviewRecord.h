// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"
#include "velmark/Counted.h"
#include "velmark/ProjectNode.h"

#include <array>
#include <cstdint>
#include <map>
#include <optional>
#include <vector>

namespace Velmark {
class IHostContext;
}

namespace cadrel::host {

class Track;

/// What the system has written on one track in the preview stretch: for a preview, or in a run that has failed since. The
/// track keeps it in an attribute, which follows the host's undo list and is stored with the project. Only what is written
/// down here is ever taken away again; all else in the stretch is the user's.
///
/// Times are seconds from the time origin, and stay true when that moves. The numbers of the attribute are:
///
///     start, 1, frame rate, its flags, end      the end lies before the start where nothing is written
///     start, end, source offset, name           of each event, the name as a number that is made of it
///
/// or, in earlier projects, only the start, or the start and the end, followed by those of each event.
class PreviewRecord {
public:
    using Node = Velmark::Counted<Velmark::IProjectNode>;

    /// Of all that stands on the track from `start` on; an unknown rate is kept as none.
    static PreviewRecord ofContent(const Track& track, double start, const core::Framerate& framerate);
    /// The one that the track keeps; nothing for a track that keeps none, and for an attribute that makes no sense.
    static std::optional<PreviewRecord> keptBy(const Track& track);
    /// Whether the track has the attribute, whatever it says.
    static bool isKeptBy(const Track& track);
    /// Throws Result::HostCallFailed when the host refuses; so does keepOn.
    static void dropFrom(const Track& track);
    void keepOn(Velmark::IHostContext* context, const Track& track) const;

    double start() const { return m_start; }
    /// Of the last event or automation point; nothing when nothing is written.
    std::optional<double> end() const { return m_end; }
    /// Under which it was written; nothing where that isn't known.
    std::optional<core::Framerate> framerate() const { return m_framerate; }
    /// Those of the events that aren't written down here: they begin or end elsewhere, play from elsewhere in their clips, or
    /// have another name. Nothing else of an event is compared, and of a record of earlier projects only the place.
    std::vector<Node> others(std::vector<Node> events) const;

private:
    /// Of an event: where it begins and ends, how far into its clip it begins to play, in instants, and its name.
    using Content = std::array<std::int64_t, 4>;

    explicit PreviewRecord(double start) : m_start(start) {}
    static std::optional<PreviewRecord> ofPlaces(const std::vector<double>& numbers);
    static std::optional<PreviewRecord> ofNumbers(const std::vector<double>& numbers);
    Content contentOf(const std::array<double, 4>& event) const;
    void add(const std::array<double, 4>& event);
    void reachTo(double time);

    double m_start;
    std::optional<double> m_end;
    std::optional<core::Framerate> m_framerate;
    bool m_hasPlacesAlone = false;
    std::map<Content, std::int64_t> m_events; ///< and how many of them are there
    std::vector<double> m_numbers;            ///< of each event, as they are stored
};

/// The events and parts of a track that lie in a stretch or reach into it, in seconds from the time origin.
std::vector<PreviewRecord::Node> eventsReachingInto(const Track& track, double start, double end);

} // namespace cadrel::host
