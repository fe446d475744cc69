// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/Application.h"

#include "standin/HostContext.h"
#include "standin/HostInfo.h"
#include "standin/ObjectFactory.h"
#include "standin/base/Text.h"
#include "standin/base/Utf16.h"
#include "standin/edit/ActionManager.h"
#include "standin/edit/DependencyManager.h"
#include "standin/edit/EditService.h"
#include "standin/edit/ProjectManager.h"
#include "standin/edit/Transport.h"
#include "standin/file/MediaMove.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Project.h"
#include "standin/services/AlertService.h"
#include "standin/services/FileSelector.h"
#include "standin/services/IdleManager.h"
#include "standin/services/MenuRegistry.h"
#include "standin/services/ProgressService.h"
#include "standin/services/Translations.h"
#include "standin/services/WindowFactoryRegistry.h"
#include "standin/window/ViewManager.h"

#include <string>
#include <system_error>
#include <utility>
#include <vector>

using namespace Velmark;

namespace standin {

namespace fs = std::filesystem;

namespace {

/// As the module is told it. Throws ProjectFileError for a name that is no text.
std::u16string fullPathOf(const fs::path& file)
{
    std::error_code error;
    const std::string path = fs::absolute(file, error).string();
    if (error)
        throw ProjectFileError(file.string() + ": " + error.message());
    if (!isWellFormed(path))
        throw ProjectFileError(file.string() + ": the name is no UTF-8 text; rename the file or its folder");
    return toUtf16(path);
}

} // namespace

struct Application::Services {
    Services(const Terminal& ofUser, VideoSupport* ofVideos) : terminal(ofUser), videos(ofVideos) {}

    Terminal terminal;
    VideoSupport* videos;
    Counted<AlertService> alerts = makeCounted<AlertService>(terminal);
    Counted<DependencyManager> dependencies = makeCounted<DependencyManager>();
    Counted<FileSelector> fileSelector = makeCounted<FileSelector>();
    Counted<IdleManager> idleManager = makeCounted<IdleManager>();
    Counted<MenuRegistry> menus = makeCounted<MenuRegistry>();
    Counted<ProgressService> progress = makeCounted<ProgressService>(terminal);
    Counted<Translations> translations = makeCounted<Translations>();
    Counted<ViewManager> views = makeCounted<ViewManager>();
    Counted<WindowFactoryRegistry> windowFactories = makeCounted<WindowFactoryRegistry>();
    Counted<ProjectManager> projects = makeCounted<ProjectManager>(*dependencies);
    Counted<EditService> edits = makeCounted<EditService>(*projects);
    Counted<ActionManager> actions = makeCounted<ActionManager>(*projects, *edits);
    Counted<Transport> transport = makeCounted<Transport>(*projects);
    Counted<HostContext> context = makeCounted<HostContext>();
};

Application::Application(const Terminal& terminal, VideoSupport* videos)
    : m_services(std::make_unique<Services>(terminal, videos))
{
    HostContext& context = *m_services->context;
    context.offer<IActionManager>(actions());
    context.offer<IAlertService>(alerts());
    context.offer<IDependencyManager>(dependencies());
    context.offer<IEditService>(edits());
    context.offer<IFileSelector>(fileSelector());
    context.offer<IHostInfo>(*makeCounted<HostInfo>());
    context.offer<IIdleManager>(idleManager());
    context.offer<IMenuRegistry>(menus());
    context.offer<IObjectFactory>(*makeCounted<ObjectFactory>(videos));
    context.offer<IProgressService>(progress());
    context.offer<IProjectManager>(projects());
    context.offer<ITranslationService>(translations());
    context.offer<ITransportControl>(transport());
    context.offer<IViewManager>(views());
    context.offer<IWindowFactoryRegistry>(windowFactories());
}

Application::~Application()
{
    views().closeAll();
    while (!projects().projects().empty())
        closeProject(*projects().projects().back());
}

IHostContext* Application::context()
{
    return m_services->context.get();
}

void Application::setBoxes(UserBoxes* boxes)
{
    alerts().setBoxes(boxes);
    fileSelector().setBoxes(boxes);
    progress().setBoxes(boxes);
}

Project& Application::createProject()
{
    return add(makeCounted<Project>(edits().log()));
}

Project& Application::openProject(const fs::path& file)
{
    return add(ProjectFile::read(file, edits().log()), file);
}

Project& Application::openProject(const fs::path& file, std::string_view content)
{
    return add(ProjectFile::parse(content, file.string(), edits().log()), file);
}

Project& Application::add(const Counted<Project>& project, const fs::path& file)
{
    project->setPath(fullPathOf(file));
    return add(project);
}

Project& Application::add(Counted<Project> project)
{
    project->pool().setVideoSupport(m_services->videos);
    return projects().add(std::move(project));
}

std::string Application::saveProject(Project& project, const fs::path& file,
                                     const std::optional<cadrel::util::FileStamp>& expected)
{
    std::u16string path = fullPathOf(file);
    project.announceStoring();
    // The forms that can't be stored elsewhere refuse that below.
    MediaMove media(project, toUtf8(path));
    std::string text = ProjectFile::write(project, file, expected);
    media.keep();
    if (path != project.path()) {
        project.setPath(std::move(path));
        projects().renamed(project);
    }
    return text;
}

void Application::activateProject(Project* project)
{
    projects().activate(project);
}

void Application::closeProject(Project& project)
{
    if (edits().isOpen())
        edits().commit(&project, u"");
    projects().close(project);
    edits().endAfterClosing(project);
}

void Application::idle()
{
    if (!edits().isOpen()) {
        for (const Counted<Project>& project : std::vector(projects().projects())) {
            if (project->hasChanges())
                projects().tellChanges(*project);
        }
    }
    idleManager().callHandlers();
    views().idle();
}

bool Application::choose(const MenuRegistry::Command& command)
{
    return actions().invoke(command.category.c_str(), command.action.c_str(), 0) == ResultOk;
}

ActionManager& Application::actions()
{
    return *m_services->actions;
}

AlertService& Application::alerts()
{
    return *m_services->alerts;
}

DependencyManager& Application::dependencies()
{
    return *m_services->dependencies;
}

EditService& Application::edits()
{
    return *m_services->edits;
}

FileSelector& Application::fileSelector()
{
    return *m_services->fileSelector;
}

IdleManager& Application::idleManager()
{
    return *m_services->idleManager;
}

MenuRegistry& Application::menus()
{
    return *m_services->menus;
}

ProgressService& Application::progress()
{
    return *m_services->progress;
}

ProjectManager& Application::projects()
{
    return *m_services->projects;
}

Translations& Application::translations()
{
    return *m_services->translations;
}

Transport& Application::transport()
{
    return *m_services->transport;
}

ViewManager& Application::views()
{
    return *m_services->views;
}

WindowFactoryRegistry& Application::windowFactories()
{
    return *m_services->windowFactories;
}

} // namespace standin
