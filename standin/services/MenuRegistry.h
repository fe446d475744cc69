// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Implements.h"
#include "velmark/UserInterface.h"

#include <string>
#include <vector>

namespace standin {

/// The commands that modules have entered into the menus.
class MenuRegistry : public Velmark::Implements<MenuRegistry, Velmark::FObject, Velmark::IMenuRegistry> {
public:
    static constexpr const char* ClassName = "MenuRegistry";

    /// An item of a menu, and the action that it invokes.
    struct Command {
        Velmark::BundleHandle bundle;
        std::string menu;
        std::u16string title;
        Velmark::int32 flags;
        std::string category;
        std::string action;
    };

    /// Refuses a command that lacks one of the texts.
    Velmark::int32 addCommand(Velmark::BundleHandle bundle, const char* menu, const char16_t* title,
                              Velmark::int32 flags, const char* category, const char* action) override;
    /// ResultFalse when there are none.
    Velmark::int32 removeCommands(Velmark::BundleHandle bundle) override;

    /// In the order in which they were entered.
    const std::vector<Command>& commands() const { return m_commands; }

private:
    std::vector<Command> m_commands;
};

} // namespace standin
