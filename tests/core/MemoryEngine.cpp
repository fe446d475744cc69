#include "tests/core/MemoryEngine.h"

#include "core/Cut.h"
#include "core/DataModel.h"
#include "core/EventBase.h"
#include "core/ProgressHandlerBase.h"
#include "core/Settings.h"
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
        : shown_(shown)
    {
        shown_ = progress;
        if (shown_)
            shown_->start(util::StringUtil::translate(title), steps, canCancel);
    }
    ShownProgress(const ShownProgress&) = delete;
    ShownProgress& operator=(const ShownProgress&) = delete;
    ~ShownProgress()
    {
        if (shown_)
            shown_->finish();
        shown_ = nullptr;
    }

private:
    core::ProgressHandlerBase*& shown_;
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
    return tracks_.emplace_back(name, isAudio);
}

double MemoryEngine::stretchStart()
{
    if (!stretchStart_) {
        double end = 0.0;
        for (const MemoryTrack& track : tracks_)
            end = std::max(end, track.end());
        const core::Framerate framerate = Timecode::framerate();
        const double day = (framerate.lastFrame + 1) / framerate.rate;
        stretchStart_ = (std::floor(end / day) + 1.0) * day;
    }
    return *stretchStart_;
}

Result::Type MemoryEngine::onIdle()
{
    Result::Type result = Result::Ok;
    if (std::exchange(isRunRequested_, false))
        result = carryOutRun();
    if (const auto request = std::exchange(requestedPreview_, std::nullopt)) {
        const Result::Type ofPreview = carryOutPreview(*request);
        if (result == Result::Ok)
            result = ofPreview;
    }
    return result;
}

Result::Type MemoryEngine::carryOutRun()
{
    const core::EventList& changeList = model_.changeEdl();
    const ShownProgress shown(m_progress, progress_, L"Processing Project",
                              estimateSteps(changeList.size(), model_.settings(), candidates().size()), true);
    const Result::Type result = run(changeList);
    if (result == Result::Cancelled)
        removeVirginTerritoryMarkers();
    return result;
}

Result::Type MemoryEngine::carryOutPreview(const PreviewRequest& request)
{
    const ShownProgress shown(m_progress, progress_, L"Project Preview",
                              estimateSteps(request.events.size(), model_.settings(), candidates().size()), false);
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
    if (result == Result::Ok)
        isRunRequested_ = true;
    return result;
}

Result::Type MemoryEngine::startPreview(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                                        std::uint32_t options)
{
    const Result::Type result = canStart();
    if (result == Result::Ok)
        requestedPreview_.emplace(PreviewRequest{events, first, last, options});
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
    left = transport_.projectCycle.start;
    right = transport_.projectCycle.end;
    return Result::Ok;
}

Result::Type MemoryEngine::setProjectCycle(double left, double right)
{
    return setCycle(transport_.projectCycle, left, right);
}

Result::Type MemoryEngine::getTransportCycle(double& left, double& right)
{
    left = transport_.cycle.start;
    right = transport_.cycle.end;
    return Result::Ok;
}

Result::Type MemoryEngine::setTransportCycle(double left, double right)
{
    return setCycle(transport_.cycle, left, right);
}

Result::Type MemoryEngine::getTransportPosition(double& seconds)
{
    seconds = transport_.position;
    return Result::Ok;
}

Result::Type MemoryEngine::setTransportPosition(double seconds)
{
    transport_.position = seconds;
    return Result::Ok;
}

Result::Type MemoryEngine::endPreview()
{
    projectEvents_.clear();
    return CadrelerBase::endPreview();
}

void MemoryEngine::setPreviewActive(bool active)
{
    if (active == isPreviewActive())
        return;
    model_.setPreviewActive(active);
    if (active) {
        transportBeforePreview_ = transport_;
    } else {
        transport_ = transportBeforePreview_;
        endPreview();
    }
}

bool MemoryEngine::isPreviewActive()
{
    return model_.isPreviewActive();
}

Result::Type MemoryEngine::canStart()
{
    if (model_.changeEdl().isEmpty())
        return Result::ChangeEdlEmpty;
    if (tracks_.empty())
        return Result::NoTracks;
    return candidates().empty() ? Result::NoTracksSelected : Result::Ok;
}

Result::Type MemoryEngine::removeVirginTerritoryMarkers()
{
    if (stretchStart_) {
        for (MemoryTrack& track : tracks_)
            track.removeFrom(*stretchStart_);
    }
    stretchMarkers_.clear();
    stretchStart_.reset();
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
    std::erase_if(markers_, isReplaced);
    std::copy_if(stretchMarkers_.begin(), stretchMarkers_.end(), std::back_inserter(markers_), isReplaced);
    return removeVirginTerritoryMarkers();
}

Result::Type MemoryEngine::generateMarkers(const std::vector<MarkerEntry>& entries)
{
    for (const MarkerEntry& entry : entries) {
        if (entry.kind < MarkerKind::Insert || entry.kind > MarkerKind::Overlap)
            return Result::InvalidArgument;
        stretchMarkers_.push_back(entry);
    }
    return Result::Ok;
}

core::CadrelRunState MemoryEngine::getRunState()
{
    return {&model_.oldEdl(), &model_.newEdl(), Timecode::framerate(), &model_.settings(), stretchStart()};
}

core::CadrelPreviewState MemoryEngine::getPreviewState()
{
    return {Timecode::framerate(), &model_.settings()};
}

Result::Type MemoryEngine::setProjectEvents(const core::EventList& events)
{
    projectEvents_ = events;
    return Result::Ok;
}

std::uint64_t MemoryEngine::estimateSteps(std::uint64_t eventCount, const core::Settings& settings,
                                          std::uint64_t trackCount)
{
    return CadrelerBase::estimateSteps(eventCount, settings, trackCount) + eventCount * trackCount;
}

std::vector<MemoryTrack*> MemoryEngine::candidates()
{
    const bool selectedOnly = model_.settings().applyTo() == core::ApplyTo::SelectedTracks;
    std::vector<MemoryTrack*> found;
    for (MemoryTrack& track : tracks_) {
        if (!selectedOnly || track.isSelected())
            found.push_back(&track);
    }
    return found;
}

SecondsRange MemoryEngine::replacedRange()
{
    const core::Settings& settings = model_.settings();
    if (settings.restrictRange())
        return {std::max(0.0, settings.preserveMaterialBefore()), std::max(0.0, settings.preserveMaterialAfter())};
    return {0.0, stretchStart()};
}

} // namespace cadrel::tests
