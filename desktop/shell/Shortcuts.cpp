// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/Shortcuts.h"

#include "desktop/shell/Menus.h"

#include <algorithm>
#include <iterator>

namespace desktop {

namespace {

struct Shortcut {
    char letter;
    bool withShift;
    int command;
    bool withControl = true;
};

/// The menus show the same.
constexpr Shortcut Shortcuts[] = {
    {'o', false, MenuCommand::Open},
    {'s', false, MenuCommand::Save},
    {'s', true, MenuCommand::SaveAs},
    {'w', false, MenuCommand::Close},
    {'q', false, MenuCommand::Quit},
    {'z', false, MenuCommand::Undo},
    {'z', true, MenuCommand::Redo},
    {'f', false, MenuCommand::FitAll, false},
    {'p', false, MenuCommand::PreviewPlace, false},
    {'g', false, MenuCommand::Ghosts, false},
};

} // namespace

int commandOfKey(const juce::KeyPress& key)
{
    const juce::ModifierKeys modifiers = key.getModifiers();
    if (modifiers.isAltDown())
        return 0;
    const auto letter = juce::CharacterFunctions::toLowerCase(static_cast<juce::juce_wchar>(key.getKeyCode()));
    const auto* const found = std::find_if(std::begin(Shortcuts), std::end(Shortcuts), [&](const Shortcut& each) {
        return letter == static_cast<juce::juce_wchar>(each.letter) && modifiers.isShiftDown() == each.withShift &&
               modifiers.isCtrlDown() == each.withControl;
    });
    return found == std::end(Shortcuts) ? 0 : found->command;
}

} // namespace desktop
