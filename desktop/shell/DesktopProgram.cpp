// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/DesktopProgram.h"

#include "desktop/document/DroppedFile.h"
#include "desktop/shell/KeyTable.h"
#include "standin/edit/ActionManager.h"
#include "standin/window/ViewManager.h"
#include "velmark/UserInterface.h"

#include <cstdlib>
#include <string_view>
#include <utility>

namespace desktop {

namespace fs = std::filesystem;

using Velmark::IActionManager;

namespace {

constexpr std::string_view ProjectMenu = "Project";
constexpr std::chrono::seconds LookInterval(2);

fs::path homeFolder()
{
    std::error_code ignored;
    const fs::path current = fs::current_path(ignored);
    const char* const home = std::getenv("HOME");
    return ignored && home ? fs::path(home) : current;
}

} // namespace

DesktopProgram::DesktopProgram(const ModulePlaces& places)
    : m_window(WindowMemory(WindowMemory::defaultFile())),
      m_boxes(m_loop, m_window.view(), m_window.view().desk(), homeFolder()), m_application({}, &m_videos),
      m_documents(m_application, &m_recent), m_workspace(m_documents, m_boxes), m_stills(m_application.context())
{
    MainView& view = m_window.view();
    view.menuState = [this] { return menuState(); };
    view.onCommand = [this](int command) { later([=, this] { choose(command); }); };
    view.onTabChosen = [this](std::uint64_t id) { later([=, this] { m_workspace.activateTab(id); }); };
    view.onTabClosed = [this](std::uint64_t id) { later([=, this] { m_workspace.closeTab(id); }); };
    view.onFilesDropped = [this](const std::vector<fs::path>& files, juce::Point<int> place) {
        later([=, this] { takeDropped(files, place); });
    };
    view.isBlocked = [this] { return m_boxes.isOpen(); };
    m_window.onClose = [this] { later([this] { quit(); }); };
    m_boxes.setOpenChanged([&view](bool isOpen) { view.embedded().setCovered(isOpen); });
    m_application.setBoxes(&m_boxes);
    m_application.views().setWindowSystem(&view.embedded());
    m_loop.setIdle([this](bool isWaiting) { idle(isWaiting); });
    loadModule(places);
    m_missingRecent.look(m_recent.paths());
}

DesktopProgram::~DesktopProgram()
{
    m_loop.setIdle({});
    m_window.view().setTracks(nullptr);
    m_tracks.clear();
    m_module.reset();
    m_application.views().setWindowSystem(nullptr);
    m_application.setBoxes(nullptr);
}

void DesktopProgram::loadModule(const ModulePlaces& places)
{
    if (const std::string fault = places.resourcesFault(); !fault.empty())
        later([this, fault] { m_workspace.tell(fault); });
    try {
        m_module.emplace(m_application, places.module, places.resources);
    } catch (const standin::ModuleError& error) {
        later([this, reason = std::string(error.what())] { m_workspace.tell("Cadrel can't be loaded: " + reason); });
    }
}

void DesktopProgram::run(const std::vector<fs::path>& projects)
{
    later([=, this] { open(projects); });
    m_loop.runUntil([this] { return m_isDone; });
    m_window.keepForm();
}

void DesktopProgram::idle(bool isWaiting)
{
    // While something waits for the user, the host isn't idle, but views of modules go on working.
    const bool isHostIdle = !isWaiting && !m_boxes.isOpen();
    endIfAsked(isHostIdle);
    const auto now = std::chrono::steady_clock::now();
    if (!isHostIdle) {
        m_application.views().idle();
        m_documents.idleBeneathBox(now);
        return;
    }
    m_acts.run([this](const std::string& fault) { m_workspace.tell(fault); });
    m_application.idle();
    m_documents.idle(now);
    if (now >= m_nextLook) {
        m_workspace.lookAtFile();
        m_workspace.lookAtAutosaves();
        m_window.keepForm();
        m_nextLook = std::chrono::steady_clock::now() + LookInterval;
    }
    refresh();
    refreshTracks();
    m_window.view().keepKeyboard();
}

void DesktopProgram::endIfAsked(bool isHostIdle)
{
    const int signal = EndSignals::received();
    if (signal == 0)
        return;
    m_documents.leave(isHostIdle);
    EndSignals::endBy(signal);
}

void DesktopProgram::choose(int command)
{
    OpenDocument* const active = m_documents.active();
    const auto invoke = [this](const char* action) {
        m_application.actions().invoke(IActionManager::EditCategory, action, 0);
    };
    if (command >= MenuCommand::FirstRecent)
        return chooseOfList(command);
    switch (command) {
    case MenuCommand::Open:
        m_workspace.chooseAndOpen();
        return showModuleWindow();
    case MenuCommand::Quit:
        return quit();
    case MenuCommand::Undo:
        return invoke(IActionManager::Undo);
    case MenuCommand::Redo:
        return invoke(IActionManager::Redo);
    case MenuCommand::ClearRecent:
        m_recent.clear();
        return;
    case MenuCommand::Keys:
        return showKeys();
    case MenuCommand::About:
        return showAbout();
    default:
        break;
    }
    if (!active)
        return;
    if (command == MenuCommand::Save)
        m_workspace.save(*active);
    else if (command == MenuCommand::SaveAs)
        m_workspace.saveAs(*active);
    else if (command == MenuCommand::Close)
        m_workspace.close(*active);
    else if (command == MenuCommand::AddVideo)
        m_workspace.addVideos(*active);
    else if (TracksView* const view = tracks())
        chooseView(command, *view);
}

void DesktopProgram::chooseView(int command, TracksView& view)
{
    if (command == MenuCommand::FitAll)
        view.fitAll();
    else if (command == MenuCommand::PreviewPlace)
        view.showPreviewPlace();
    else if (command == MenuCommand::Ghosts)
        view.setGhosts(!view.showsGhosts());
}

void DesktopProgram::chooseOfList(int command)
{
    const auto indexFrom = [command](int first) { return static_cast<std::size_t>(command - first); };
    if (command < MenuCommand::FirstOfModules)
        return openRecent(indexFrom(MenuCommand::FirstRecent));
    if (command < MenuCommand::FirstHistory) {
        chooseModuleCommand(indexFrom(MenuCommand::FirstOfModules));
        return m_window.view().embedded().takeKeyboard();
    }
    if (OpenDocument* const active = m_documents.active())
        active->goToUndoPosition(indexFrom(MenuCommand::FirstHistory));
}

void DesktopProgram::chooseModuleCommand(std::size_t index)
{
    const auto commands = moduleCommands();
    if (index < commands.size())
        m_application.choose(commands[index]);
}

void DesktopProgram::openRecent(std::size_t index)
{
    if (index < m_listedRecent.size() && m_workspace.openRecent(m_recent, fs::path(m_listedRecent[index])))
        showModuleWindow();
}

void DesktopProgram::takeDropped(const std::vector<fs::path>& files, juce::Point<int> place)
{
    std::vector<fs::path> projects;
    std::vector<std::string> lists;
    for (const fs::path& file : files) {
        const DroppedFile kind = droppedFile(file);
        if (kind == DroppedFile::Project)
            projects.push_back(file);
        else if (kind == DroppedFile::Edl)
            lists.push_back(file.string());
        else
            m_workspace.tell(file.filename().string() + " is no project and no EDL.");
    }
    open(projects);
    if (!lists.empty())
        passLists(lists, place);
}

void DesktopProgram::passLists(const std::vector<std::string>& files, juce::Point<int> place)
{
    EmbeddedView& embedded = m_window.view().embedded();
    if (!m_documents.active())
        m_workspace.tell(
            "Open the project first, or drop it here. Then drop EDLs on the Old EDL, New EDL or Change EDL table.");
    else if (!embedded.drop(files, embedded.getLocalPoint(&m_window.view(), place)))
        m_workspace.tell("Drop EDLs on the Old EDL, New EDL or Change EDL table.");
}

void DesktopProgram::open(const std::vector<fs::path>& files)
{
    for (const fs::path& file : files)
        m_workspace.open(file);
    showModuleWindow();
}

void DesktopProgram::quit()
{
    m_isDone = m_workspace.closeAll();
}

/// As soon as there is a project for it.
void DesktopProgram::showModuleWindow()
{
    if (m_documents.size() > 0 && m_application.views().windows().empty())
        chooseModuleCommand(0);
}

void DesktopProgram::showKeys()
{
    m_workspace.tell(keyTableText());
}

void DesktopProgram::showAbout()
{
    m_workspace.tell("Cadrel carries the sound of a project over to a new picture cut.\n\n"
                     "GNU General Public License, version 3 or (at your option) any later version");
}

void DesktopProgram::refresh()
{
    std::vector<TabStrip::Tab> tabs;
    std::size_t activeTab = 0;
    std::string title = "Cadrel";
    for (std::size_t index = 0; index < m_documents.size(); ++index) {
        const OpenDocument& document = m_documents.at(index);
        tabs.push_back({document.id(), document.name(), document.path().string(), document.isUnsaved()});
        if (&document != m_documents.active())
            continue;
        activeTab = index;
        title = std::string(document.isUnsaved() ? "*" : "").append(document.name()).append(" - Cadrel");
    }
    m_window.setName(juce::String::fromUTF8(title.c_str()));
    m_window.view().setTabs(std::move(tabs), activeTab);
}

void DesktopProgram::refreshTracks()
{
    OpenDocument* const active = m_documents.active();
    m_window.view().setTracks(tracks());
    // A document that was loaded anew may have the place of the one before in memory, but not its project.
    std::erase_if(m_tracks, [this](const auto& entry) {
        for (std::size_t index = 0; index < m_documents.size(); ++index) {
            if (&m_documents.at(index) == entry.first && &entry.first->project() == &entry.second->project())
                return false;
        }
        return true;
    });
    if (!active)
        return;
    auto& shown = m_tracks[active];
    if (!shown) {
        shown = std::make_unique<ProjectTracks>(m_application, active->project(), &m_stills);
        m_window.view().setTracks(&shown->view());
    }
    shown->idle();
}

TracksView* DesktopProgram::tracks()
{
    OpenDocument* const active = m_documents.active();
    const auto found = m_tracks.find(active);
    const bool isThere = active && found != m_tracks.end() && &found->second->project() == &active->project();
    return isThere ? &found->second->view() : nullptr;
}

std::vector<standin::MenuRegistry::Command> DesktopProgram::moduleCommands()
{
    std::vector<standin::MenuRegistry::Command> commands = m_application.menus().commands();
    std::erase_if(commands, [](const auto& command) { return command.menu != ProjectMenu; });
    return commands;
}

std::vector<MenuState::Recent> DesktopProgram::recentFiles()
{
    m_listedRecent = m_recent.paths();
    std::vector<MenuState::Recent> files;
    for (const fs::path& path : m_listedRecent)
        files.push_back({path.string(), m_missingRecent.isMissing(path)});
    // For the next time that the menu is opened.
    m_missingRecent.look(m_listedRecent);
    return files;
}

MenuState DesktopProgram::menuState()
{
    MenuState state;
    for (const auto& command : moduleCommands())
        state.moduleCommands.push_back(command.title);
    state.recentFiles = recentFiles();
    if (const OpenDocument* const active = m_documents.active()) {
        state.hasProject = true;
        state.undoNames = active->undoNames();
        state.undoPosition = active->undoPosition();
    }
    if (const TracksView* const view = tracks())
        state.showsGhosts = view->showsGhosts();
    return state;
}

} // namespace desktop
