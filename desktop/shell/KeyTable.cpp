// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/KeyTable.h"

namespace desktop {

const std::vector<KeyRow>& keyTable()
{
    static const std::vector<KeyRow> rows{
        {"Up, Down", "go through the events; Shift and Ctrl select several"},
        {"Left, Right", "first and last frame in the pictures; scroll the tracks, when the keyboard is on them"},
        {"Return", "edits the selected event; confirms a sheet"},
        {"Delete", "deletes the selected events"},
        {"Ctrl+A", "selects all events"},
        {"Shift+F10, Menu", "opens the menu of the selected events"},
        {"Ctrl+Z, Ctrl+Shift+Z", "undo and redo"},
        {"Escape", "closes a sheet, a box or a menu"},
        {"Ctrl+O, Ctrl+S, Ctrl+Shift+S", "open, save, save as"},
        {"Ctrl+W, Ctrl+Q", "close the project, and the program"},
        {"Ctrl+Tab, Ctrl+Shift+Tab", "next and previous project"},
        {"F6", "moves the keyboard from the tracks to Cadrel's window and back"},
        {"Tab", "goes from one thing to the next"},
        {"F10", "opens the menus"},
        {"F", "shows all of the programme on the tracks"},
        {"P", "takes the tracks to the preview and back"},
        {"G", "shows where the clips stood before"},
        {"Ctrl and the wheel, +, -", "zoom the tracks in and out, when the mouse or the keyboard is on them"},
        {"Home, End", "go to the beginning and the end of the programme, when the keyboard is on the tracks"},
        {"Page Up, Page Down", "scroll the tracks, when the keyboard is on them"},
        {"Shift and the wheel", "scrolls the tracks to the left and right"},
        {"Alt and the wheel", "makes the tracks higher and lower"},
    };
    return rows;
}

std::string keyTableText()
{
    std::string text;
    for (const KeyRow& row : keyTable())
        text.append(text.empty() ? "" : "\n").append(row.keys).append("  ").append(row.meaning);
    return text;
}

} // namespace desktop
