// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/boxes/Boxes.h"
#include "desktop/boxes/EventLoop.h"
#include "desktop/document/OpenDocuments.h"
#include "desktop/document/RecentFiles.h"
#include "desktop/shell/ActQueue.h"
#include "desktop/shell/EndSignals.h"
#include "desktop/shell/MainWindow.h"
#include "desktop/shell/MissingFiles.h"
#include "desktop/shell/ModulePlaces.h"
#include "desktop/shell/ProjectTracks.h"
#include "desktop/shell/Workspace.h"
#include "desktop/tracks/FrameStills.h"
#include "standin/Application.h"
#include "standin/module/ModuleLoader.h"
#include "standin/video/Videos.h"

#include <chrono>
#include <filesystem>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace desktop {

/// The program: the host, its window, and the module in it. JUCE has to be there while it lives.
class DesktopProgram {
public:
    explicit DesktopProgram(const ModulePlaces& places);
    DesktopProgram(const DesktopProgram&) = delete;
    DesktopProgram& operator=(const DesktopProgram&) = delete;
    /// Closes the module's window and unloads the module before anything else goes.
    ~DesktopProgram();

    /// Opens the projects and works until the user quits.
    void run(const std::vector<std::filesystem::path>& projects);

private:
    void loadModule(const ModulePlaces& places);
    void idle(bool isWaiting);
    /// Does it in the next idle time, out of the calls of JUCE, so that a box may wait in it.
    void later(ActQueue::Act act) { m_acts.add(std::move(act)); }
    /// Where the system wants the program to end.
    void endIfAsked(bool isHostIdle);
    void choose(int command);
    void chooseOfList(int command);
    void chooseView(int command, TracksView& view);
    void chooseModuleCommand(std::size_t index);
    void openRecent(std::size_t index);
    void takeDropped(const std::vector<std::filesystem::path>& files, juce::Point<int> place);
    /// Lists are for the module's view, on which they have to be dropped.
    void passLists(const std::vector<std::string>& files, juce::Point<int> place);
    void open(const std::vector<std::filesystem::path>& files);
    void quit();
    void showModuleWindow();
    void showKeys();
    void showAbout();
    void refresh();
    /// Gives each document its view and shows that of the active one.
    void refreshTracks();
    TracksView* tracks();
    std::vector<standin::MenuRegistry::Command> moduleCommands();
    MenuState menuState();
    std::vector<MenuState::Recent> recentFiles();

    EndSignals m_endSignals;
    EventLoop m_loop;
    standin::Videos m_videos;
    MainWindow m_window;
    Boxes m_boxes;
    standin::Application m_application;
    std::optional<standin::ModuleLoader> m_module;
    RecentFiles m_recent;
    std::vector<std::filesystem::path> m_listedRecent; ///< in the menu
    MissingFiles m_missingRecent;
    OpenDocuments m_documents;
    Workspace m_workspace;
    FrameStills m_stills;
    std::map<const OpenDocument*, std::unique_ptr<ProjectTracks>> m_tracks;
    ActQueue m_acts;
    std::chrono::steady_clock::time_point m_nextLook{};
    bool m_isDone = false;
};

} // namespace desktop
