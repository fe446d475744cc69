// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/open/OpenCommand.h"

#include "app/console/Failure.h"
#include "app/console/Paths.h"
#include "app/console/ProgramBeside.h"

#include <filesystem>
#include <system_error>

namespace cadrel::app {

void runOpen(const OpenOptions& options)
{
    for (const std::string& project : options.projects) {
        std::error_code error;
        if (!std::filesystem::exists(project, error))
            throw unreadable(project, FileKind::Project);
    }
    goOnAs("cadrel-desktop", options.projects);
}

} // namespace cadrel::app
