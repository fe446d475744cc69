// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/FileBeside.h"

#include "desktop/document/ContentPrint.h"
#include "util/WriteObstacle.h"

#include <string>

namespace desktop {

using cadrel::util::LongestFileName;

std::filesystem::path fileBeside(const std::filesystem::path& file, std::string_view before, std::string_view after)
{
    std::string name = file.filename().string();
    if (before.size() + name.size() + after.size() > LongestFileName) {
        const std::string hash = ContentPrint::of(name).hashText();
        std::size_t kept = LongestFileName - before.size() - after.size() - hash.size();
        // No character is cut apart.
        while (kept > 0 && (static_cast<unsigned char>(name[kept]) & 0xC0U) == 0x80U)
            --kept;
        name = name.substr(0, kept).append(hash);
    }
    return file.parent_path() / std::string(before).append(name).append(after);
}

} // namespace desktop
