// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/WriteObstacle.h"

#include <fcntl.h>
#include <system_error>
#include <unistd.h>

namespace cadrel::util {

namespace fs = std::filesystem;

namespace {

bool mayWrite(const fs::path& path)
{
    return ::faccessat(AT_FDCWD, path.c_str(), W_OK, AT_EACCESS) == 0;
}

} // namespace

std::optional<WriteObstacle> WriteObstacle::of(const fs::path& file)
{
    std::error_code error;
    if (fs::is_directory(file, error))
        return WriteObstacle{"is a folder", "give the name of a file in it"};
    const fs::path parent = file.parent_path();
    const fs::path folder = parent.empty() ? fs::path(".") : parent;
    if (!fs::exists(folder, error))
        return WriteObstacle{"the folder does not exist", "make it or give another"};
    if (!fs::is_directory(folder, error))
        return WriteObstacle{"what should be the folder is a file", "give another name"};
    if (file.filename().string().size() > LongestFileName)
        return WriteObstacle{"the name is too long", "give a shorter one"};
    const bool exists = fs::exists(file, error);
    if (exists && !mayWrite(file))
        return WriteObstacle{"is protected against writing", "give another name"};
    const bool isReplaced = !exists || fs::is_regular_file(file, error);
    if (isReplaced && !mayWrite(folder))
        return WriteObstacle{"you may not write into the folder", "give another folder"};
    if (!isReplaced)
        return WriteObstacle{"can't be written", "see whether the disk is full"};
    return std::nullopt;
}

} // namespace cadrel::util
