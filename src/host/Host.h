// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/conform/CadrelerBase.h"
#include "core/edl/EventList.h"
#include "core/notify/ChangeContextNotificationBase.h"
#include "core/protect/RestrictedRange.h"
#include "core/serialize/ByteArchive.h"
#include "core/time/SecondsRange.h"
#include "host/border/Teardown.h"
#include "host/services/StringTranslator.h"
#include "host/services/Transport.h"
#include "host/undo/DataModelCommandCreator.h"
#include "velmark/Context.h"
#include "velmark/Counted.h"
#include "velmark/Editing.h"
#include "velmark/Implements.h"
#include "velmark/Module.h"
#include "velmark/Project.h"

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace cadrel::core {
struct FrameRange;
} // namespace cadrel::core

namespace Velmark {
class IActionManager;
} // namespace Velmark

namespace cadrel::host {

class Project;
class ProjectVideo;
enum class VideoWriting;

/// The one object through which the engine and the window reach the host. It keeps a Project for each project that is open
/// there, follows which one is active, and carries out what the engine asks for on that one.
///
/// A run or a preview is only requested by the window and done on a later idle call, as one entry of the host's undo list:
///
///     startCadrel()     raises a flag
///     onIdle()          progress > transaction > model command > run > commit under "Apply Cadrel"
///
/// While such a transaction is open, what the host tells of edits is ignored. A run that fails keeps what it has done, under
/// "Apply Cadrel (incomplete)"; one that the user cancels is undone. How each request ended the listeners hear in an
/// ActionChangeContext, also of one that is dropped because the project is left or the preview ends.
///
/// Cycles, locators and positions are seconds from the time origin, as the host has them; all other times are seconds of
/// the project's clock. What is asked without an active project does nothing and answers Result::Ok, an empty result or
/// what the operation says. What the host refuses is thrown as HostFailure.h tells.
class Host : public Velmark::Implements<Host, Velmark::FObject, Velmark::IProjectNotification,
                                        Velmark::IProjectStorageNotification, Velmark::IProjectEditHook,
                                        Velmark::IIdleHandler>,
             public core::ChangeContextNotificationBase,
             public core::CadrelerBase,
             public DataModelCommandCreator {
public:
    static constexpr const char* ClassName = "Host";

    /// `context` is an IHostContext. Becomes the alerts, file boxes, string converter and command creator of the process,
    /// and catches up with the projects that are open. Throws Result::HostObjectMissing when the host has no context, no
    /// project manager or no idle calls, and Result::NotAvailable when the process has alerts or file boxes already;
    /// nothing stays registered then.
    ///
    /// `video` is given by who shows its pictures; without one the videos are written and none is shown.
    explicit Host(Velmark::FUnknown* context, std::shared_ptr<ProjectVideo> video = nullptr);
    Host(const Host&) = delete;
    Host& operator=(const Host&) = delete;
    ~Host() override;

    /// The active project's; null without one.
    core::DataModel* getProjectModel();
    const std::shared_ptr<ProjectVideo>& getVideoProvider() const { return m_videoProvider; }

    // What the host tells.

    Velmark::int32 update(Velmark::FUnknown* changed, Velmark::int32 message) override;
    Velmark::int32 projectActivated(Velmark::IProjectDocument* project) override;
    Velmark::int32 projectDeactivated(Velmark::IProjectDocument* project) override;
    Velmark::int32 projectOpened(Velmark::IProjectDocument* project) override;
    Velmark::int32 projectClosing(Velmark::IProjectDocument* project, Velmark::int32 reserved) override;
    Velmark::int32 projectRenamed(Velmark::IProjectDocument* project) override;
    Velmark::int32 projectStoring(Velmark::IProjectDocument* project) override;
    Velmark::int32 projectEdited(Velmark::IProjectDocument* project, Velmark::IEditTransaction* transaction) override;
    Velmark::int32 onIdle() override;

    /// A model that an undo has brought back may have no preview any more; see update().
    void notify(const core::ChangeContext& context) override;

    // What the window calls.

    /// All that keeps a run or a preview from being requested is answered, and nothing is thrown; what was requested before
    /// stays as it is. While one, or the end of a preview, is being carried out, the answer is Result::NotAvailable.
    util::Result::Type startCadrel() override;
    util::Result::Type startCadrelWithin(const core::SecondsRange& bounds) override;
    util::Result::Type startCadrelWithin(const core::SecondsRange& bounds, const core::EventList& changeList) override;
    std::vector<core::SecondsRange> getMaterial() override;
    util::Result::Type startPreview(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                                    std::uint32_t options) override;
    /// Result::Ok for no events, Result::InvalidArgument for more neighbours than events, Result::NoProject without a
    /// project, and Result::NotAvailable for the destination of a project that has no preview offset. Throws
    /// Result::InvalidArgument when there are no events besides the neighbours or none of them has valid times.
    util::Result::Type cycleToEvents(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                                     std::uint32_t options) override;
    util::Result::Type getProjectCycle(double& left, double& right) override;
    util::Result::Type setProjectCycle(double left, double right) override;
    util::Result::Type getTransportCycle(double& left, double& right) override;
    util::Result::Type setTransportCycle(double left, double right) override;
    util::Result::Type getTransportPosition(double& seconds) override;
    util::Result::Type setTransportPosition(double seconds) override;
    /// Result::NotAvailable while a run or a preview, or the end of one, is being carried out.
    util::Result::Type endPreview() override;
    std::wstring getProjectName() override;
    core::MediaPoolInterface* getMediaPool() override;
    double getTimeOrigin() override;
    /// Carries out all that belongs to it, and throws the first failure at the end. Throws Result::NotAvailable while a run
    /// or a preview, or the end of one, is being carried out.
    void setPreviewActive(bool active) override;
    bool isPreviewActive() override;

    // The steps of a run. Those that edit throw Result::NotAvailable when no transaction is open.

    util::Result::Type canStart() override;
    /// Clears the preview: frees the tracks that the system holds locked and empties the preview stretch.
    util::Result::Type removeVirginTerritoryMarkers() override;
    util::Result::Type processEvent(core::Cut& cut) override;
    std::shared_ptr<core::Cut> makeCutEvents(const std::shared_ptr<core::EventBase>& changeEvent) override;
    util::Result::Type completeCadrel() override;
    util::Result::Type generateMarkers(const std::vector<core::MarkerEntry>& entries) override;
    core::CadrelRunState getRunState() override;
    core::CadrelPreviewState getPreviewState() override;
    /// Applies the cuts and then holds the automation over the stretches between them or, where the settings ask for it,
    /// leads it straight over them.
    util::Result::Type applyVirginTerritories(core::CutList& cuts) override;
    /// Says which events the preview stretch shows, so that edited memos follow; it writes nothing.
    util::Result::Type setProjectEvents(const core::EventList& events) override;
    /// The number of tracks is the project's own, not the one given.
    std::uint64_t estimateSteps(std::uint64_t eventCount, const core::Settings& settings,
                                std::uint64_t trackCount) override;

protected:
    std::optional<Document> activeDocument() override;
    Velmark::IHostContext* serviceContext() override { return m_serviceContext.get(); }

private:
    struct OpenProject {
        Teardown registration; ///< with the host
        std::shared_ptr<Project> project;
    };
    /// The names of an entry of the undo list, not translated.
    struct EntryName {
        const char16_t* done;
        const char16_t* incomplete;
    };
    /// What the user sees of a run or preview while it goes on.
    struct Appearance {
        const wchar_t* title; ///< not translated
        bool canCancel;
    };
    class LoweredPreviewFlag;

    static const EntryName Apply;
    static const EntryName Preview;
    static const EntryName EndPreview;
    static const EntryName DeletePreviewRange;

    // Projects, in Host.cpp.
    void registerWithHost();
    void open(Velmark::IProjectDocument* document);
    void close(Velmark::IProjectDocument* document);
    /// Null for what isn't registered.
    std::shared_ptr<Project> find(Velmark::IProjectDocument* document) const;
    void setCurrentProject(const std::shared_ptr<Project>& project);
    void settleAfterUndo(Project& project);
    /// Locks the tracks of the preview that is on, where its new place is looked at, and frees all others.
    static void settleLocks(Project& project);
    static void showAlert(const std::wstring& message);

    // Runs and previews, in HostRuns.cpp.
    /// Carries out what was requested and tells how it ended.
    void serve(std::int32_t action, bool& request, const std::function<util::Result::Type()>& job);
    /// Lowers the requests, and answers the actions that never begin for it.
    std::vector<std::int32_t> dropRequests();
    void tellDropped(const std::vector<std::int32_t>& actions);
    /// Result::Cancelled when the user has cancelled it and it was taken back.
    util::Result::Type runCadrel();
    /// Throws when the run couldn't be taken back with its note.
    void noteRun(Project& project, const core::FrameRange& allowed, Velmark::IEditTransaction& transaction);
    util::Result::Type runPreview(const core::EventList& events, std::uint64_t first, std::uint64_t last,
                                  std::uint32_t options);
    /// With `leaving` the preview is switched off afterwards, also when it fails.
    util::Result::Type finishPreview(bool leaving);
    /// Tell the user of what is left out: of the new video, and of what the change list carries over. He may do anything
    /// meanwhile.
    static void tellOfOmissions(const Project& project, VideoWriting writing);
    static void tellOfVideo(VideoWriting writing);
    static void tellOfLeftOut(const Project& project);

    // The user may close or leave the project while the progress window lets events through. So the project is held, and
    // the edit ends as soon as it isn't the active one any more.

    /// The frame of a run or preview of so many events around its transaction.
    util::Result::Type withProgress(Project& project, const Appearance& appearance, std::size_t eventCount,
                                    const std::function<void()>& work);
    /// Carries out steps as one entry of the undo list. What they throw is the result, and the name of the entry says so. In
    /// a named change of the model that goes on, they become a part of its entry, which that change commits. Within an edit
    /// there is no other: Result::NotAvailable, and nothing is done.
    util::Result::Type edit(Project& project, const EntryName& name,
                            const std::function<void(Velmark::IEditTransaction&)>& steps);
    util::Result::Type commit(Project& project, const char16_t* name);
    /// What a result of the steps leaves to be noted: what they have written, and which events are shown.
    util::Result::Type noteShown(Project& project, const std::vector<std::shared_ptr<core::EventBase>>& before);
    void takeBack(Project& project, Velmark::IActionManager& actions);
    /// Throws Result::NoProject unless the project is the active one.
    void requireActive(const Project& project) const;
    /// The active project, for a step of the engine; null without one. Throws Result::NoProject when an edit is open in
    /// another.
    Project* engineProject() const;
    void restoreCycles(Project& project);
    void keepCycles(Project& project);
    /// Whether a run or a preview, or the end of one, is being carried out.
    bool isBusy() const { return m_served || m_processing; }
    /// Throws Result::NotAvailable while it is so.
    void requireIdle() const;
    /// Makes sure that there is a preview offset, and throws what keeps a run from beginning.
    void prepareStart();
    util::Result::Type requestRun(const std::optional<core::SecondsRange>& bounds, const core::EventList* changeList);
    /// The one that is open.
    Velmark::IEditTransaction& openTransaction() const;
    void announce(const wchar_t* text);

    Velmark::Counted<Velmark::IHostContext> m_context;
    Velmark::Counted<Velmark::IProjectManager> m_projectManager;
    std::map<Velmark::IProjectDocument*, OpenProject> m_projects;
    std::shared_ptr<Project> m_currentProject;
    const Project* m_editedProject = nullptr; ///< of the transaction that is open
    /// The one that is open and has to be committed; nothing outside of a run, a preview or the end of one.
    Velmark::Counted<Velmark::IEditTransaction> m_transaction;
    Velmark::Counted<Velmark::IHostContext> m_serviceContext;
    Transport m_transport;
    std::shared_ptr<StringTranslator> m_translator;
    std::shared_ptr<ProjectVideo> m_videoProvider; ///< never null
    bool m_processing = false;                     ///< from the begin of a transaction to the end of its commit
    bool m_runRequested = false;
    std::optional<core::SecondsRange> m_runBounds;     ///< of the run that was requested, where it has some
    std::optional<core::EventList> m_runList;          ///< likewise
    std::optional<core::RestrictedRange> m_restricted; ///< while a run with bounds goes on
    bool m_previewRequested = false;
    std::optional<std::int32_t> m_served; ///< the action of the request that is being carried out
    core::EventList m_previewEvents{core::ListKind::Change};
    std::uint64_t m_previewFirst = 0;
    std::uint64_t m_previewLast = 0;
    std::uint32_t m_previewOptions = 0;
    core::serialize::ByteArchive m_modelSnapshot; ///< of the moment of the preview request
    /// The preview has just been switched on: what is undone goes back to when it was off.
    bool m_restorePreviewState = false;
    bool m_modelReplaced = false; ///< since the last update()
    Teardown m_registration;
};

} // namespace cadrel::host
