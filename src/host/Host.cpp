// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/Host.h"

#include "core/model/DataModel.h"
#include "core/model/DataModelCommandCreator.h"
#include "core/notify/ChangeContext.h"
#include "core/time/Timecode.h"
#include "host/border/FirstFailure.h"
#include "host/border/HostFailure.h"
#include "host/project/FramerateScope.h"
#include "host/project/Project.h"
#include "host/services/AlertWindow.h"
#include "host/services/FileBrowserDialog.h"
#include "host/video/ProjectVideo.h"
#include "util/StringUtil.h"

#include <utility>

using namespace Velmark;
using cadrel::util::Result;

namespace cadrel::host {

namespace {

std::wstring loadingAlert(Result::Type failure)
{
    switch (failure) {
    case Result::UnknownVersion:
        return L"The project was created with an unsupported Cadrel version. The data cannot be loaded.";
    case Result::NewerVersion:
        return L"The project was created with a newer Cadrel version. The data cannot be loaded.";
    default:
        return L"An error occurred while loading the Cadrel data. The data will be ignored.";
    }
}

} // namespace

Host::Host(FUnknown* context, std::shared_ptr<ProjectVideo> video)
    : m_context(required(query<IHostContext>(context))),
      m_projectManager(required(service<IProjectManager>(m_context))),
      m_serviceContext(required(query<IHostContext>(context))), m_transport(service<ITransportControl>(m_context)),
      m_translator(std::make_shared<StringTranslator>(m_context.get())),
      m_videoProvider(video ? std::move(video) : std::make_shared<ProjectVideo>(m_context.get()))
{
    registerWithHost();
    for (int32 index = 0; index < m_projectManager->projectCount(); ++index) {
        if (IProjectDocument* const project = m_projectManager->projectAt(index))
            projectOpened(project);
    }
    if (IProjectDocument* const active = m_projectManager->activeProject())
        projectActivated(active);
}

Host::~Host()
{
    m_registration.run();
}

void Host::registerWithHost()
{
    requireOk(m_projectManager->addNotification(this));
    m_registration.add([this] { m_projectManager->removeNotification(this); });
    AlertWindow::install(m_context.get());
    m_registration.add([] { AlertWindow::uninstall(); });
    FileBrowserDialog::install(m_context.get());
    m_registration.add([] { FileBrowserDialog::uninstall(); });
    util::StringUtil::setConverter(m_translator.get());
    core::setDataModelCommandCreator(this);
    m_registration.add([] {
        core::setDataModelCommandCreator(nullptr);
        util::StringUtil::setConverter(nullptr);
    });
    m_registration.add([this] {
        while (!m_projects.empty())
            projectClosing(m_projects.begin()->first, 0);
    });
    // Last, so that at the end there are no idle calls any more before the projects go.
    const auto idleManager = required(service<IIdleManager>(m_context));
    requireOk(idleManager->addIdleHandler(this));
    m_registration.add([this, idleManager] { idleManager->removeIdleHandler(this); });
}

core::DataModel* Host::getProjectModel()
{
    return m_currentProject ? &m_currentProject->model() : nullptr;
}

std::optional<Host::Document> Host::activeDocument()
{
    if (!m_currentProject)
        return std::nullopt;
    return Document{m_currentProject->sharedModel(), m_currentProject->document()};
}

int32 Host::projectOpened(IProjectDocument* project)
{
    const Result::Type result = resultOf([&] { open(project); });
    if (result == Result::Ok)
        return result;
    const std::shared_ptr<Project> opened = find(project);
    showAlert(opened && opened->hasReadModel()
                  ? L"Not all tracks of the project can be read. Those of a preview may still be locked."
                  : loadingAlert(result));
    return result;
}

void Host::open(IProjectDocument* document)
{
    if (find(required(document)))
        return;
    const auto dependencies = required(service<IDependencyManager>(m_context));
    OpenProject entry;
    requireOk(document->addStorageNotification(this));
    entry.registration.add([this, document] { document->removeStorageNotification(this); });
    requireOk(dependencies->addDependent(document, this));
    entry.registration.add([this, document, dependencies] { dependencies->removeDependent(document, this); });
    entry.project = std::make_shared<Project>(m_context.get(), document);
    Project& project = *entry.project;
    m_projects.emplace(document, std::move(entry));
    // A project whose data can't be read stays, with an empty model.
    project.load();
}

int32 Host::projectActivated(IProjectDocument* project)
{
    return resultOf([&] { setCurrentProject(find(project)); });
}

int32 Host::projectDeactivated(IProjectDocument* /*project*/)
{
    return resultOf([&] { setCurrentProject(nullptr); });
}

void Host::setCurrentProject(const std::shared_ptr<Project>& project)
{
    // Everything is carried out, so that the window follows even if something fails.
    FirstFailure failure;
    std::vector<std::int32_t> dropped;
    if (m_currentProject != project) {
        dropped = dropRequests();
        m_restorePreviewState = false;
    }
    if (m_currentProject)
        m_currentProject->model().setNotifier(nullptr);
    m_currentProject = project;
    core::Timecode::setFramerateProvider(project.get());
    if (project) {
        project->model().setNotifier(this);
        failure.ofStep([&] { project->model().notifyPreviewState(); });
    }
    failure.ofStep([&] { m_videoProvider->setProject(project.get()); });
    failure.ofStep([&] { notify(core::DataModelChangeContext(getProjectModel())); });
    tellDropped(dropped);
    failure.raise();
}

int32 Host::projectClosing(IProjectDocument* project, int32 /*reserved*/)
{
    return resultOf([&] { close(project); });
}

void Host::close(IProjectDocument* document)
{
    const auto found = m_projects.find(document);
    if (found == m_projects.end())
        return;
    found->second.registration.run();
    if (found->second.project == m_currentProject)
        projectDeactivated(document);
    m_projects.erase(found);
}

int32 Host::projectRenamed(IProjectDocument* /*project*/)
{
    return ResultOk;
}

int32 Host::projectStoring(IProjectDocument* project)
{
    const Result::Type result = resultOf([&] {
        const std::shared_ptr<Project> stored = find(project);
        core::Settings& settings = required(stored.get())->model().settings();
        const core::Settings present = settings;
        // The bounds of a run that goes on are none of the user's.
        if (m_restricted && m_restricted->isOf(settings))
            settings = m_restricted->released();
        const Result::Type saved = resultOf([&] { stored->save(); });
        settings = present;
        requireSuccess(saved);
    });
    if (result != Result::Ok)
        showAlert(L"An error occurred while saving the Cadrel data.");
    return result;
}

int32 Host::update(FUnknown* changed, int32 /*message*/)
{
    if (m_processing)
        return ResultOk;
    return resultOf([&] {
        const auto document = query<IProjectDocument>(changed);
        const std::shared_ptr<Project> project = find(document.get());
        if (!project)
            return;
        const FramerateScope rate(*project);
        project->onProjectChanged();
        if (project == m_currentProject && std::exchange(m_modelReplaced, false))
            settleAfterUndo(*project);
    });
}

void Host::notify(const core::ChangeContext& context)
{
    if (context.type == core::ChangeContext::DataModelChanged)
        m_modelReplaced = true;
    ChangeContextNotificationBase::notify(context);
}

/// A preview that has come back has to know its tracks again, and to hold them. One that has gone would leave them locked
/// and the user at its place, and the next would take that for the user's own.
void Host::settleAfterUndo(Project& project)
{
    FirstFailure failure;
    const bool isActive = project.model().isPreviewActive();
    // What is undone next goes back to the preview that has come back.
    if (isActive && project.hasWritten())
        m_restorePreviewState = false;
    project.findLockedTracks();
    // A preview that has come back needs its room, and one that has gone doesn't.
    if (!isActive || project.hasPreviewOffset())
        failure.ofStep([&] { project.extendProjectEnd(false); });
    if (!isActive && project.hasLockTracks())
        failure.ofStep([&] { restoreCycles(project); });
    failure.ofStep([&] { settleLocks(project); });
    failure.raise();
}

void Host::settleLocks(Project& project)
{
    project.setTracksLocked(false);
    project.releaseLockTracks();
    if (!project.model().isPreviewActive())
        return;
    project.findPreviewedTracks();
    core::Variant isAtDestination(false);
    project.model().getProperty(core::PropertyKey::PreviewAtDestination, isAtDestination);
    if (project.hasLockTracks() && isAtDestination.toBool())
        project.setTracksLocked(true);
}

int32 Host::projectEdited(IProjectDocument* project, IEditTransaction* transaction)
{
    const std::shared_ptr<Project> edited = m_currentProject;
    if (m_processing || !edited || project != edited->document())
        return ResultOk;
    const Result::Type result = resultOf([&] {
        const FramerateScope rate(*edited);
        edited->onProjectEdited(*required(transaction));
    });
    return result == Result::Ok ? result : Result::HostObjectMissing;
}

std::shared_ptr<Project> Host::find(IProjectDocument* document) const
{
    const auto found = m_projects.find(document);
    return found != m_projects.end() ? found->second.project : nullptr;
}

void Host::showAlert(const std::wstring& message)
{
    // It is the last step of a failure, and doesn't fail itself.
    resultOf([&] { AlertWindow::instance().show(message, L"", L"", L""); });
}

} // namespace cadrel::host
