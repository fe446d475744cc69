// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"
#include "velmark/ProjectNode.h"

#include <cstdint>
#include <map>
#include <optional>
#include <utility>
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
/// Times are seconds from the time origin, and stay true when that moves.
class PreviewRecord {
public:
    using Node = Velmark::Counted<Velmark::IProjectNode>;

    /// Of all that stands on the track from `start` on.
    static PreviewRecord ofContent(const Track& track, double start);
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
    /// Those of the events that aren't written down here, or don't begin and end where they did. Nothing else of an event is
    /// compared.
    std::vector<Node> others(std::vector<Node> events) const;

private:
    /// Where an event begins and ends, in instants.
    using Place = std::pair<std::int64_t, std::int64_t>;

    explicit PreviewRecord(double start) : m_start(start) {}
    void add(double start, double end);
    void reachTo(double time);

    double m_start;
    std::optional<double> m_end;
    std::map<Place, std::int64_t> m_events; ///< and how many of them are there
    std::vector<double> m_numbers;          ///< as they are stored: the start, the end, and both of each event
};

/// The events and parts of a track that lie in a stretch or reach into it, in seconds from the time origin.
std::vector<PreviewRecord::Node> eventsReachingInto(const Track& track, double start, double end);

} // namespace cadrel::host
