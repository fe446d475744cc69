// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/FilePath.h"

#include "util/Result.h"
#include "util/StringUtil.h"

namespace cadrel::util {

std::filesystem::path toFilePath(const std::wstring& name)
{
    const std::string utf8 = StringUtil::toUtf8(name);
    if (utf8.find('\0') != std::string::npos)
        throw Result::FileAccessFailed;
    return std::u8string(utf8.begin(), utf8.end());
}

} // namespace cadrel::util
