// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/conform/CadrelerBase.h"

#include "core/conform/SnippetAlgorithm.h"
#include "core/cut/CutList.h"
#include "core/cut/ProgressHandlerBase.h"
#include "core/detect/AutomationWarningDetectAlgorithm.h"
#include "core/detect/InsertDetectAlgorithm.h"
#include "core/detect/OverlapDetectAlgorithm.h"
#include "core/detect/RemainsDetectAlgorithm.h"
#include "core/detect/TransitionDetectAlgorithm.h"
#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/settings/Settings.h"
#include "core/time/SecondsRange.h"
#include "util/StringUtil.h"

#include <iterator>
#include <utility>

namespace cadrel::core {

using util::Result;

namespace {

struct Detection {
    std::wstring progressText; ///< not translated
    std::unique_ptr<CadrelInformationAlgorithm> algorithm;
};

/// The detect algorithms that are switched on, in the order in which they run.
std::vector<Detection> detections(const Settings& settings)
{
    std::vector<Detection> found;
    if (settings.createInsertMarkers())
        found.push_back({L"Insert Markers", std::make_unique<InsertDetectAlgorithm>()});
    if (settings.createDissolveWipeMarkers())
        found.push_back({L"Dissolve/Wipe Markers", std::make_unique<TransitionDetectAlgorithm>()});
    if (settings.createAudioSnippetMarkers())
        found.push_back(
            {L"Audio Snippet Markers", std::make_unique<RemainsDetectAlgorithm>(settings.remainsThreshold())});
    if (settings.createAutomationWarningMarkers())
        found.push_back({L"Automation Warning Markers", std::make_unique<AutomationWarningDetectAlgorithm>()});
    if (settings.createOverlapMarkers())
        found.push_back({L"Overlap Markers", std::make_unique<OverlapDetectAlgorithm>()});
    return found;
}

/// Runs the steps one after the other, up to the first that returns or throws a failure.
template <typename... Steps>
Result::Type inTurn(Steps... steps)
{
    try {
        Result::Type result = Result::Ok;
        (void)(((result = steps()) == Result::Ok) && ...);
        return result;
    } catch (Result::Type result) {
        return result;
    }
}

/// Keeps the entries that reach into the stretch from `from` to `to` seconds.
void restrictTo(double from, double to, std::vector<MarkerEntry>& entries)
{
    std::erase_if(entries, [&](const MarkerEntry& entry) {
        return entry.end - from < SameInstant || to - entry.start < SameInstant;
    });
}

} // namespace

Result::Type CadrelerBase::run(const EventList& changeList)
{
    CutList cuts;
    return inTurn([&] { return moveMaterial(changeList, cuts); },
                  [&] { return generateMarkers(createMarkers(cuts, getRunState())); },
                  [&] { return completeCadrel(); });
}

Result::Type CadrelerBase::startPreview(const EventList& events, std::uint64_t /*first*/, std::uint64_t /*last*/,
                                        std::uint32_t /*options*/)
{
    CutList cuts;
    return inTurn([&] { return moveMaterial(events, cuts); },
                  [&] { return events.isEmpty() ? Result::Ok : generatePreviewMarkers(cuts); });
}

Result::Type CadrelerBase::endPreview()
{
    return removeVirginTerritoryMarkers();
}

Result::Type CadrelerBase::moveMaterial(const EventList& events, CutList& cuts)
{
    return inTurn([&] { return removeVirginTerritoryMarkers(); }, [&] { return collectCuts(events, cuts); },
                  [&] { return SnippetAlgorithm().process(cuts, getPreviewState()); },
                  [&] { return applyVirginTerritories(cuts); });
}

Result::Type CadrelerBase::collectCuts(const EventList& events, CutList& cuts)
{
    for (const auto& event : events.events()) {
        if (!event->hasFlaw(EventFlaw::TimecodeInvalid))
            cuts.add(makeCutEvents(event));
    }
    return Result::Ok;
}

Result::Type CadrelerBase::applyVirginTerritories(CutList& cuts)
{
    for (std::size_t i = 0; i < cuts.size(); ++i) {
        const Result::Type result = inTurn([&] { return processEvent(*cuts.cutAt(i)); });
        if (result != Result::Ok)
            return result;
    }
    return Result::Ok;
}

std::vector<MarkerEntry> CadrelerBase::createMarkers(const CutList& cuts, const CadrelRunState& state)
{
    std::vector<MarkerEntry> entries;
    for (const Detection& detection : detections(*state.settings)) {
        if (m_progress)
            m_progress->setText(util::StringUtil::translate(detection.progressText));
        std::vector<MarkerEntry> found = detection.algorithm->detect(cuts, state, m_progress);
        std::move(found.begin(), found.end(), std::back_inserter(entries));
    }
    return entries;
}

Result::Type CadrelerBase::generatePreviewMarkers(const CutList& cuts)
{
    const CadrelRunState state = getRunState();
    std::vector<MarkerEntry> entries = createMarkers(cuts, state);
    const EventList& previewed = cuts.events();
    if (previewed.isEmpty())
        entries.clear();
    else
        restrictTo(previewed.at(0).dstIn().toSeconds(state.framerate),
                   previewed.at(previewed.size() - 1).dstOut().toSeconds(state.framerate), entries);
    return generateMarkers(entries);
}

std::uint64_t CadrelerBase::estimateSteps(std::uint64_t eventCount, const Settings& settings, std::uint64_t trackCount)
{
    std::uint64_t steps = 0;
    for (const Detection& detection : detections(settings))
        steps += detection.algorithm->estimateSteps(eventCount, trackCount);
    return steps;
}

} // namespace cadrel::core
