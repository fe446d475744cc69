// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/DataModel.h"
#include "core/model/ListOfKind.h"
#include "core/time/Framerate.h"
#include "standin/project/Project.h"
#include "tests/module/LoadedModule.h"
#include "tests/module/StoredProject.h"
#include "tests/module/WindowPlaces.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/x11/XUser.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::tests {

/// A user with mouse and keyboard in front of the window of the loaded module. Controls are named as in WindowPlaces. What the
/// user does goes through the X server to the window, in its order; what came of it is read from the projects of the host.
class LoadedWindow : public LoadedModule {
protected:
    // Names of sheets.
    static constexpr const char* Main = "";
    static constexpr const char* Files = "m_fileDialog";
    static constexpr const char* Edit = "m_editDialog";
    static constexpr const char* Settings = "m_settingsDialog";
    static constexpr const char* Videos = "m_videosDialog";

    // Where XWindows puts the window, and how large it is, in pixels of the screen.
    static constexpr int Left = 40;
    static constexpr int Top = 30;
    static constexpr int Width = 1300;
    static constexpr int Height = 750;

    /// Opens the project in the host, loads the module and opens its window, which gets the keyboard.
    void start(const std::filesystem::path& project);
    /// Opens a project in the host and makes it the active one.
    standin::Project& open(const std::filesystem::path& file);

    // ---- What the user does

    void moveTo(const WindowPlaces::Place& place);
    /// In the middle of a control.
    void click(const std::string& sheet, const std::string& name, const std::string& text = "");
    /// In the first two digits of a timecode.
    void clickHours(const WindowPlaces::Place& input);
    void clickRow(std::int32_t listKind, int row, unsigned long held = 0);
    void doubleClickRow(std::int32_t listKind, int row);
    void clickColumn(std::int32_t listKind, const std::string& title);
    /// Opens the menu of a row, waits for it, and presses the keys in it until it has closed.
    void chooseInMenu(std::int32_t listKind, int row, const std::vector<unsigned long>& keys);
    /// The files that the user takes in the next file box.
    void takeFiles(const std::vector<std::filesystem::path>& files);
    /// Where the box for one event stands that was opened by a double click on a row.
    WindowPlaces::Place inEditDialog(std::int32_t listKind, int row, const std::string& name) const;
    WindowPlaces::Place rowPlace(std::int32_t listKind, int row) const;

    // ---- What came of it

    /// Fails when the condition doesn't hold within ten seconds.
    void expectSoon(const std::string& what, const std::function<bool()>& condition);
    /// Waits until the undo list has so many steps that were made, and expects the name of the last of them.
    void expectEntry(std::size_t count, const std::u16string& name);
    /// What the project would hold if it were saved now.
    std::unique_ptr<core::DataModel> model(standin::Project& project);
    std::unique_ptr<core::DataModel> model() { return model(*m_project); }
    /// Roll name and timecodes of each event.
    std::vector<std::string> events(std::int32_t listKind);
    /// The numbers of the rows.
    std::vector<int> selection(std::int32_t listKind);
    /// Name, start and end of each event of a track, in seconds of the project.
    std::vector<std::string> clipsOn(const std::u16string& track);

    /// Writes what the window shows to the folder `window` of the build, when it has come to rest.
    void picture(const std::string& name);

    const WindowPlaces m_places;
    XUser m_user;
    TempFolder m_folder;
    TestProject m_timecodes{core::Framerate(24, 0)};
    standin::Project* m_project = nullptr;

private:
    static std::string tableName(std::int32_t listKind);
    void waitForStillness();
};

} // namespace cadrel::tests
