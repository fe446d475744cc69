// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/services/MenuRegistry.h"
#include "standin/services/Terminal.h"
#include "util/FileStamp.h"
#include "velmark/Context.h"
#include "velmark/Counted.h"

#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace standin {

class ActionManager;
class AlertService;
class DependencyManager;
class EditService;
class FileSelector;
class HostContext;
class IdleManager;
class ProgressService;
class Project;
class ProjectManager;
class Translations;
class Transport;
class UserBoxes;
class VideoSupport;
class ViewManager;
class WindowFactoryRegistry;

/// The stand-in host as a whole: its services, its open projects and its idle call. A module is given `context()` and works
/// on it as on any host; the program that carries both calls the rest.
///
/// It belongs to one thread. What a module has registered has to be taken back before the application goes.
class Application {
public:
    /// `terminal` is where the user is; by default there is none. With `videos`, which have to outlive the application, the
    /// pictures of the videos are their own, and new videos can come into the pools.
    explicit Application(const Terminal& terminal = Terminal(), VideoSupport* videos = nullptr);
    Application(const Application&) = delete;
    Application& operator=(const Application&) = delete;
    /// Closes all projects.
    ~Application();

    Velmark::IHostContext* context();
    /// What alerts, file boxes and progress are shown with in place of the terminal. Not owned; null for none.
    void setBoxes(UserBoxes* boxes);

    /// A new, empty project, which is told to the listeners.
    Project& createProject();
    /// Reads a project file and tells the listeners. Throws ProjectFileError; nothing is opened then.
    Project& openProject(const std::filesystem::path& file);
    /// The same with this content, which the file may have had or may get.
    Project& openProject(const std::filesystem::path& file, std::string_view content);
    /// Lets the listeners store what they have, and writes the project. With an `expected` stamp the file has to be as it was
    /// then; else ProjectFileChanged is thrown. Throws ProjectFileError, with the former file untouched. Answers what it has
    /// written.
    std::string saveProject(Project& project, const std::filesystem::path& file,
                            const std::optional<cadrel::util::FileStamp>& expected = std::nullopt);
    /// Null makes none active.
    void activateProject(Project* project);
    /// Commits the transaction if one is open.
    void closeProject(Project& project);

    /// What a host does when the user does nothing: tells of the edits that were made outside of transactions, then calls
    /// the idle handlers unless they are blocked, and always the views of the windows.
    void idle();
    /// What a host does when the user chooses an item of a menu. Whether somebody carried it out.
    bool choose(const MenuRegistry::Command& command);

    ActionManager& actions();
    AlertService& alerts();
    DependencyManager& dependencies();
    EditService& edits();
    FileSelector& fileSelector();
    IdleManager& idleManager();
    MenuRegistry& menus();
    ProgressService& progress();
    ProjectManager& projects();
    Translations& translations();
    Transport& transport();
    ViewManager& views();
    WindowFactoryRegistry& windowFactories();

private:
    struct Services;

    Project& add(Velmark::Counted<Project> project);
    Project& add(const Velmark::Counted<Project>& project, const std::filesystem::path& file);

    std::unique_ptr<Services> m_services;
};

} // namespace standin
