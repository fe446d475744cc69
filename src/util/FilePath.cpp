// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/FilePath.h"

#include "util/Result.h"
#include "util/StringUtil.h"

#include <system_error>

namespace cadrel::util {

namespace {

/// The system itself follows as many.
constexpr int MostLinks = 40;

} // namespace

std::filesystem::path toFilePath(const std::wstring& name)
{
    const std::string utf8 = StringUtil::toUtf8(name);
    if (utf8.find('\0') != std::string::npos)
        throw Result::FileAccessFailed;
    return std::u8string(utf8.begin(), utf8.end());
}

std::filesystem::path followLinks(std::filesystem::path path)
{
    std::error_code error;
    for (int count = 0; std::filesystem::is_symlink(path, error); ++count) {
        const std::filesystem::path next = std::filesystem::read_symlink(path, error);
        if (error || count == MostLinks)
            throw Result::FileAccessFailed;
        path = path.parent_path() / next;
    }
    return path;
}

} // namespace cadrel::util
