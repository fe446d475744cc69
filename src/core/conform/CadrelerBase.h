// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/CadrelPreviewState.h"
#include "core/cut/CadrelRunState.h"
#include "core/cut/MarkerEntry.h"
#include "util/Result.h"

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::core {

class Cut;
class CutList;
class EventBase;
class EventList;
class MediaPoolInterface;
class ProgressHandlerBase;
struct SecondsRange;
class Settings;

/// The engine. It implements a run in terms of operations on the project, which a subclass implements. It knows nothing
/// of tracks or transactions.
///
/// A run turns each change event into a Cut, trims the cuts around snippets, applies them one after the other and
/// writes markers. A preview does the same with a selection of events in a temporary place of the project.
///
/// Result codes are Result::Type values, Result::Ok for success.
class CadrelerBase {
public:
    virtual ~CadrelerBase() = default;

    // What the window calls.

    /// Requests a run of the change list and returns at once.
    virtual util::Result::Type startCadrel() = 0;
    /// Likewise, but the run changes nothing outside of the bounds, in seconds of the project's clock.
    virtual util::Result::Type startCadrelWithin(const SecondsRange& bounds) = 0;
    /// The same of another list, which takes the place of the change list when the run begins. Its undo brings back the former.
    virtual util::Result::Type startCadrelWithin(const SecondsRange& bounds, const EventList& changeList) = 0;
    /// Where clips, markers and automation points stand on the tracks that a run changes, in seconds of the project's clock;
    /// an instant begins where it ends. In any order.
    virtual std::vector<SecondsRange> getMaterial() = 0;
    /// Previews `events`. It does what `run` does, except that it doesn't call completeCadrel. It writes only markers
    /// that reach into the stretch from the start of the first event to the end of the last event that isn't left out.
    /// Without events it writes no markers. `first` and `last` are the numbers of neighbours at either end, `options`
    /// is the state of the destination toggle. A subclass overrides it to request a preview, and calls this one later
    /// to carry it out.
    virtual util::Result::Type startPreview(const EventList& events, std::uint64_t first, std::uint64_t last,
                                            std::uint32_t options);
    /// Sets the cycle to the span of the events; arguments as of startPreview.
    virtual util::Result::Type cycleToEvents(const EventList& events, std::uint64_t first, std::uint64_t last,
                                             std::uint32_t options) = 0;
    /// These cycles and positions are seconds from the start of the project, not times of its clock.
    virtual util::Result::Type getProjectCycle(double& left, double& right) = 0;
    virtual util::Result::Type setProjectCycle(double left, double right) = 0;
    virtual util::Result::Type getTransportCycle(double& left, double& right) = 0;
    virtual util::Result::Type setTransportCycle(double left, double right) = 0;
    virtual util::Result::Type getTransportPosition(double& seconds) = 0;
    virtual util::Result::Type setTransportPosition(double seconds) = 0;
    /// Takes the preview back. This class only calls removeVirginTerritoryMarkers.
    virtual util::Result::Type endPreview();
    /// The path of the project's file.
    virtual std::wstring getProjectName() = 0;
    /// May be null.
    virtual MediaPoolInterface* getMediaPool() = 0;
    /// In seconds.
    virtual double getTimeOrigin() = 0;
    /// Switches the preview on or off. Switching it off removes what it wrote.
    virtual void setPreviewActive(bool active) = 0;
    virtual bool isPreviewActive() = 0;

    // The steps of a run.

    /// Whether a run may begin; asked before any run or preview.
    virtual util::Result::Type canStart() = 0;
    /// Clears what an earlier preview or run left; the first step of every run.
    virtual util::Result::Type removeVirginTerritoryMarkers() = 0;
    /// Carries out one cut. Result::Cancelled when the user has cancelled.
    virtual util::Result::Type processEvent(Cut& cut) = 0;
    /// One cut event for each candidate track, with the four times of the change event in seconds. Never null.
    virtual std::shared_ptr<Cut> makeCutEvents(const std::shared_ptr<EventBase>& changeEvent) = 0;
    /// Applies the change list. Events with EventFlaw::TimecodeInvalid are left out silently. If a step returns or
    /// throws a failure, the run ends with that code, and the project stays as it is then.
    virtual util::Result::Type run(const EventList& changeList) final;
    /// The last step of a run: puts the new programme in the place of the old one.
    virtual util::Result::Type completeCadrel() = 0;
    /// Writes markers, each on the marker track of its kind.
    virtual util::Result::Type generateMarkers(const std::vector<MarkerEntry>& entries) = 0;
    /// What the run's algorithms may know. It is valid until somebody else edits the project.
    virtual CadrelRunState getRunState() = 0;
    virtual CadrelPreviewState getPreviewState() = 0;
    /// Applies the cuts in the order of the list, up to the first that fails. A subclass can add a stage of its own: it
    /// overrides this operation and calls it first.
    virtual util::Result::Type applyVirginTerritories(CutList& cuts);
    /// Replaces the list of events that the project holds as previewed.
    virtual util::Result::Type setProjectEvents(const EventList& events) = 0;
    /// The number of progress steps that the detect algorithms will report. A subclass adds its own steps.
    virtual std::uint64_t estimateSteps(std::uint64_t eventCount, const Settings& settings, std::uint64_t trackCount);

protected:
    /// Set by the subclass for the time of a run or preview only; not owned, null without one.
    ProgressHandlerBase* m_progress = nullptr;

private:
    /// The steps up to the markers; fills `cuts`.
    util::Result::Type moveMaterial(const EventList& events, CutList& cuts);
    util::Result::Type collectCuts(const EventList& events, CutList& cuts);
    std::vector<MarkerEntry> createMarkers(const CutList& cuts, const CadrelRunState& state);
    util::Result::Type generatePreviewMarkers(const CutList& cuts);
};

} // namespace cadrel::core
