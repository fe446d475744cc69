// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/cut/Cut.h"
#include "core/cut/CutList.h"
#include "core/cut/MarkerTrack.h"
#include "core/cut/ProgressHandlerBase.h"
#include "core/edl/EventBase.h"
#include "core/settings/MatchBy.h"
#include "core/settings/Settings.h"
#include "core/time/SecondsRange.h"
#include "host/border/HostFailure.h"
#include "host/border/NodeReading.h"
#include "host/project/Project.h"
#include "host/track/AutomationCurve.h"
#include "host/track/CoveredRanges.h"
#include "host/track/CutEvent.h"
#include "host/track/EventReach.h"
#include "host/track/Instant.h"
#include "host/track/Marker.h"
#include "util/Result.h"
#include "util/StringUtil.h"
#include "velmark/ClassId.h"
#include "velmark/Context.h"

#include <algorithm>
#include <map>
#include <optional>
#include <string>
#include <utility>

using namespace Velmark;
using cadrel::core::ApplyTo;
using cadrel::core::SecondsRange;
using cadrel::util::Result;
using cadrel::util::StringUtil;

namespace cadrel::host {

namespace {

/// The cut events of a cut that have the same source range.
struct SourceGroup {
    SecondsRange source;
    double destination;
    std::vector<const Track*> tracks;
};

bool precedes(const SecondsRange& a, const SecondsRange& b)
{
    return isBefore(a.start, b.start) || (!isBefore(b.start, a.start) && isBefore(a.end, b.end));
}

/// Cuts that are no further apart than this touch, in seconds.
constexpr double ShortestGap = 0.01;

/// A preview leaves nothing in the last seconds of what is cleared when it ends. A point at the very end would stay.
constexpr double ClearedMargin = 1.0;

bool isLongEnough(const SecondsRange& gap)
{
    return isBefore(ShortestGap, gap.end - gap.start);
}

const CutEvent& hostEvent(const std::shared_ptr<core::CutEventBase>& cutEvent)
{
    return dynamic_cast<const CutEvent&>(*cutEvent);
}

/// In ascending order.
std::vector<SourceGroup> groupsOf(const core::Cut& cut)
{
    std::vector<SourceGroup> groups;
    for (const auto& cutEvent : cut.cutEvents()) {
        const SecondsRange source{cutEvent->srcIn(), cutEvent->srcOut()};
        auto place = std::ranges::find_if(
            groups, [&source](const SourceGroup& group) { return !precedes(group.source, source); });
        if (place == groups.end() || precedes(source, place->source))
            place = groups.insert(place, {source, cutEvent->dstIn(), {}});
        place->tracks.push_back(&hostEvent(cutEvent).track());
    }
    return groups;
}

/// The automation of a track in which the cuts have left gaps.
struct GapTrack {
    std::vector<AutomationCurve> curves;
    /// What the cuts have written, and the gaps that are filled. In seconds, without the offset.
    CoveredRanges done;
};

using GapTracks = std::map<const ITrackNode*, GapTrack>;

/// The tracks, with what the cuts have written on each.
GapTracks gapTracksOf(const std::vector<Track>& tracks, const core::CutList& cuts)
{
    GapTracks found;
    for (const Track& track : tracks)
        found.emplace(track.node(), GapTrack{track.prepareVirginRange(), {}});
    for (std::size_t i = 0; i < cuts.size(); ++i) {
        for (const auto& cutEvent : cuts.cutAt(i)->cutEvents()) {
            const auto ofTrack = found.find(hostEvent(cutEvent).track().node());
            const SecondsRange written = cutEvent->written();
            if (ofTrack != found.end() && isBefore(written.start, written.end))
                ofTrack->second.done.add(written);
        }
    }
    return found;
}

std::vector<const Track*> pointersTo(const std::vector<Track>& tracks)
{
    std::vector<const Track*> pointers;
    for (const Track& track : tracks)
        pointers.push_back(&track);
    return pointers;
}

/// From the time origin.
EventReach reachOf(const Track& track)
{
    std::vector<SecondsRange> events;
    for (const auto& event : childrenOf(*required(query<IProjectNode>(track.node()))))
        events.push_back({event->getStart(nullptr), event->getEnd(nullptr)});
    return EventReach(std::move(events));
}

/// The text of an EDL as the host can take it: one that is no UTF-8 has "?" for all that isn't ASCII.
std::string hostText(std::string text)
{
    try {
        StringUtil::toWide(text);
    } catch (Result::Type failure) {
        if (failure != Result::InvalidArgument)
            throw;
        std::ranges::replace_if(
            text, [](char byte) { return (static_cast<unsigned char>(byte) & 0x80) != 0; }, '?');
    }
    return text;
}

/// The blank after a reel is deliberate.
std::wstring destinationName(const core::EventBase& event, const core::Settings& settings)
{
    const std::string name = settings.matchBy() == core::MatchBy::ClipName ? event.clipName() : event.rollName() + " ";
    return L"Event: " + std::to_wstring(event.eventNumber()) + L" - " + StringUtil::toWide(hostText(name));
}

} // namespace

std::vector<SecondsRange> Project::material()
{
    const double origin = timeOrigin();
    std::vector<SecondsRange> stretches;
    for (const Track& track : conformedTracks()) {
        // Each run marks anew.
        if (isMarkerTrackOfRuns(track))
            continue;
        // A run takes away all that stands on a track, of whatever kind.
        for (const auto& event : childrenOf(*required(query<IProjectNode>(track.node())))) {
            const SecondsRange span = track.eventSpan(HostEvent(track, event));
            stretches.push_back({origin + span.start, origin + span.end});
        }
        for (const auto& curve : curvesOf(*track.node())) {
            for (const auto& point : childrenOf(*curve)) {
                const double start = origin + point->getStart(nullptr);
                stretches.push_back({start, start});
            }
        }
    }
    return stretches;
}

std::shared_ptr<core::Cut> Project::makeCut(const std::shared_ptr<core::EventBase>& changeEvent)
{
    const core::Framerate framerate = getFramerate();
    const double srcIn = changeEvent->srcIn().toSeconds(framerate);
    const double srcOut = changeEvent->srcOut().toSeconds(framerate);
    const double dstIn = changeEvent->dstIn().toSeconds(framerate);
    const double dstOut = changeEvent->dstOut().toSeconds(framerate);

    core::Cut::CutEvents cutEvents;
    for (const Track& track : conformedTracks()) {
        // The markers of an earlier run aren't carried over: this run writes them anew.
        if (isMarkerTrackOfRuns(track))
            continue;
        auto cutEvent = std::make_shared<CutEvent>(track, m_indexes);
        cutEvent->setSrcIn(srcIn);
        cutEvent->setSrcOut(srcOut);
        cutEvent->setDstIn(dstIn);
        cutEvent->setDstOut(dstOut);
        cutEvents.push_back(std::move(cutEvent));
    }
    return std::make_shared<core::Cut>(changeEvent, std::move(cutEvents));
}

void Project::processCut(IEditTransaction& transaction, core::Cut& cut)
{
    const double offset = requiredOffset();
    const core::EventBase& event = *cut.event();
    if (m_progress)
        m_progress->setText(destinationName(event, m_model.settings()));
    bool hasGap = false;
    for (const SourceGroup& group : groupsOf(cut)) {
        // There is no room before the begin of the host's timeline, nor before that of the preview stretch. What comes along
        // of a clip that hangs over may reach there, and events may after the time origin has moved.
        const double missing = std::max(earliestPlace() - group.destination, 0.0);
        const double start = group.source.start + missing;
        hasGap = hasGap || isLeftOut(group.tracks, group.source, group.destination);
        if (isBefore(start, group.source.end))
            copyRange(group.tracks, start, group.source.end, group.destination + missing + offset);
    }
    if (hasGap)
        m_leftOutEvents.push_back(event.eventNumber());
    tick(cut.cutEvents().size());
    const Track& destinations = markerTrack(TrackRole::Destination);
    if (m_model.settings().createDestinationMarkers() && !(destinations.isAlive() && destinations.hostLocked()))
        writeDestinationMarker(transaction, event);
}

//     earliest place             |
//     new place             |--------------|
//     left out              |----|
bool Project::isLeftOut(const std::vector<const Track*>& tracks, const SecondsRange& source, double destination)
{
    const double length = source.end - source.start;
    SecondsRange place{destination, std::min(destination + length, earliestPlace())};
    const core::Settings& settings = m_model.settings();
    if (settings.restrictRange()) {
        place.start = std::max(place.start, settings.preserveMaterialBefore());
        place.end = std::min(place.end, settings.preserveMaterialAfter());
    }
    if (!isBefore(place.start, place.end))
        return false;
    const double toHost = source.start - destination - timeOrigin();
    return std::ranges::any_of(tracks, [&](const Track* track) {
        auto sources = m_sources.find(track->node());
        if (sources == m_sources.end())
            sources = m_sources.emplace(track->node(), reachOf(*track)).first;
        return sources->second.reachesInto({place.start + toHost, place.end + toHost});
    });
}

void Project::writeDestinationMarker(IEditTransaction& transaction, const core::EventBase& event)
{
    const double offset = requiredOffset();
    const core::Framerate framerate = getFramerate();
    m_indexes.clear();
    Marker{event.dstIn().toSeconds(framerate) + offset, event.dstOut().toSeconds(framerate) + offset,
           destinationName(event, m_model.settings()), hostText(event.rollName())}
        .insertInto(m_hostContext, transaction, markerTrack(TrackRole::Destination));
}

void Project::generateMarkers(IEditTransaction& transaction, const std::vector<core::MarkerEntry>& entries)
{
    const double offset = requiredOffset();
    m_indexes.clear();
    for (const core::MarkerEntry& entry : entries) {
        const Track& track = markerTrack(core::MarkerTrack::ofKind(entry.kind).role);
        if (!takesMarkers(track))
            continue;
        Marker{entry.start + offset, entry.end + offset, StringUtil::toWide(hostText(entry.name)), {}}.insertInto(
            m_hostContext, transaction, track);
        tick(1);
    }
}

//     range     |                                              |
//     cuts      |     |-- fade --|     |-- 1 --|-- 2 --|       |
//     before     _____|``--..____|_____|```````|--..___|_______       what the curve has come to at the end of the reel
//     after      `````|``--..____|_____|```````|--..___|_______
//
// Before the first cut of a whole programme there is nothing to keep. Before a part of one there is.
void Project::holdAutomation(IEditTransaction& transaction, const core::CutList& cuts, bool isWholeProgramme)
{
    const double offset = requiredOffset();
    const bool isPart = isWholeProgramme && m_model.settings().restrictRange();
    m_indexes.clear();
    double start = 0.0;
    double end = 0.0;
    getApplyRange(start, end);
    start = std::max(start, 0.0);
    const double previewEnd = std::min(end, offset - ClearedMargin);
    // A preview shows what lies beyond the range too.
    end = isPart ? end : offset;
    for (auto& [node, track] : gapTracksOf(conformedTracks(), cuts)) {
        const std::vector<SecondsRange> gaps =
            isPart || !track.done.isEmpty() ? track.done.uncovered({start, end}) : std::vector<SecondsRange>();
        for (AutomationCurve& curve : track.curves) {
            for (const SecondsRange& gap : gaps) {
                const bool isFirst = !isBefore(start, gap.start);
                const bool isLast = !isBefore(gap.end, end);
                if (isFirst && isPart)
                    curve.holdAsAt(start, m_hostContext, transaction, gap.start + offset, gap.end + offset);
                else if (isFirst)
                    curve.holdBackwards(m_hostContext, transaction, gap.start + offset, gap.end + offset);
                else if (!isLast || isPart)
                    curve.hold(m_hostContext, transaction, gap.start + offset, gap.end + offset);
                else if (isWholeProgramme)
                    curve.holdLast(m_hostContext, transaction, gap.start + offset, gap.end + offset);
                else
                    curve.hold(m_hostContext, transaction, gap.start + offset, previewEnd + offset);
            }
        }
    }
}

//     cuts       |---- i - 1 ----|        |---- i ----|
//     curve    --+--.      .-----+--------+---.   .---+--
//                    `----'                    `-'
//
// Cuts are in the order of the change list, so that another one may lie between them.
void Project::markVirginTerritories(IEditTransaction& transaction, const core::CutList& cuts)
{
    const double offset = requiredOffset();
    m_indexes.clear();
    GapTracks tracks = gapTracksOf(conformedTracks(), cuts);
    for (std::size_t i = 1; i < cuts.size(); ++i) {
        tick(tracks.size());
        const core::Cut& before = *cuts.cutAt(i - 1);
        const core::Cut& behind = *cuts.cutAt(i);
        if (behind.event()->dstIn() == before.event()->dstOut())
            continue;
        // The cuts of a run have their tracks in the same order.
        const std::size_t count = std::min(before.cutEvents().size(), behind.cutEvents().size());
        for (std::size_t index = 0; index < count; ++index) {
            const CutEvent& a = hostEvent(before.cutEvents()[index]);
            const CutEvent& b = hostEvent(behind.cutEvents()[index]);
            const auto ofTrack = tracks.find(a.track().node());
            const SecondsRange gap{a.dstOut(), b.dstIn()};
            if (!(b.track() == a.track()) || ofTrack == tracks.end() || !isLongEnough(gap))
                continue;
            auto& [curves, done] = ofTrack->second;
            for (const SecondsRange& piece : done.add(gap)) {
                if (isLongEnough(piece))
                    a.track().fillAutomationGap(transaction, curves, piece.start + offset, piece.end + offset);
            }
        }
    }
}

void Project::completeApply(IEditTransaction& transaction)
{
    std::vector<Track> tracks = conformedTracks();
    double start = 0.0;
    double end = 0.0;
    getApplyRange(start, end);
    // No timecode names a time before, so that nothing could come there in the place of what is there.
    start = std::max(start, 0.0);
    if (isBefore(start, end))
        moveBack(transaction, tracks, start, end);
    // What stands past the day, or outside of the range, isn't brought back.
    rememberWritten();
    clearPreview(transaction);
    for (const Track& track : tracks) {
        for (AutomationCurve& curve : track.prepareVirginRange())
            curve.dropNeedless(transaction, start, end);
    }
}

//     before    real |== old ==|           preview |== new ==|
//     after     real |== new ==|           preview
void Project::moveBack(IEditTransaction& transaction, std::vector<Track>& tracks, double start, double end)
{
    const double offset = requiredOffset();
    m_indexes.clear();
    for (Track& track : tracks) {
        track.removeRange(transaction, start, end);
        tick(1);
    }
    const double origin = timeOrigin();
    const double carried = std::max(start, origin);
    if (isBefore(carried, end))
        copyRange(pointersTo(tracks), carried + offset, end + offset, carried);
    for (const Track& track : tracks)
        removePoints(transaction, track, {start + offset - origin, end + offset - origin});
    deleteRange(transaction, start + offset, end + offset);
}

double Project::earliestPlace() const
{
    return std::max(timeOrigin(), 0.0);
}

void Project::getApplyRange(double& start, double& end) const
{
    // The preview lies days later when something stands past the programme, which no timecode names. What lies past the day
    // isn't replaced either: there the preview itself may stand.
    const double latest = std::min(requiredOffset(), dayLength());
    const core::Settings& settings = m_model.settings();
    start = settings.restrictRange() ? std::max(settings.preserveMaterialBefore(), 0.0) : 0.0;
    end = settings.restrictRange() ? std::min(settings.preserveMaterialAfter(), latest) : latest;
    // Nothing lies between bounds that are stored the wrong way round, or are no numbers.
    if (!(start <= end))
        start = end = latest;
}

void Project::closeRange(bool onlySelected, double start, double end)
{
    m_indexes.clear();
    std::vector<Track> tracks = cadrelTracks();
    std::erase_if(tracks, [onlySelected](const Track& track) {
        return track.hostLocked() || (onlySelected && !track.isSelected());
    });
    const double origin = timeOrigin();
    const int32 result =
        required(service<IEditService>(m_hostContext))
            ->closeRange(m_document.get(), listOf(pointersTo(tracks)).get(), start - origin, end - origin, 0.0);
    // It is no failure if there is nothing to join.
    if (result != ResultFalse)
        requireOk(result);
}

void Project::extendProjectEnd(bool active)
{
    if (!m_model.isPreviewActive()) {
        m_end.putBack();
        return;
    }
    const double offset = requiredOffset();
    std::vector<Track> tracks = cadrelTracks();
    if (active)
        std::erase_if(tracks, [](const Track& track) { return !track.hasChanged(); });
    m_end.putOffTo(offset + dayAfter(latestEnd(tracks, offset, 0.0)) - timeOrigin(), hasWritten());
}

double Project::contentEnd()
{
    double end = 0.0;
    for (const auto& track : allTracks()) {
        const auto node = required(query<IProjectNode>(track));
        if (node->isType(TypeWord::Folder))
            continue;
        for (const Counted<IProjectNode>& event : childrenOf(*node))
            end = std::max(end, event->getEnd(nullptr));
    }
    return end;
}

bool Project::isWanted(const Track& track) const
{
    return m_model.settings().applyTo() != ApplyTo::SelectedTracks || track.isSelected();
}

std::vector<Track> Project::conformedTracks()
{
    findMarkerTracks();
    std::vector<Track> tracks = m_tracksOfEdit ? *m_tracksOfEdit : cadrelTracks();
    std::erase_if(tracks, [this](const Track& track) {
        return track.hostLocked() || !(m_tracksOfEdit || isWanted(track) || isMarkerTrack(track));
    });
    return tracks;
}

Counted<IObjectList> Project::listOf(const std::vector<const Track*>& tracks) const
{
    auto list = required(create<IObjectList>(m_hostContext));
    for (const Track* track : tracks)
        requireOk(list->add(track->node(), 0));
    return list;
}

void Project::copyRange(const std::vector<const Track*>& tracks, double start, double end, double destination)
{
    m_indexes.clear();
    const double origin = timeOrigin();
    requireOk(
        required(service<IEditService>(m_hostContext))
            ->copyRange(m_document.get(), listOf(tracks).get(), 0, start - origin, end - origin, destination - origin));
}

void Project::deleteRange(IEditTransaction& transaction, double start, double end)
{
    m_indexes.clear();
    const double origin = timeOrigin();
    requireOk(transaction.deleteRange(m_document.get(), 0, start - origin, end - origin));
}

void Project::tick(std::uint64_t steps)
{
    if (m_progress)
        m_progress->tick(steps);
}

} // namespace cadrel::host
