// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace cadrel::app {

/// Goes on as `cadrel-media`, the program beside this one that opens media files: the libraries for them take time to load.
/// Throws Failure when it isn't there.
[[noreturn]] void startMediaProgram(const std::string& projectFile);

} // namespace cadrel::app
