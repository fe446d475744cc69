// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/ModulePlaces.h"

#include <system_error>

namespace desktop {

ModulePlaces ModulePlaces::besideProgram(const std::filesystem::path& program)
{
    const std::filesystem::path top = program.parent_path().parent_path();
    return {top / "lib" / "Cadrel.so", top / "resources"};
}

std::string ModulePlaces::resourcesFault() const
{
    std::error_code error;
    if (std::filesystem::is_directory(resources, error))
        return {};
    return std::string("Cadrel's window can't be shown, because its folder ")
        .append(resources.string())
        .append(" is missing. Install Cadrel again, or put the folder there.");
}

std::filesystem::path runningProgram()
{
    std::error_code ignored;
    return std::filesystem::read_symlink("/proc/self/exe", ignored);
}

} // namespace desktop
