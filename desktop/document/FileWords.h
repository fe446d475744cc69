// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace standin {
class ProjectFileError;
}

namespace desktop {

/// What is wrong with a project file and, where that is known, what the user can do, in one line.
std::string wordsOf(const standin::ProjectFileError& error);

} // namespace desktop
