// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/console/Failure.h"
#include "app/edl/ProjectClock.h"
#include "app/settings/SettingsReport.h"

#include <string>

namespace standin {
class Project;
class ProjectFileChanged;
class ProjectFileError;
} // namespace standin

namespace cadrel::app {

class Terminal;

/// Throws Failure when the name can't be that of a project that may be read.
void requireReadableProject(const std::string& file);

/// Reads a project that stays to the end of the program. Throws Failure.
standin::Project& readProject(const std::string& file, Terminal& terminal);

/// The file that is meant by a path on the command line: a folder stands for the only session in it. Throws Failure.
std::string projectFileIn(const std::string& path);

/// The fault alone: the error begins with the name of the file, in as many bytes, as a failure does.
std::string faultIn(const standin::ProjectFileError& error, const std::string& file);

/// What an error in reading or writing a project file means for the user.
Failure readingFailure(const standin::ProjectFileError& error, const std::string& file);
Failure writingFailure(const standin::ProjectFileError& error, const std::string& file);

/// Throws Failure for a project with a rate at which there is no timecode.
ProjectClock clockOf(const standin::Project& project, const std::string& file);

/// How a report writes the times of its settings. Both outlive it.
SettingsReport::TimeText timeText(const standin::Project& project, const ProjectClock& clock);

} // namespace cadrel::app
