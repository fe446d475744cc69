// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/ProgramBeside.h"

#include "app/console/Failure.h"

#include <cerrno>
#include <filesystem>
#include <system_error>

#include <unistd.h>

namespace cadrel::app {

void goOnAs(const std::string& program, const std::vector<std::string>& arguments)
{
    std::error_code error;
    const std::filesystem::path own = std::filesystem::read_symlink("/proc/self/exe", error);
    std::string file = (own.parent_path() / program).string();
    std::vector<std::string> texts = arguments;
    std::vector<char*> pointers{file.data()};
    for (std::string& text : texts)
        pointers.push_back(text.data());
    pointers.push_back(nullptr);
    execv(file.c_str(), pointers.data());
    throw Failure{file, "can't be started: " + std::error_code(errno, std::generic_category()).message(),
                  "install it beside cadrel"};
}

} // namespace cadrel::app
