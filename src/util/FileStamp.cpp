// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/FileStamp.h"

#include <sys/stat.h>

namespace cadrel::util {

FileStamp FileStamp::of(const std::filesystem::path& file)
{
    struct stat state {};
    if (::stat(file.c_str(), &state) != 0)
        return {};
    return {true,
            static_cast<std::uint64_t>(state.st_dev),
            static_cast<std::uint64_t>(state.st_ino),
            static_cast<std::uint64_t>(state.st_size),
            static_cast<std::int64_t>(state.st_mtim.tv_sec),
            static_cast<std::int64_t>(state.st_mtim.tv_nsec)};
}

} // namespace cadrel::util
