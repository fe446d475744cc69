// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/file/MediaMove.h"

#include "standin/base/Utf16.h"
#include "standin/project/Project.h"

#include <system_error>

namespace standin {

namespace fs = std::filesystem;

namespace {

/// Where the file is looked for: in the place that the path tells, and beside the project.
fs::path placeOf(const std::string& path, const fs::path& folder)
{
    const fs::path told = (folder / path).lexically_normal();
    const fs::path beside = folder / path.substr(path.find_last_of("/\\") + 1);
    std::error_code error;
    return !fs::exists(told, error) && fs::exists(beside, error) ? beside : told;
}

/// What is absolute, or absolute on another system, means the same file from everywhere.
bool beginsAtTheProject(const std::string& path)
{
    return !path.empty() && fs::path(path).is_relative() && path.find('\\') == std::string::npos;
}

} // namespace

fs::path mediaPathFrom(const fs::path& folder, const fs::path& file)
{
    const fs::path within = file.lexically_relative(folder);
    const bool isWithin = !within.empty() && *within.begin() != "..";
    return isWithin ? within : file;
}

MediaMove::MediaMove(Project& project, const fs::path& newFile) : m_project(project)
{
    const fs::path from = fs::path(toUtf8(project.path())).parent_path();
    const fs::path to = newFile.parent_path();
    if (from.empty() || from.lexically_normal() == to.lexically_normal())
        return;
    for (const auto& [number, clip] : project.pool().clips()) {
        const std::string path = toUtf8(clip->path());
        if (!beginsAtTheProject(path))
            continue;
        m_former.emplace(number, clip->path());
        clip->setPath(toUtf16(mediaPathFrom(to.lexically_normal(), placeOf(path, from)).string()));
    }
}

MediaMove::~MediaMove()
{
    for (auto& [number, path] : m_former)
        m_project.pool().clipWith(number)->setPath(std::move(path));
}

} // namespace standin
