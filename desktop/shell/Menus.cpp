// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/Menus.h"

#include "standin/base/Utf16.h"

namespace desktop {

namespace {

MenuItem line()
{
    return {0, ""};
}

MenuItem fileMenu(const MenuState& state)
{
    MenuItem recent{0, "Open Recent", "", !state.recentFiles.empty()};
    for (std::size_t index = 0; index < state.recentFiles.size(); ++index) {
        const auto& [path, isMissing] = state.recentFiles[index];
        recent.items.push_back(
            {MenuCommand::FirstRecent + static_cast<int>(index), isMissing ? path + " (missing)" : path});
    }
    if (!recent.items.empty()) {
        recent.items.push_back(line());
        recent.items.push_back({MenuCommand::ClearRecent, "Clear This List"});
    }
    return {0,
            "File",
            "",
            true,
            false,
            {{MenuCommand::Open, "Open...", "Ctrl+O"},
             recent,
             line(),
             {MenuCommand::Save, "Save", "Ctrl+S", state.hasProject},
             {MenuCommand::SaveAs, "Save As...", "Ctrl+Shift+S", state.hasProject},
             line(),
             {MenuCommand::Close, "Close", "Ctrl+W", state.hasProject},
             {MenuCommand::Quit, "Quit", "Ctrl+Q"}}};
}

/// All entries, the oldest first, after the state before all of them. A menu that is higher than the screen scrolls.
MenuItem historyMenu(const MenuState& state)
{
    MenuItem history{0, "History", "", !state.undoNames.empty()};
    const auto add = [&](std::size_t position, const std::string& text) {
        history.items.push_back(
            {MenuCommand::FirstHistory + static_cast<int>(position), text, "", true, position == state.undoPosition});
    };
    add(0, "As it was opened");
    for (std::size_t position = 1; position <= state.undoNames.size(); ++position)
        add(position, standin::toUtf8(state.undoNames[position - 1]));
    return history;
}

MenuItem editMenu(const MenuState& state)
{
    const bool canUndo = state.undoPosition > 0;
    const bool canRedo = state.undoPosition < state.undoNames.size();
    const auto nameAt = [&](std::size_t entry) { return standin::toUtf8(state.undoNames[entry]); };
    const std::string undone = canUndo ? std::string("Undo ").append(nameAt(state.undoPosition - 1)) : "Undo";
    const std::string redone = canRedo ? std::string("Redo ").append(nameAt(state.undoPosition)) : "Redo";
    return {0,
            "Edit",
            "",
            true,
            false,
            {{MenuCommand::Undo, undone, "Ctrl+Z", canUndo},
             {MenuCommand::Redo, redone, "Ctrl+Shift+Z", canRedo},
             historyMenu(state)}};
}

MenuItem projectMenu(const MenuState& state)
{
    MenuItem menu{0, "Project"};
    for (std::size_t index = 0; index < state.moduleCommands.size(); ++index)
        menu.items.push_back({MenuCommand::FirstOfModules + static_cast<int>(index),
                              standin::toUtf8(state.moduleCommands[index]), "", state.hasProject});
    menu.items.push_back(line());
    menu.items.push_back({MenuCommand::AddVideo, "Add Video...", "", state.hasProject});
    return menu;
}

MenuItem viewMenu(const MenuState& state)
{
    return {0,
            "View",
            "",
            true,
            false,
            {{MenuCommand::FitAll, "Fit All", "F", state.hasProject},
             {MenuCommand::PreviewPlace, "Preview and Back", "P", state.hasProject},
             {MenuCommand::Ghosts, "Where Clips Stood Before", "G", state.hasProject, state.showsGhosts}}};
}

MenuItem helpMenu()
{
    return {0, "Help", "", true, false, {{MenuCommand::Keys, "Keys"}, {MenuCommand::About, "About Cadrel"}}};
}

} // namespace

std::vector<MenuItem> menusOf(const MenuState& state)
{
    return {fileMenu(state), editMenu(state), viewMenu(state), projectMenu(state), helpMenu()};
}

} // namespace desktop
