// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/project/MediaProgram.h"

#include "app/console/ProgramBeside.h"

namespace cadrel::app {

void startMediaProgram(const std::string& projectFile)
{
    goOnAs("cadrel-media", {projectFile});
}

} // namespace cadrel::app
