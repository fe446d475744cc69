// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/core/MemoryEngine.h"

#include "core/cut/Cut.h"
#include "core/cut/ProgressHandlerBase.h"
#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/protect/RestrictedRange.h"
#include "core/settings/Settings.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <utility>

namespace cadrel::tests {

using core::CadrelerBase;
using core::MarkerEntry;
using core::MarkerKind;
using core::SecondsRange;
using core::Timecode;
using util::Result;

namespace {

/// Shows a progress for the time of a run, also of one that ends with an exception.
class ShownProgress {
public:
    ShownProgress(core::ProgressHandlerBase*& shown, core::ProgressHandlerBase* progress, const std::wstring& title,
                  std::uint64_t steps, bool canCancel)
        : m_shown(shown)
    {
        m_shown = progress;
        if (m_shown)
            m_shown->start(util::StringUtil::translate(title), steps, canCancel);
    }
    ShownProgress(const ShownProgress&) = delete;
    ShownProgress& operator=(const ShownProgress&) = delete;
    ~ShownProgress()
    {
        if (m_shown)
            m_shown->finish();
        m_shown = nullptr;
    }

private:
    core::ProgressHandlerBase*& m_shown;
};

/// From the earliest start to the latest end on one side; nothing when no event has usable timecodes.
std::optional<SecondsRange> spanOf(const core::EventList& events, std::size_t from, std::size_t to, bool ofDestination)
{
    std::optional<SecondsRange> span;
    for (std::size_t i = from; i < to; ++i) {
        const core::EventBase& event = events.at(i);
        if (event.hasFlaw(core::EventFlaw::TimecodeInvalid))
            continue;
        const double start = (ofDestination ? event.dstIn() : event.srcIn()).toSeconds();
        const double end = (ofDestination ? event.dstOut() : event.srcOut()).toSeconds();
        span = span ? SecondsRange{std::min(span->start, start), std::max(span->end, end)} : SecondsRange{start, end};
    }
    return span;
}

Result::Type setCycle(SecondsRange& cycle, double left, double right)
{
    if (left > right)
        return Result::InvalidArgument;
    cycle = {left, right};
    return Result::Ok;
}

} // namespace

MemoryTrack& MemoryEngine::addTrack(const std::wstring& name, bool isAudio)
{
    return m_tracks.emplace_back(name, isAudio);
}

double MemoryEngine::stretchStart()
{
    if (!m_stretchStart) {
        double end = 0.0;
        for (const MemoryTrack& track : m_tracks)
            end = std::max(end, track.end());
        const core::Framerate framerate = Timecode::framerate();
        const double day = (framerate.lastFrame + 1) / framerate.rate;
        m_stretchStart = (std::floor(end / day) + 1.0) * day;
    }
    return *m_stretchStart;
}

Result::Type MemoryEngine::onIdle()
{
    Result::Type result = Result::Ok;
    if (std::exchange(m_isRunRequested, false))
        result = carryOutRun();
    if (const auto request = std::exchange(m_requestedPreview, std::nullopt)) {
        const Result::Type ofPreview = carryOutPreview(*request);
        if (result == Result::Ok)
            result = ofPreview;
    }
    return result;
}

Result::Type MemoryEngine::carryOutRun()
{
    core::EventList& changeList = m_model.changeEdl();
    if (const auto ownList = std::exchange(m_runList, std::nullopt))
        changeList = *ownList;
    const ShownProgress shown(m_progress, m_shownProgress, L"Processing Project",
                              estimateSteps(changeList.size(), m_model.settings(), candidates().size()), true);
    std::optional<core::RestrictedRange> restricted;
    if (m_runBounds)
        restricted.emplace(m_model.settings(), *m_runBounds);
    const Result::Type result = run(changeList);
    if (result == Result::Cancelled)
        removeVirginTerritoryMarkers();
    return result;
}

Result::Type MemoryEngine::carryOutPreview(const PreviewRequest& request)
{
    const ShownProgress shown(m_progress, m_shownProgress, L"Project Preview",
                              estimateSteps(request.events.size(), m_model.settings(), candidates().size()), false);
    const Result::Type result =
        CadrelerBase::startPreview(request.events, request.first, request.last, request.options);
    if (result != Result::Ok)
        return result;
    setProjectEvents(request.events);
    return cycleToEvents(request.events, request.first, request.last, request.options);
}

Result::Type MemoryEngine::startCadrel()
{
    const Result::Type result = canStart();
    if (result == Result::Ok) {
        m_isRunRequested = true;
        m_runBounds.reset();
        m_runList.reset();
    }
    return result;
}

Result::Type MemoryEngine::startCadrelWithin(const core::SecondsRange& bounds)
{
    const Result::Type result = startCadrel();
    if (result == Result::Ok)
        m_runBounds = bounds;
    return result;
}

Result::Type MemoryEngine::startCadrelWithin(const core::SecondsRange& bounds, const core::EventList& changeList)
{
    const Result::Type result = startCadrelWithin(bounds);
    if (result == Result::Ok)
        m_runList.emplace(changeList);
    return result;
}

std::vector<core::SecondsRange> MemoryEngine::getMaterial()
{
    std::vector<core::SecondsRange> material;
    for (const MemoryTrack* const track : candidates()) {
        for (const MemoryClip& clip : track->clips())
            material.push_back({clip.start, clip.end});
    }
    return material;
}

Result::Type MemoryEngine::startPreview(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                                        std::uint32_t options)
{
    const Result::Type result = canStart();
    if (result == Result::Ok)
        m_requestedPreview.emplace(PreviewRequest{events, first, last, options});
    return result;
}

Result::Type MemoryEngine::cycleToEvents(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                                         std::uint32_t options)
{
    if (events.isEmpty())
        return Result::Ok;
    if (first > events.size() || last > events.size() - first)
        return Result::InvalidArgument;
    const bool ofDestination = options != 0;
    auto span = spanOf(events, first, events.size() - last, ofDestination);
    if (!span)
        return Result::Ok;
    if (ofDestination) {
        const double shift = stretchStart();
        span = SecondsRange{span->start + shift, span->end + shift};
    }
    setTransportPosition(span->start);
    const Result::Type result = setTransportCycle(span->start, span->end);
    return result != Result::Ok ? result : setProjectCycle(span->start, span->end);
}

Result::Type MemoryEngine::getProjectCycle(double& left, double& right)
{
    left = m_transport.projectCycle.start;
    right = m_transport.projectCycle.end;
    return Result::Ok;
}

Result::Type MemoryEngine::setProjectCycle(double left, double right)
{
    return setCycle(m_transport.projectCycle, left, right);
}

Result::Type MemoryEngine::getTransportCycle(double& left, double& right)
{
    left = m_transport.cycle.start;
    right = m_transport.cycle.end;
    return Result::Ok;
}

Result::Type MemoryEngine::setTransportCycle(double left, double right)
{
    return setCycle(m_transport.cycle, left, right);
}

Result::Type MemoryEngine::getTransportPosition(double& seconds)
{
    seconds = m_transport.position;
    return Result::Ok;
}

Result::Type MemoryEngine::setTransportPosition(double seconds)
{
    m_transport.position = seconds;
    return Result::Ok;
}

Result::Type MemoryEngine::endPreview()
{
    m_projectEvents.clear();
    return CadrelerBase::endPreview();
}

void MemoryEngine::setPreviewActive(bool active)
{
    if (active == isPreviewActive())
        return;
    m_model.setPreviewActive(active);
    if (active) {
        m_transportBeforePreview = m_transport;
    } else {
        m_transport = m_transportBeforePreview;
        endPreview();
    }
}

bool MemoryEngine::isPreviewActive()
{
    return m_model.isPreviewActive();
}

Result::Type MemoryEngine::canStart()
{
    if (m_model.changeEdl().isEmpty())
        return Result::ChangeEdlEmpty;
    if (m_tracks.empty())
        return Result::NoTracks;
    return candidates().empty() ? Result::NoTracksSelected : Result::Ok;
}

Result::Type MemoryEngine::removeVirginTerritoryMarkers()
{
    if (m_stretchStart) {
        for (MemoryTrack& track : m_tracks)
            track.removeFrom(*m_stretchStart);
    }
    m_stretchMarkers.clear();
    m_stretchStart.reset();
    return Result::Ok;
}

Result::Type MemoryEngine::processEvent(core::Cut& cut)
{
    if (m_progress && m_progress->isCancelled())
        return Result::Cancelled;
    for (const auto& cutEvent : cut.cutEvents()) {
        // Nothing can stand before the start of the programme, and a range that has no length or runs backwards holds
        // nothing.
        const double tooEarly = std::max(0.0, -cutEvent->dstIn());
        const double srcIn = cutEvent->srcIn() + tooEarly;
        if (srcIn < cutEvent->srcOut()) {
            MemoryTrack& track = static_cast<MemoryCutEvent&>(*cutEvent).track();
            track.copyRange(srcIn, cutEvent->srcOut(), stretchStart() + cutEvent->dstIn() + tooEarly);
        }
    }
    if (m_progress)
        m_progress->tick(cut.cutEvents().size());
    return Result::Ok;
}

std::shared_ptr<core::Cut> MemoryEngine::makeCutEvents(const std::shared_ptr<core::EventBase>& changeEvent)
{
    const double srcIn = changeEvent->srcIn().toSeconds();
    const double srcOut = changeEvent->srcOut().toSeconds();
    const double dstIn = changeEvent->dstIn().toSeconds();
    const double dstOut = changeEvent->dstOut().toSeconds();
    core::Cut::CutEvents cutEvents;
    for (MemoryTrack* track : candidates())
        cutEvents.push_back(std::make_shared<MemoryCutEvent>(*track, srcIn, srcOut, dstIn, dstOut));
    return std::make_shared<core::Cut>(changeEvent, std::move(cutEvents));
}

Result::Type MemoryEngine::completeCadrel()
{
    const SecondsRange replaced = replacedRange();
    for (MemoryTrack* track : candidates())
        track->copyRange(stretchStart() + replaced.start, stretchStart() + replaced.end, replaced.start);

    const auto isReplaced = [&](const MarkerEntry& marker) {
        return replaced.start <= marker.start && marker.start < replaced.end;
    };
    std::erase_if(m_markers, isReplaced);
    std::copy_if(m_stretchMarkers.begin(), m_stretchMarkers.end(), std::back_inserter(m_markers), isReplaced);
    return removeVirginTerritoryMarkers();
}

Result::Type MemoryEngine::generateMarkers(const std::vector<MarkerEntry>& entries)
{
    for (const MarkerEntry& entry : entries) {
        if (entry.kind < MarkerKind::Insert || entry.kind > MarkerKind::Overlap)
            return Result::InvalidArgument;
        m_stretchMarkers.push_back(entry);
    }
    return Result::Ok;
}

core::CadrelRunState MemoryEngine::getRunState()
{
    return {&m_model.oldEdl(), &m_model.newEdl(), Timecode::framerate(), &m_model.settings(), stretchStart(), 0.0};
}

core::CadrelPreviewState MemoryEngine::getPreviewState()
{
    return {Timecode::framerate(), &m_model.settings()};
}

Result::Type MemoryEngine::setProjectEvents(const core::EventList& events)
{
    m_projectEvents = events;
    return Result::Ok;
}

std::uint64_t MemoryEngine::estimateSteps(std::uint64_t eventCount, const core::Settings& settings,
                                          std::uint64_t trackCount)
{
    return CadrelerBase::estimateSteps(eventCount, settings, trackCount) + eventCount * trackCount;
}

std::vector<MemoryTrack*> MemoryEngine::candidates()
{
    const bool selectedOnly = m_model.settings().applyTo() == core::ApplyTo::SelectedTracks;
    std::vector<MemoryTrack*> found;
    for (MemoryTrack& track : m_tracks) {
        if (!selectedOnly || track.isSelected())
            found.push_back(&track);
    }
    return found;
}

SecondsRange MemoryEngine::replacedRange()
{
    const core::Settings& settings = m_model.settings();
    if (settings.restrictRange())
        return {std::max(0.0, settings.preserveMaterialBefore()), std::max(0.0, settings.preserveMaterialAfter())};
    return {0.0, stretchStart()};
}

} // namespace cadrel::tests
