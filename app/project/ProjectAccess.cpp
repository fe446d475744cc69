// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/project/ProjectAccess.h"

#include "app/console/Paths.h"
#include "app/console/Terminal.h"
#include "host/project/HostFramerate.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Project.h"
#include "util/Result.h"

#include <filesystem>
#include <system_error>
#include <unistd.h>

namespace cadrel::app {

using standin::ProjectFileError;

std::string faultIn(const ProjectFileError& error, const std::string& file)
{
    const std::string text = error.what();
    const bool hasName = text.size() > file.size() && text.compare(file.size(), 2, ": ") == 0;
    return hasName ? text.substr(file.size() + 2) : text;
}

void requireReadableProject(const std::string& file)
{
    toWide(file);
    std::error_code ignored;
    if (!std::filesystem::is_regular_file(file, ignored) || access(file.c_str(), R_OK) != 0)
        throw unreadable(file, FileKind::Project);
}

standin::Project& readProject(const std::string& file, Terminal& terminal)
{
    // Deleting a long project node by node takes time; the end of the program frees it at once.
    static standin::ChangeLog& log = *new standin::ChangeLog;
    static standin::Project* project = nullptr;

    requireReadableProject(file);
    terminal.showProgress("reading " + fileNameOf(file));
    try {
        project = standin::ProjectFile::read(file, log).detach();
    } catch (const standin::ProjectFileError& error) {
        throw readingFailure(error, file);
    }
    return *project;
}

std::string projectFileIn(const std::string& path)
{
    try {
        return standin::ProjectFile::fileIn(path).string();
    } catch (const ProjectFileError& error) {
        throw Failure{path, faultIn(error, path),
                      error.remedy().empty() ? "give the project file in it" : error.remedy()};
    }
}

Failure readingFailure(const ProjectFileError& error, const std::string& file)
{
    return {file, faultIn(error, file),
            error.remedy().empty() ? "take an intact copy, or the version of Cadrel that wrote it" : error.remedy()};
}

Failure writingFailure(const ProjectFileError& error, const std::string& file)
{
    const std::string fault = faultIn(error, file);
    // Why a file can't be written the file system tells better.
    return fault == "can't be written"
               ? unwritable({file})
               : Failure{file, fault, error.remedy().empty() ? "correct the project" : error.remedy()};
}

ProjectClock clockOf(const standin::Project& project, const std::string& file)
{
    try {
        return {host::framerateOf(project.frameRate()), project.timeOrigin()};
    } catch (const util::Result::Type&) {
        throw Failure{file, "has a frame rate at which no timecode counts", "correct the rate"};
    }
}

SettingsReport::TimeText timeText(const standin::Project& project, const ProjectClock& clock)
{
    // The settings count by the project's clock, and the clock from the start of the project.
    return [&](double seconds) { return clock.exactTimecode(seconds - project.timeOrigin()); };
}

} // namespace cadrel::app
