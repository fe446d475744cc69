// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/project/MediaProgram.h"

#include "app/console/Failure.h"

#include <cerrno>
#include <filesystem>
#include <system_error>

#include <unistd.h>

namespace cadrel::app {

void startMediaProgram(const std::string& projectFile)
{
    std::error_code error;
    const std::filesystem::path own = std::filesystem::read_symlink("/proc/self/exe", error);
    const std::string program = (own.parent_path() / "cadrel-media").string();
    execl(program.c_str(), program.c_str(), projectFile.c_str(), nullptr);
    throw Failure{program, "can't be started: " + std::error_code(errno, std::generic_category()).message(),
                  "install it beside cadrel"};
}

} // namespace cadrel::app
