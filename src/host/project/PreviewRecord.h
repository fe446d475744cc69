// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"
#include "host/project/WrittenAutomation.h"
#include "velmark/Counted.h"
#include "velmark/ProjectNode.h"

#include <array>
#include <cstddef>
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
/// track keeps it in three attributes, which follow the host's undo list and are stored with the project. Only what is written
/// down here is ever taken away again; all else in the stretch is the user's.
///
/// Times are seconds from the time origin, and stay true when that moves. The numbers of the first attribute are:
///
///     start, 3, frame rate, its flags, end,     the end lies before the start where nothing is written
///     checksum of the other two, checksum of these six
///
/// and those of the other two, which aren't there where there are none:
///
///     start, end, source offset, content        of each event, the content as contentPrintOf gives it
///     number of the curve, time, value          of each automation point
///
/// In earlier projects the first one has 2 after the start, and a checksum of the second one alone. The third one has a checksum
/// of the start and of what follows, and then the numbers of the curves on which something is written; or it isn't there, and
/// nobody knows which they are. Nor does anybody where one attribute has it all: after the start the number 1, rate, flags and
/// end, followed by the events with their names alone, as namePrintOf gives them; or only the start, or the start and the end,
/// followed by the start and end of each event.
class PreviewRecord {
public:
    using Node = Velmark::Counted<Velmark::IProjectNode>;

    /// All but the events, which is read at little cost.
    struct Head {
        double start;
        std::optional<double> end; ///< of the last event or automation point; nothing when nothing is written
        std::optional<core::Framerate> framerate; ///< under which it was written; nothing where that isn't known
    };

    /// Of all that stands on the track from `start` on; an unknown rate is kept as none.
    static PreviewRecord ofContent(const Track& track, double start, const core::Framerate& framerate);
    /// The one that the track keeps; nothing for a track that keeps none, and for attributes that make no sense or are
    /// damaged.
    static std::optional<PreviewRecord> keptBy(const Track& track);
    /// Also of a record whose events are damaged.
    static std::optional<Head> headKeptBy(const Track& track);
    /// Whether the track has the first attribute, whatever it says.
    static bool isKeptBy(const Track& track);
    /// Throws Result::HostCallFailed when the host refuses; so does keepOn.
    static void dropFrom(const Track& track);
    /// For one that ofContent has made.
    void keepOn(Velmark::IHostContext* context, const Track& track) const;

    double start() const { return m_head.start; }
    std::optional<double> end() const { return m_head.end; }
    std::optional<core::Framerate> framerate() const { return m_head.framerate; }
    const WrittenAutomation& automation() const { return m_automation; }
    /// Those of the events that aren't written down here: they begin or end elsewhere, play from elsewhere in their clips, or
    /// have another name, clip or content. Nothing else of an event is compared, and of a record of earlier projects only the
    /// place, or that and the name.
    std::vector<Node> others(std::vector<Node> events) const;

private:
    enum class Compared { Places, Names, Contents };
    using Numbers = std::vector<double>;
    /// Of an event, as it is stored.
    using Event = std::array<double, 4>;
    /// Of an event: where it begins and ends, how far into its clip it begins to play, in instants, and what it is made of.
    using Known = std::array<std::int64_t, 4>;
    struct StoredHead;

    PreviewRecord(const Head& head, Compared compared) : m_head(head), m_compared(compared) {}
    static std::optional<PreviewRecord> ofPlaces(const Numbers& numbers);
    static std::optional<PreviewRecord> ofNames(const Numbers& numbers);
    static std::optional<PreviewRecord> ofContents(const StoredHead& head, const Track& track);
    Event numbersOf(Velmark::IProjectNode& event) const;
    Known knownOf(const Event& event) const;
    void add(const Event& event);
    void add(const Numbers& events, std::size_t from);
    void reachTo(double time);
    bool isSound() const;

    Head m_head;
    Compared m_compared;
    std::map<Known, std::int64_t> m_events; ///< and how many of them are there
    Numbers m_numbers;                      ///< of each event, as they are stored
    WrittenAutomation m_automation;
};

/// The events and parts of a track that lie in a stretch or reach into it, in seconds from the time origin.
std::vector<PreviewRecord::Node> eventsReachingInto(const Track& track, double start, double end);

} // namespace cadrel::host
