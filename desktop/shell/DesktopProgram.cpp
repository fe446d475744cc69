// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/DesktopProgram.h"

#include "desktop/boxes/BoxText.h"
#include "standin/base/Utf16.h"
#include "standin/edit/ActionManager.h"
#include "standin/edit/ProjectManager.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Project.h"
#include "standin/window/ViewManager.h"
#include "velmark/UserInterface.h"

#include <cstdlib>
#include <string_view>

namespace desktop {

namespace fs = std::filesystem;

using standin::Project;
using standin::toUtf16;
using standin::toUtf8;
using Velmark::IActionManager;

namespace {

constexpr std::string_view ProjectMenu = "Project";

fs::path homeFolder()
{
    std::error_code ignored;
    const fs::path current = fs::current_path(ignored);
    const char* const home = std::getenv("HOME");
    return ignored && home ? fs::path(home) : current;
}

} // namespace

DesktopProgram::DesktopProgram(const ModulePlaces& places)
    : m_boxes(m_loop, m_window.view(), m_window.view().desk(), homeFolder()), m_application({}, &m_videos)
{
    MainView& view = m_window.view();
    view.menuState = [this] { return menuState(); };
    view.onCommand = [this](int command) { choose(command); };
    view.onTabChosen = [this](std::size_t tab) {
        m_application.activateProject(m_application.projects().projects()[tab].get());
    };
    view.onTabClosed = [this](std::size_t tab) { close(*m_application.projects().projects()[tab]); };
    view.onFilesDropped = [this](const std::vector<fs::path>& files) {
        for (const fs::path& file : files)
            open(file);
    };
    view.isBlocked = [this] { return m_boxes.isOpen(); };
    m_window.onClose = [this] { m_wantsToQuit = true; };
    m_boxes.setOpenChanged([&view](bool isOpen) { view.embedded().setCovered(isOpen); });
    m_application.setBoxes(&m_boxes);
    m_application.views().setWindowSystem(&view.embedded());
    m_loop.setIdle([this](bool isWaiting) { idle(isWaiting); });
    loadModule(places);
}

DesktopProgram::~DesktopProgram()
{
    m_loop.setIdle({});
    m_module.reset();
    m_application.views().setWindowSystem(nullptr);
    m_application.setBoxes(nullptr);
}

void DesktopProgram::loadModule(const ModulePlaces& places)
{
    try {
        m_module.emplace(m_application, places.module, places.resources);
    } catch (const standin::ModuleError& error) {
        tell(std::string("Cadrel can't be loaded: ") + error.what());
    }
}

void DesktopProgram::run(const std::vector<fs::path>& projects)
{
    for (const fs::path& project : projects)
        open(project);
    refresh();
    m_loop.runUntil([this] { return m_isDone; });
}

void DesktopProgram::idle(bool isWaiting)
{
    // While something waits for the user, the host isn't idle, but views of modules go on working.
    if (isWaiting) {
        m_application.views().idle();
        return;
    }
    m_application.idle();
    refresh();
    if (m_wantsToQuit && !m_boxes.isOpen())
        m_isDone = true;
}

void DesktopProgram::choose(int command)
{
    if (command >= MenuCommand::FirstOfModules && command < MenuCommand::FirstHistory) {
        const auto commands = moduleCommands();
        const auto index = static_cast<std::size_t>(command - MenuCommand::FirstOfModules);
        if (index < commands.size())
            m_application.choose(*commands[index]);
        return;
    }
    switch (command) {
    case MenuCommand::Open:
        return chooseProject();
    case MenuCommand::Close:
        if (Project* const active = m_application.projects().active())
            close(*active);
        return;
    case MenuCommand::Quit:
        m_wantsToQuit = true;
        return;
    case MenuCommand::Undo:
        m_application.actions().invoke(IActionManager::EditCategory, IActionManager::Undo, 0);
        return;
    case MenuCommand::Redo:
        m_application.actions().invoke(IActionManager::EditCategory, IActionManager::Redo, 0);
        return;
    case MenuCommand::Keys:
        return showKeys();
    case MenuCommand::About:
        return showAbout();
    default:
        return;
    }
}

void DesktopProgram::chooseProject()
{
    const auto files =
        m_boxes.chooseFiles({u"Open Project", {{"stage", "Project"}, {"ardour", "Session of Ardour"}}, u"", false});
    for (const std::u16string& file : files)
        open(toUtf8(file));
}

void DesktopProgram::open(const fs::path& file)
{
    try {
        m_application.activateProject(&m_application.openProject(file));
    } catch (const standin::ProjectFileError& error) {
        return tell(error.what());
    }
    showModuleWindow();
}

void DesktopProgram::close(Project& project)
{
    m_application.closeProject(project);
    const auto& left = m_application.projects().projects();
    if (!left.empty() && !m_application.projects().active())
        m_application.activateProject(left.back().get());
}

void DesktopProgram::showModuleWindow()
{
    const auto commands = moduleCommands();
    if (!commands.empty() && m_application.views().windows().empty())
        m_application.choose(*commands.front());
}

void DesktopProgram::showKeys()
{
    tell("Ctrl+O  opens a project\n"
         "Ctrl+S, Ctrl+Shift+S  saves it, and saves it as another file\n"
         "Ctrl+Z, Ctrl+Shift+Z  undo and redo\n"
         "Ctrl+W, Ctrl+Q  closes the project, and the program\n"
         "F10  opens the menus");
}

void DesktopProgram::showAbout()
{
    tell("Cadrel carries the sound of a project over to a new picture cut.\n\n"
         "GNU General Public License, version 3 or (at your option) any later version");
}

void DesktopProgram::refresh()
{
    const Project* const active = m_application.projects().active();
    std::vector<TabStrip::Tab> tabs;
    std::size_t activeTab = 0;
    for (const auto& project : m_application.projects().projects()) {
        if (project.get() == active)
            activeTab = tabs.size();
        const fs::path path = toUtf8(project->path());
        tabs.push_back({path.filename().string(), path.string(), false});
    }
    const std::string name = tabs.empty() ? "" : tabs[activeTab].name;
    m_window.setName(juce::String::fromUTF8((name.empty() ? std::string("Cadrel") : name + " - Cadrel").c_str()));
    m_window.view().setTabs(std::move(tabs), activeTab);
}

std::vector<const standin::MenuRegistry::Command*> DesktopProgram::moduleCommands()
{
    std::vector<const standin::MenuRegistry::Command*> commands;
    for (const auto& command : m_application.menus().commands()) {
        if (command.menu == ProjectMenu)
            commands.push_back(&command);
    }
    return commands;
}

MenuState DesktopProgram::menuState()
{
    MenuState state;
    for (const auto* const command : moduleCommands())
        state.moduleCommands.push_back(command->title);
    if (const Project* const active = m_application.projects().active()) {
        state.hasProject = true;
        const standin::UndoList& list = const_cast<Project*>(active)->undoList();
        for (std::size_t index = 0; index < list.size(); ++index)
            state.undoNames.push_back(list.nameAt(index));
        state.undoPosition = list.doneCount();
    }
    return state;
}

void DesktopProgram::tell(const std::string& message)
{
    m_boxes.ask(toUtf16(message), {u"OK"});
}

} // namespace desktop
