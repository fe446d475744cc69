// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/conform/CadrelerBase.h"
#include "core/edl/EventList.h"
#include "core/time/SecondsRange.h"
#include "tests/support/core/MemoryTrack.h"

#include <cstdint>
#include <deque>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace cadrel::core {

class DataModel;

} // namespace cadrel::core

namespace cadrel::tests {

/// The smallest engine that conforms real tracks: what another engine has to do, and no more.
///
/// Ranges can't be copied in place, since the first of two scenes that change places would overwrite the second. So
/// each cut copies from the old programme, which stays as it is, to a stretch behind all material:
///
///     the old programme           the stretch
///     |--- A ---|--- B ---|       :                       before
///     |--- A ---|--- B ---|       :--- B ---|--- A ---|   after processEvent of both cuts
///     |--- B ---|--- A ---|       :                       after completeCadrel
///
/// The stretch opens with the first that goes there, at the first whole day behind the end of all tracks, so that a
/// time of the new programme and its place in the stretch are whole days apart. A run moves it to the front. A preview
/// leaves it where it is, until the next preview or run or the end of the preview takes it away; so does a run that
/// the user cancels, which therefore never has happened.
///
/// There are no locked tracks, no destination markers, no virgin territories and no videos.
class MemoryEngine : public core::CadrelerBase {
public:
    /// The model isn't owned. Needs a TestProject, as all that follows.
    explicit MemoryEngine(core::DataModel& model) : m_model(model) {}

    /// References to tracks stay valid.
    MemoryTrack& addTrack(const std::wstring& name, bool isAudio = true);
    std::deque<MemoryTrack>& tracks() { return m_tracks; }
    /// The markers of the programme, and those of the stretch, both in the time of the programme.
    const std::vector<core::MarkerEntry>& markers() const { return m_markers; }
    const std::vector<core::MarkerEntry>& stretchMarkers() const { return m_stretchMarkers; }
    bool hasStretch() const { return m_stretchStart.has_value(); }
    /// In seconds; opens the stretch.
    double stretchStart();
    /// The events that the present preview shows.
    const core::EventList& projectEvents() const { return m_projectEvents; }

    /// Follows the runs and previews from the next one on; null for none. Not owned.
    void setProgress(core::ProgressHandlerBase* progress) { m_shownProgress = progress; }
    /// Carries out what has been requested since the last call, a run before a preview; the host of an engine calls it
    /// when it has nothing else to do. The first failure is the result.
    util::Result::Type onIdle();

    util::Result::Type startCadrel() override;
    util::Result::Type startCadrelWithin(const core::SecondsRange& bounds) override;
    util::Result::Type startCadrelWithin(const core::SecondsRange& bounds, const core::EventList& changeList) override;
    std::vector<core::SecondsRange> getMaterial() override;
    util::Result::Type startPreview(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                                    std::uint32_t options) override;
    /// Sets both cycles to the span of the events without the neighbours, and the position to its start.
    util::Result::Type cycleToEvents(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                                     std::uint32_t options) override;
    util::Result::Type getProjectCycle(double& left, double& right) override;
    util::Result::Type setProjectCycle(double left, double right) override;
    util::Result::Type getTransportCycle(double& left, double& right) override;
    util::Result::Type setTransportCycle(double left, double right) override;
    util::Result::Type getTransportPosition(double& seconds) override;
    util::Result::Type setTransportPosition(double seconds) override;
    util::Result::Type endPreview() override;
    /// Empty: no file holds the project.
    std::wstring getProjectName() override { return {}; }
    core::MediaPoolInterface* getMediaPool() override { return nullptr; }
    double getTimeOrigin() override { return 0.0; }
    /// Off puts cycles and position back to where they were when it went on, and ends the preview.
    void setPreviewActive(bool active) override;
    bool isPreviewActive() override;

    util::Result::Type canStart() override;
    util::Result::Type removeVirginTerritoryMarkers() override;
    util::Result::Type processEvent(core::Cut& cut) override;
    std::shared_ptr<core::Cut> makeCutEvents(const std::shared_ptr<core::EventBase>& changeEvent) override;
    util::Result::Type completeCadrel() override;
    util::Result::Type generateMarkers(const std::vector<core::MarkerEntry>& entries) override;
    core::CadrelRunState getRunState() override;
    core::CadrelPreviewState getPreviewState() override;
    util::Result::Type setProjectEvents(const core::EventList& events) override;
    std::uint64_t estimateSteps(std::uint64_t eventCount, const core::Settings& settings,
                                std::uint64_t trackCount) override;

private:
    struct PreviewRequest {
        core::EventList events;
        std::uint64_t first;
        std::uint64_t last;
        std::uint32_t options;
    };
    struct Transport {
        core::SecondsRange projectCycle;
        core::SecondsRange cycle;
        double position = 0.0;
    };

    util::Result::Type carryOutRun();
    util::Result::Type carryOutPreview(const PreviewRequest& request);
    /// The tracks that a run may change.
    std::vector<MemoryTrack*> candidates();
    /// The part of the programme that a run replaces.
    core::SecondsRange replacedRange();

    core::DataModel& m_model;
    core::ProgressHandlerBase* m_shownProgress = nullptr;
    std::deque<MemoryTrack> m_tracks;
    std::vector<core::MarkerEntry> m_markers;
    std::vector<core::MarkerEntry> m_stretchMarkers;
    std::optional<double> m_stretchStart;
    bool m_isRunRequested = false;
    std::optional<core::SecondsRange> m_runBounds;
    std::optional<core::EventList> m_runList;
    std::optional<PreviewRequest> m_requestedPreview;
    core::EventList m_projectEvents;
    Transport m_transport;
    Transport m_transportBeforePreview;
};

} // namespace cadrel::tests
