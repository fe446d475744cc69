// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/console/Failure.h"

#include <string>
#include <vector>

namespace cadrel::app {

/// A file name of the command line as the core takes it. Throws Failure for a name that is no UTF-8.
std::wstring toWide(const std::string& path);

/// What comes after the last slash.
std::string fileNameOf(const std::string& path);

/// Whether both paths name one regular file, or would when it is written; links are followed.
bool isSameFile(const std::string& a, const std::string& b);

/// Throws UsageError when writing `output` would overwrite one of the files.
void refuseToOverwrite(const std::vector<std::string>& files, const std::string& output);

/// What the user is asked for instead of a folder or a device.
enum class FileKind { Edl, Project };

/// Throws Failure for a file that is too large for an EDL.
void requireEdlSize(const std::string& path);

/// Why a file could not be read, or one of several not written, as far as the file system tells.
Failure unreadable(const std::string& path, FileKind kind = FileKind::Edl);
Failure unwritable(const std::vector<std::string>& paths);
/// For a file that a run doesn't replace, since another program has written it while it ran.
Failure writtenMeanwhile(const std::string& path);

} // namespace cadrel::app
