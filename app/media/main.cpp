// SPDX-License-Identifier: GPL-3.0-or-later

// `cadrel-media PROJECT`: the files of the media pool. `cadrel show --media` goes on as this program.

#include "app/console/Failure.h"
#include "app/console/Output.h"
#include "app/console/Program.h"
#include "app/console/Terminal.h"
#include "app/media/MediaListing.h"
#include "app/project/ProjectAccess.h"
#include "standin/base/Utf16.h"
#include "standin/project/Project.h"

#include <filesystem>
#include <iostream>
#include <string>

namespace {

using namespace cadrel::app;

void run(int argc, char** argv, Terminal& terminal)
{
    if (argc != 2)
        throw UsageError{"give one project", "see cadrel show --help"};
    const std::string file = argv[1];
    standin::Project& project = readProject(file, terminal);
    project.setPath(standin::toUtf16(std::filesystem::absolute(file).string()));
    const ProjectClock clock = clockOf(project, file);
    MediaListing(project, clock, terminal).print(std::cout);
    flushStandardOutput();
}

} // namespace

int main(int argc, char** argv)
{
    return runProgram([argc, argv](Terminal& terminal) { run(argc, argv, terminal); });
}
