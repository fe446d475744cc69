// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/boxes/FileChoice.h"

#include <algorithm>
#include <cctype>
#include <string>
#include <system_error>

namespace desktop {

namespace fs = std::filesystem;

namespace {

std::string lowered(std::string text)
{
    std::transform(text.begin(), text.end(), text.begin(),
                   [](unsigned char letter) { return static_cast<char>(std::tolower(letter)); });
    return text;
}

} // namespace

bool fits(const fs::path& file, const FileFilters& filters)
{
    const std::string extension = lowered(file.extension().string());
    return filters.empty() || std::any_of(filters.begin(), filters.end(), [&](const auto& filter) {
               return extension == std::string(".").append(lowered(filter.extension));
           });
}

fs::path withExtension(const fs::path& file, const FileFilters& filters)
{
    if (file.filename().empty() || fits(file, filters))
        return file;
    fs::path whole = file;
    whole += '.';
    whole += filters.front().extension;
    return whole;
}

fs::path FolderMemory::startOf(const fs::path& wish) const
{
    std::error_code ignored;
    if (!wish.empty() && fs::is_directory(wish, ignored))
        return wish;
    return m_last;
}

void FolderMemory::remember(const fs::path& chosenFile)
{
    m_last = chosenFile.parent_path();
}

} // namespace desktop
