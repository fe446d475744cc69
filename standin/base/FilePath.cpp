// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/base/FilePath.h"

#include <string_view>

namespace standin {

using namespace Velmark;

namespace {

bool fits(std::u16string_view path)
{
    return path.size() < static_cast<std::size_t>(IFilePath::Capacity);
}

} // namespace

int32 FilePath::setPath(const char16_t* path, int32 /*flags*/)
{
    if (!path || !fits(path))
        return ResultFalse;
    m_path = path;
    return ResultOk;
}

int32 FilePath::getPath(char16_t* buffer)
{
    if (!buffer || !fits(m_path))
        return ResultFalse;
    buffer[m_path.copy(buffer, m_path.size())] = u'\0';
    return ResultOk;
}

} // namespace standin
