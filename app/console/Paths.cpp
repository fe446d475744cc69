// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/Paths.h"

#include "app/console/Printable.h"
#include "util/FilePath.h"
#include "util/Result.h"
#include "util/StringUtil.h"
#include "util/WriteObstacle.h"

#include <algorithm>
#include <cstdint>
#include <filesystem>
#include <optional>
#include <system_error>
#include <unistd.h>

namespace cadrel::app {

namespace fs = std::filesystem;

namespace {

/// Bytes. The list of a feature film has a hundredth of it.
constexpr std::uintmax_t LargestEdl = std::uintmax_t{256} * 1024 * 1024;

/// Where a file would be written, in one form for all its names. Empty where that isn't known.
fs::path placeOf(const std::string& file)
{
    try {
        std::error_code error;
        return fs::weakly_canonical(fs::absolute(util::followLinks(file), error), error);
    } catch (const util::Result::Type&) {
        return {};
    }
}

} // namespace

std::wstring toWide(const std::string& path)
{
    if (!isUtf8(path))
        throw Failure{path, "the name is no UTF-8 text", "rename the file or its folder"};
    return util::StringUtil::toWide(path);
}

std::string fileNameOf(const std::string& path)
{
    return fs::path(path).filename().string();
}

bool isSameFile(const std::string& a, const std::string& b)
{
    std::error_code error;
    const bool aExists = fs::exists(a, error);
    const bool bExists = fs::exists(b, error);
    if (aExists && bExists)
        return fs::is_regular_file(a, error) && fs::equivalent(a, b, error);
    if (aExists || bExists)
        return false;
    const fs::path placeOfA = placeOf(a);
    return !placeOfA.empty() && placeOfA == placeOf(b);
}

void refuseToOverwrite(const std::vector<std::string>& files, const std::string& output)
{
    const auto same = [&output](const std::string& file) { return isSameFile(file, output); };
    if (std::any_of(files.begin(), files.end(), same))
        throw UsageError{output + ": writing it would overwrite another file of this run", "give another name"};
}

void requireEdlSize(const std::string& path)
{
    std::error_code error;
    if (!fs::is_regular_file(path, error))
        return;
    const std::uintmax_t size = fs::file_size(path, error);
    if (!error && size > LargestEdl)
        throw Failure{path, "is larger than 256 MB, which no EDL is", "give the CMX EDL of a picture track"};
}

Failure unreadable(const std::string& path, FileKind kind)
{
    const bool wantsEdl = kind == FileKind::Edl;
    std::error_code error;
    const fs::file_status status = fs::status(path, error);
    switch (status.type()) {
    case fs::file_type::not_found:
        return {path, "no such file", "check the name and the folder"};
    case fs::file_type::directory:
        return {path, "is a folder", wantsEdl ? "give the EDL files in it" : "give the project file in it"};
    case fs::file_type::character:
    case fs::file_type::block:
        return {path, "is a device", wantsEdl ? "give an EDL file" : "give a project file"};
    case fs::file_type::fifo:
    case fs::file_type::socket:
        return {path, "is a pipe", "write it into a file first"};
    case fs::file_type::none:
        return {path, "can't be reached: " + error.message(), "check the name and the folder"};
    default:
        break;
    }
    if (access(path.c_str(), R_OK) != 0)
        return {path, "you may not read it", "ask its owner for the right to read"};
    return {path, "can't be read to its end", "check the disk or copy the file anew"};
}

Failure unwritable(const std::vector<std::string>& paths)
{
    for (const std::string& path : paths) {
        if (const std::optional<util::WriteObstacle> obstacle = util::WriteObstacle::of(path))
            return {path, obstacle->problem, obstacle->remedy};
    }
    return {paths.front(), "can't be written", "see whether the disk is full, or give another name"};
}

Failure writtenMeanwhile(const std::string& path)
{
    return {path, "another program has written it meanwhile", "look at what it has written, and run again"};
}

} // namespace cadrel::app
