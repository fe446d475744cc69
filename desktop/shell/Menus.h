// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace desktop {

/// What the user can choose. The numbers are those of the menus; a few commands have one number for each of a list.
struct MenuCommand {
    enum : int {
        Open = 1,
        Save,
        SaveAs,
        Close,
        Quit,
        Undo,
        Redo,
        PreviewPlace,
        Ghosts,
        FitAll,
        AddVideo,
        Keys,
        About,
        ClearRecent,
    };
    static constexpr int FirstRecent = 1000;
    static constexpr int FirstOfModules = 2000;
    /// Takes back everything; those after it go to the state after one entry.
    static constexpr int FirstHistory = 10000;
};

/// An item of a menu, or a menu in it. Texts are UTF-8.
struct MenuItem {
    int command = 0; ///< 0 for a line between items, and for what has items of its own
    std::string text;
    std::string shortcut = {};
    bool isEnabled = true;
    bool isTicked = false;
    std::vector<MenuItem> items = {};
};

/// What the menus show.
struct MenuState {
    bool hasProject = false;
    /// A project that was open before.
    struct Recent {
        std::string path;
        bool isMissing = false;
    };
    std::vector<Recent> recentFiles; ///< the latest first
    std::vector<std::u16string> undoNames;
    std::size_t undoPosition = 0;
    std::vector<std::u16string> moduleCommands; ///< those of the menu "Project"
    bool showsGhosts = false;
};

/// The menus of the menu bar, from left to right.
std::vector<MenuItem> menusOf(const MenuState& state);

} // namespace desktop
