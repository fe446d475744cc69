// SPDX-License-Identifier: GPL-3.0-or-later

// Runs and previews: how a request becomes one entry of the host's undo list.

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/notify/ChangeContext.h"
#include "core/protect/RunRecord.h"
#include "host/Host.h"
#include "host/border/FirstFailure.h"
#include "host/border/HostFailure.h"
#include "host/project/FramerateScope.h"
#include "host/project/Project.h"
#include "host/project/SessionEnd.h"
#include "host/services/ProgressHandler.h"
#include "host/undo/DataModelEditStep.h"
#include "host/undo/PreviewEventsStep.h"
#include "host/undo/RunNoteStep.h"
#include "host/video/ProjectVideo.h"
#include "host/video/VideoWriting.h"
#include "util/FilledText.h"
#include "util/StringUtil.h"
#include "velmark/UserInterface.h"

#include <algorithm>
#include <limits>
#include <utility>

using namespace Velmark;
using cadrel::util::Result;
using Action = cadrel::core::ActionChangeContext;

namespace cadrel::host {

namespace {

// What becomes of material for which the project has no room at its beginning.
constexpr const wchar_t* LeftOutOfOne =
    L"Left out, as it would stand before the project or its day begins: material of event %s.";
constexpr const wchar_t* LeftOutOfMany =
    L"Left out, as it would stand before the project or its day begins: material of %s events, first of event %s.";

/// A damaged project may have some between which nothing lies.
void requireSoundBounds(const core::Settings& settings)
{
    if (settings.restrictRange() && !(settings.preserveMaterialBefore() <= settings.preserveMaterialAfter()))
        throw Result::CorruptData;
}

bool isOnlySelected(const core::Settings& settings)
{
    return settings.applyTo() == core::ApplyTo::SelectedTracks;
}

} // namespace

const Host::EntryName Host::Apply{u"Apply Cadrel", u"Apply Cadrel (incomplete)"};
const Host::EntryName Host::Preview{u"Preview", u"Preview (incomplete)"};
const Host::EntryName Host::EndPreview{u"End Preview", u"End Preview (incomplete)"};
const Host::EntryName Host::DeletePreviewRange{u"Delete Preview Range", u"Delete Preview Range (incomplete)"};

/// While it lives, the preview flag of a model is down.
class Host::LoweredPreviewFlag {
public:
    explicit LoweredPreviewFlag(core::DataModel& model) : m_model(model), m_wasActive(model.isPreviewActive())
    {
        m_model.setPreviewActive(false);
    }
    LoweredPreviewFlag(const LoweredPreviewFlag&) = delete;
    LoweredPreviewFlag& operator=(const LoweredPreviewFlag&) = delete;
    ~LoweredPreviewFlag() { m_model.setPreviewActive(m_wasActive); }

private:
    core::DataModel& m_model;
    bool m_wasActive;
};

int32 Host::onIdle()
{
    resultOf([this] { m_videoProvider->poll(); });
    // A progress window that lets idle calls through doesn't begin a second run within the first, nor does a named change
    // that goes on: what is requested is done on a later call, as an entry of its own.
    if (isBusy() || (m_currentProject && namedEdit(m_currentProject->document())))
        return ResultOk;
    if (m_runRequested)
        serve(Action::Run, m_runRequested, [this] { return runCadrel(); });
    if (m_previewRequested) {
        serve(Action::Preview, m_previewRequested,
              [this] { return runPreview(m_previewEvents, m_previewFirst, m_previewLast, m_previewOptions); });
    }
    return ResultOk;
}

void Host::serve(std::int32_t action, bool& request, const std::function<Result::Type()>& job)
{
    m_served = action;
    const Result::Type result = job();
    m_served.reset();
    request = false;
    resultOf([&] { notify(Action(action, result)); });
}

std::vector<std::int32_t> Host::dropRequests()
{
    std::vector<std::int32_t> dropped;
    // What is being carried out ends by itself, and tells so.
    if (std::exchange(m_runRequested, false) && m_served != Action::Run)
        dropped.push_back(Action::Run);
    if (std::exchange(m_previewRequested, false) && m_served != Action::Preview)
        dropped.push_back(Action::Preview);
    return dropped;
}

void Host::tellDropped(const std::vector<std::int32_t>& actions)
{
    for (const std::int32_t action : actions)
        resultOf([&] { notify(Action::dropped(action)); });
}

Result::Type Host::startCadrel()
{
    return requestRun(std::nullopt, nullptr);
}

Result::Type Host::startCadrelWithin(const core::SecondsRange& bounds)
{
    return requestRun(bounds, nullptr);
}

Result::Type Host::startCadrelWithin(const core::SecondsRange& bounds, const core::EventList& changeList)
{
    return requestRun(bounds, &changeList);
}

Result::Type Host::requestRun(const std::optional<core::SecondsRange>& bounds, const core::EventList* changeList)
{
    return resultOf([&] {
        requireIdle();
        prepareStart();
        requireSoundBounds(m_currentProject->model().settings());
        m_runRequested = true;
        m_runBounds = bounds;
        m_runList.reset();
        if (changeList)
            m_runList.emplace(*changeList);
    });
}

Result::Type Host::startPreview(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                                std::uint32_t options)
{
    return resultOf([&] {
        requireIdle();
        prepareStart();
        core::DataModel& model = m_currentProject->model();
        std::optional<LoweredPreviewFlag> lowered;
        if (m_restorePreviewState)
            lowered.emplace(model);
        core::serialize::ByteArchive snapshot = DataModelEditStep::snapshotOf(model);
        m_previewEvents.copyFrom(events);
        m_modelSnapshot = std::move(snapshot);
        m_previewFirst = first;
        m_previewLast = last;
        m_previewOptions = options;
        m_previewRequested = true;
    });
}

void Host::requireIdle() const
{
    if (isBusy())
        throw Result::NotAvailable;
}

void Host::prepareStart()
{
    if (m_currentProject)
        m_currentProject->ensurePreviewOffset();
    requireSuccess(canStart());
}

Result::Type Host::canStart()
{
    return resultOf([this] {
        if (!m_currentProject)
            throw Result::NoProject;
        core::DataModel& model = m_currentProject->model();
        if (model.changeEdl().isEmpty())
            throw Result::ChangeEdlEmpty;
        const std::vector<Track> tracks = m_currentProject->availableTracks();
        if (tracks.empty())
            throw Result::NoTracks;
        if (isOnlySelected(model.settings()) && std::ranges::none_of(tracks, &Track::isSelected))
            throw Result::NoTracksSelected;
    });
}

Result::Type Host::runCadrel()
{
    const std::shared_ptr<Project> held = m_currentProject;
    if (!held)
        return Result::NoProject;
    Project& project = *held;
    core::EventList& changeList = project.model().changeEdl();
    // Once the run has begun, its list is that of the model.
    const std::optional<core::EventList> ownList = std::exchange(m_runList, std::nullopt);
    const std::size_t eventCount = ownList ? ownList->size() : changeList.size();
    VideoWriting video = VideoWriting::Done;
    const Result::Type result = withProgress(project, {L"Processing Project", true}, eventCount, [&] {
        // What the user lets change; the bounds leave out what stays as it is.
        const core::FrameRange allowed = core::RunRecord::allowedBy(project.model().settings());
        if (m_runBounds)
            m_restricted.emplace(project.model().settings(), *m_runBounds);
        Counted<IActionManager> actions; // once the user has cancelled
        EntryName name = Apply;
        requireSuccess(edit(project, name, [&](IEditTransaction& transaction) {
            core::EditTransactionHandle handle(transaction);
            const auto command = createCommand(handle);
            if (ownList)
                changeList = *ownList;
            requireSuccess(removeVirginTerritoryMarkers());
            project.createMarkerTracks(transaction);
            const SessionEnd sessionEnd(project);
            const Result::Type ran = run(changeList);
            if (ran == Result::Cancelled) {
                actions = required(service<IActionManager>(m_context));
                // It can be done again after its undo, and stays where the host refuses that.
                name.done = name.incomplete;
                return;
            }
            requireSuccess(ran);
            requireActive(project);
            project.createVideoTracks(transaction);
            video = m_videoProvider->apply(true, transaction, 0.0);
            double start = 0.0;
            double end = 0.0;
            project.getApplyRange(start, end);
            project.closeRange(isOnlySelected(project.model().settings()), start, end);
            sessionEnd.follow(allowed);
            noteRun(project, allowed, transaction);
        }));
        if (actions) {
            takeBack(project, *actions);
            throw Result::Cancelled;
        }
    });
    m_restricted.reset();
    if (result == Result::Ok)
        tellOfOmissions(project, video);
    return result;
}

/// The note has a step of its own, as nobody hears where the host refuses that of the model.
void Host::noteRun(Project& project, const core::FrameRange& allowed, IEditTransaction& transaction)
{
    requireActive(project);
    const std::optional<Document> document = activeDocument();
    if (!document)
        throw Result::NoProject;
    requireOk(transaction.addStep(makeCounted<RunNoteStep>(document->model).get()));
    core::RunRecord::addRun(*document->model, allowed);
}

Result::Type Host::runPreview(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                              std::uint32_t options)
{
    const std::shared_ptr<Project> held = m_currentProject;
    if (!held)
        return Result::NoProject;
    Project& project = *held;
    VideoWriting video = VideoWriting::Done;
    const Result::Type result = withProgress(project, {L"Project Preview", false}, events.size(), [&] {
        requireSuccess(edit(project, Preview, [&](IEditTransaction& transaction) {
            core::EditTransactionHandle handle(transaction);
            const auto command = createCommand(handle, m_modelSnapshot);
            m_restorePreviewState = false;
            requireSuccess(removeVirginTerritoryMarkers());
            project.createVideoTracks(transaction);
            project.createMarkerTracks(transaction);
            requireSuccess(CadrelerBase::startPreview(events, first, last, options));
            requireActive(project);
            const double offset = project.previewOffset();
            video = m_videoProvider->apply(true, transaction, offset);
            // Without material in the preview the project ends before it.
            project.closeRange(isOnlySelected(project.model().settings()), offset,
                               std::max(offset, project.projectEnd()));
            project.previewEvents().copyFrom(events);
            // Of no events nothing is shown.
            if (!events.isEmpty())
                project.collectLockTracks();
        }));
        requireActive(project);
        requireSuccess(cycleToEvents(events, first, last, options));
    });
    if (result == Result::Ok)
        tellOfOmissions(project, video);
    return result;
}

Result::Type Host::finishPreview(bool leaving)
{
    const std::shared_ptr<Project> held = m_currentProject;
    if (!held)
        return Result::Ok;
    Project& project = *held;
    if (!project.hasPreviewOffset() && !project.hasWritten()) {
        project.previewEvents().clear();
        return Result::Ok;
    }
    return edit(project, leaving ? EndPreview : DeletePreviewRange, [&](IEditTransaction& transaction) {
        FirstFailure failure;
        failure.ofStep([&] {
            core::EditTransactionHandle handle(transaction);
            // A named change that goes on has a snapshot of the model from before.
            const auto command = namedEdit(project.document()) ? nullptr : createCommand(handle);
            m_videoProvider->apply(false, transaction, project.previewOffset());
            requireSuccess(CadrelerBase::endPreview());
            project.resetPreviewOffset();
        });
        // No memo follows what is left of it.
        if (leaving)
            project.previewEvents().clear();
        failure.raise();
    });
}

void Host::tellOfOmissions(const Project& project, VideoWriting writing)
{
    tellOfVideo(writing);
    tellOfLeftOut(project);
}

void Host::tellOfVideo(VideoWriting writing)
{
    switch (writing) {
    case VideoWriting::Done:
        break;
    case VideoWriting::WithoutBeginning:
        showAlert(L"The new video begins before the project does. What would stand there hasn't been written.");
        break;
    case VideoWriting::TrackLocked:
        showAlert(L"The track of the new video is locked. The new video hasn't been written.");
        break;
    case VideoWriting::BeforeProject:
        showAlert(L"The new video ends before the project begins. The new video hasn't been written.");
        break;
    case VideoWriting::NoMediaPool:
        showAlert(L"The project has no media pool. The new video hasn't been written.");
        break;
    }
}

void Host::tellOfLeftOut(const Project& project)
{
    const std::vector<std::uint32_t>& events = project.leftOutEvents();
    if (events.empty())
        return;
    const std::wstring first = std::to_wstring(events.front());
    if (events.size() == 1)
        showAlert(util::filled(util::StringUtil::translate(LeftOutOfOne), first));
    else
        showAlert(util::filled(util::filled(util::StringUtil::translate(LeftOutOfMany), std::to_wstring(events.size())),
                               first));
}

Result::Type Host::withProgress(Project& project, const Appearance& appearance, std::size_t eventCount,
                                const std::function<void()>& work)
{
    ProgressHandler progress(m_serviceContext.get());
    const auto idleManager = service<IIdleManager>(m_serviceContext);
    bool isBlocked = false;
    const Result::Type result = resultOf([&] {
        project.setUseTrackCache(true);
        project.ensurePreviewOffset();
        m_transport.stop();
        m_progress = &progress;
        project.setProgress(&progress);
        isBlocked = idleManager && idleManager->setIdleBlocked(true) == ResultOk;
        progress.start(util::StringUtil::translate(appearance.title),
                       estimateSteps(eventCount, project.model().settings(), 0), appearance.canCancel);
        work();
    });
    // The user may edit while the window closes.
    project.setUseTrackCache(false);
    // Not there when it couldn't be started.
    resultOf([&] { progress.finish(); });
    if (isBlocked)
        idleManager->setIdleBlocked(false);
    m_progress = nullptr;
    project.setProgress(nullptr);
    return result;
}

Result::Type Host::edit(Project& project, const EntryName& name, const std::function<void(IEditTransaction&)>& steps)
{
    if (m_processing)
        return Result::NotAvailable;
    const PreviewEventsStep::Events previewedBefore = project.previewEvents().events();
    m_processing = true;
    IEditTransaction* const outer = namedEdit(project.document());
    Result::Type result = resultOf([&] {
        requireActive(project);
        auto transaction = outer ? Counted<IEditTransaction>::share(outer)
                                 : required(query<IEditTransaction>(required(service<IEditService>(m_serviceContext))));
        if (!outer)
            requireOk(transaction->begin(true));
        m_transaction = std::move(transaction);
        m_editedProject = &project;
        steps(*m_transaction);
        requireActive(project);
    });
    if (m_transaction) {
        const Result::Type noted = noteShown(project, previewedBefore);
        if (result == Result::Ok)
            result = noted;
        if (!outer && result == Result::Ok)
            result = commit(project, name.done);
        if (!outer && result != Result::Ok)
            commit(project, name.incomplete);
        m_transaction.reset();
        m_editedProject = nullptr;
        // What the host has told of this edit was ignored.
        resultOf([&] {
            const FramerateScope rate(project);
            project.rememberMemos();
        });
    }
    m_processing = false;
    return result;
}

Result::Type Host::noteShown(Project& project, const PreviewEventsStep::Events& before)
{
    core::EventList& previewed = project.previewEvents();
    const Result::Type result = resultOf([&] {
        FirstFailure failure;
        failure.ofStep([&] { project.rememberWritten(); });
        failure.ofStep([&] {
            if (previewed.events() != before)
                requireOk(m_transaction->addStep(
                    makeCounted<PreviewEventsStep>(project.sharedPreviewEvents(), before).get()));
        });
        failure.raise();
    });
    // Otherwise a memo might be carried over to the wrong place.
    if (result != Result::Ok)
        previewed.clear();
    return result;
}

Result::Type Host::commit(Project& project, const char16_t* name)
{
    return resultOf([&] { requireOk(m_transaction->commit(project.document(), m_translator->translate(name))); });
}

/// Undoes the run that the user has cancelled.
void Host::takeBack(Project& project, IActionManager& actions)
{
    // The host would undo what was done in another.
    requireActive(project);
    // The undo removes tracks that it holds.
    project.setUseTrackCache(false);
    requireOk(actions.invoke(IActionManager::EditCategory, IActionManager::Undo, 0));
}

void Host::requireActive(const Project& project) const
{
    if (m_currentProject.get() != &project)
        throw Result::NoProject;
}

Result::Type Host::endPreview()
{
    if (isBusy())
        return Result::NotAvailable;
    const std::vector<std::int32_t> dropped = dropRequests();
    const std::shared_ptr<Project> held = m_currentProject;
    std::optional<LoweredPreviewFlag> lowered;
    if (held && m_restorePreviewState)
        lowered.emplace(held->model());
    const Result::Type result = finishPreview(false);
    lowered.reset();
    tellDropped(dropped);
    return result;
}

void Host::setPreviewActive(bool active)
{
    requireIdle();
    const std::shared_ptr<Project> held = m_currentProject;
    if (!held)
        return;
    Project& project = *held;
    core::DataModel& model = project.model();
    const bool wasActive = model.isPreviewActive();
    FirstFailure failure;
    std::vector<std::int32_t> dropped;
    if (!active) {
        dropped = dropRequests();
        m_restorePreviewState = false;
    }
    if (wasActive && !active) {
        failure.ofStep([&] { restoreCycles(project); });
        failure.ofStep([&] { requireSuccess(finishPreview(true)); });
    }
    if (!wasActive && active)
        m_restorePreviewState = true;
    if (active)
        failure.ofStep([&] { project.ensurePreviewOffset(); });
    model.setPreviewActive(active);
    failure.ofStep([&] {
        requireActive(project);
        model.notifyPreviewState();
    });
    if (!active) {
        failure.ofStep([&] { project.findLockedTracks(); });
        failure.ofStep([&] { project.setTracksLocked(false); });
        project.releaseLockTracks();
    } else if (!wasActive) {
        // The stored cycle is the one from before the preview moved it.
        failure.ofStep([&] { keepCycles(project); });
    }
    failure.ofStep([&] { project.extendProjectEnd(active); });
    tellDropped(dropped);
    failure.raise();
}

void Host::keepCycles(Project& project)
{
    using Key = core::PropertyKey;
    requireActive(project);
    core::DataModel& model = project.model();
    // A value that can't be read isn't restored. The one from before an earlier preview would be wrong.
    for (const std::int32_t key : {Key::ProjectCycleLeft, Key::ProjectCycleRight, Key::TransportCycleLower,
                                   Key::TransportCycleUpper, Key::TransportPosition})
        model.removeProperty(key);
    const auto keep = [&](std::int32_t key, double value) { model.setProperty(key, core::Variant(value)); };
    double left = 0.0;
    double right = 0.0;
    double position = 0.0;
    FirstFailure failure;
    failure.ofStep([&] {
        getProjectCycle(left, right);
        keep(Key::ProjectCycleLeft, left);
        keep(Key::ProjectCycleRight, right);
    });
    failure.ofStep([&] {
        getTransportCycle(left, right);
        keep(Key::TransportCycleLower, std::min(left, right));
        keep(Key::TransportCycleUpper, std::max(left, right));
    });
    failure.ofStep([&] {
        getTransportPosition(position);
        keep(Key::TransportPosition, position);
    });
    failure.raise();
}

void Host::restoreCycles(Project& project)
{
    using Key = core::PropertyKey;
    requireActive(project);
    const core::DataModel& model = project.model();
    const auto kept = [&](std::int32_t key) -> std::optional<double> {
        core::Variant value;
        if (model.getProperty(key, value) != Result::Ok)
            return std::nullopt;
        return value.toDouble();
    };
    FirstFailure failure;
    const auto lower = kept(Key::TransportCycleLower);
    const auto upper = kept(Key::TransportCycleUpper);
    if (lower && upper)
        failure.ofStep([&] { setTransportCycle(*lower, *upper); });
    if (const auto position = kept(Key::TransportPosition))
        failure.ofStep([&] { setTransportPosition(*position); });
    const auto left = kept(Key::ProjectCycleLeft);
    const auto right = kept(Key::ProjectCycleRight);
    if (left && right)
        failure.ofStep([&] { setProjectCycle(*left, *right); });
    failure.raise();
}

Result::Type Host::cycleToEvents(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                                 std::uint32_t options)
{
    if (events.isEmpty())
        return Result::Ok;
    if (first > events.size() || last > events.size() - first)
        return Result::InvalidArgument;
    if (!m_currentProject)
        return Result::NoProject;
    Project& project = *m_currentProject;
    const bool isAtDestination = options != 0;
    if (isAtDestination && !project.hasPreviewOffset())
        return Result::NotAvailable;

    double oldLeft = 0.0;
    double oldRight = 0.0;
    project.getLocators(oldLeft, oldRight);
    const core::Framerate rate = project.getFramerate();
    double start = std::numeric_limits<double>::max();
    double end = std::numeric_limits<double>::min();
    for (std::size_t index = first; index < events.size() - last; ++index) {
        const core::EventBase& event = events.at(index);
        if (event.hasFlaw(core::EventFlaw::TimecodeInvalid))
            continue;
        start = std::min(start, (isAtDestination ? event.dstIn() : event.srcIn()).toSeconds(rate));
        end = std::max(end, (isAtDestination ? event.dstOut() : event.srcOut()).toSeconds(rate));
    }
    if (isAtDestination) {
        start += project.previewOffset();
        end += project.previewOffset();
    }
    const double origin = project.timeOrigin();
    setTransportCycle(start - origin, end - origin);
    setTransportPosition(start - origin);
    project.setLocators(true, start, start + oldRight - oldLeft);
    project.setTracksLocked(isAtDestination);
    project.model().setProperty(core::PropertyKey::PreviewAtDestination, core::Variant(isAtDestination));
    return Result::Ok;
}

} // namespace cadrel::host
