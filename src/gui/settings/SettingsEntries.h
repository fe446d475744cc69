// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/settings/Settings.h"

#include <cstdint>
#include <span>

namespace cadrel::gui {

// The options as the window offers them. Each has the name of its control, its label, which isn't translated, and its place,
// counted from the bottom of the sheet.

/// One that is on or off.
struct SwitchEntry {
    const char* name;
    const wchar_t* label;
    int fromBottom;
    core::Option<bool> core::Settings::*option;
};

/// One of some choices, which stand for the numbers from 0.
struct ChoiceEntry {
    struct Place {
        int x;
        int fromBottom;
        int width;
        int height;
    };

    const char* name;
    Place place;
    const char* labelName;
    const wchar_t* label;
    Place labelPlace;
    core::Option<std::int32_t> core::Settings::*option;
    std::span<const wchar_t* const> items;
};

/// A number of frames, in the row of the option that it belongs to and with its label.
struct FramesEntry {
    const wchar_t* label;
    int fromBottom;
    core::Option<std::int32_t> core::Settings::*option;
};

// From the top of the sheet to its bottom.
std::span<const SwitchEntry> switchEntries();
std::span<const ChoiceEntry> choiceEntries();
std::span<const FramesEntry> framesEntries();

} // namespace cadrel::gui
