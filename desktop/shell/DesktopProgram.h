// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/boxes/Boxes.h"
#include "desktop/boxes/EventLoop.h"
#include "desktop/shell/MainWindow.h"
#include "desktop/shell/ModulePlaces.h"
#include "standin/Application.h"
#include "standin/module/ModuleLoader.h"
#include "standin/video/Videos.h"

#include <filesystem>
#include <optional>
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
    void choose(int command);
    void chooseProject();
    void open(const std::filesystem::path& file);
    void close(standin::Project& project);
    void showModuleWindow();
    void showKeys();
    void showAbout();
    void refresh();
    std::vector<const standin::MenuRegistry::Command*> moduleCommands();
    MenuState menuState();
    void tell(const std::string& message);

    EventLoop m_loop;
    standin::Videos m_videos;
    MainWindow m_window;
    Boxes m_boxes;
    standin::Application m_application;
    std::optional<standin::ModuleLoader> m_module;
    bool m_wantsToQuit = false;
    bool m_isDone = false;
};

} // namespace desktop
