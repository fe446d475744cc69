// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/FileWords.h"

#include "standin/file/ProjectFile.h"

namespace desktop {

std::string wordsOf(const standin::ProjectFileError& error)
{
    const std::string fault = error.what();
    return error.remedy().empty() ? fault : fault + "; " + error.remedy();
}

} // namespace desktop
