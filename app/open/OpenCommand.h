// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>
#include <vector>

namespace cadrel::app {

struct OpenOptions {
    std::vector<std::string> projects;
};

/// Goes on as `cadrel-desktop`, the program with the window. Throws Failure for a project that isn't there, and without that
/// program.
[[noreturn]] void runOpen(const OpenOptions& options);

} // namespace cadrel::app
