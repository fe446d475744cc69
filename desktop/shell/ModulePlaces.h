// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <string>

namespace desktop {

/// Where the module is, from where the running program is: `bin/cadrel-desktop`, `lib/Cadrel.so` and `resources` lie beside one
/// another.
struct ModulePlaces {
    std::filesystem::path module;
    std::filesystem::path resources;

    static ModulePlaces besideProgram(const std::filesystem::path& program);
    /// Tells the user why Cadrel's window can't be shown with what is there; empty where it can.
    std::string resourcesFault() const;
};

/// The file of the running program.
std::filesystem::path runningProgram();

} // namespace desktop
