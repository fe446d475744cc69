// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/RecentFiles.h"

#include "standin/base/Text.h"
#include "standin/project/FileFault.h"
#include "standin/stage/JsonMembers.h"
#include "util/FileReplacement.h"
#include "util/JsonText.h"
#include "util/Result.h"

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <string>
#include <string_view>
#include <system_error>

namespace desktop {

namespace fs = std::filesystem;

namespace {

constexpr std::uintmax_t LargestSize = std::uintmax_t{1} << 20U; // bytes
constexpr std::size_t Depth = 16;                                // of what is passed over
constexpr const char* Key = "recent";

/// An absolute path in the environment; the standard for these folders has no others.
fs::path folderIn(const char* variable)
{
    const char* const value = std::getenv(variable);
    return value && fs::path(value).is_absolute() ? fs::path(value) : fs::path();
}

bool canBeKept(std::string_view path)
{
    return !path.empty() && path.find('\0') == std::string_view::npos && fs::path(path).is_absolute();
}

} // namespace

fs::path RecentFiles::defaultFile()
{
    fs::path state = folderIn("XDG_STATE_HOME");
    if (state.empty() && !folderIn("HOME").empty())
        state = folderIn("HOME") / ".local" / "state";
    return state.empty() ? state : state / "cadrel" / "recent.json";
}

std::vector<RecentFiles::Entry> RecentFiles::entries() const
{
    std::vector<Entry> entries;
    for (const fs::path& path : read()) {
        std::error_code error;
        entries.push_back({path, !fs::is_regular_file(path, error)});
    }
    return entries;
}

bool RecentFiles::add(const fs::path& path)
{
    if (!standin::isWellFormed(path.string()) || !canBeKept(path.native()))
        return false;
    Paths paths = read();
    std::erase(paths, path);
    paths.insert(paths.begin(), path);
    if (paths.size() > Most)
        paths.resize(Most);
    return write(paths);
}

bool RecentFiles::remove(const fs::path& path)
{
    Paths paths = read();
    return std::erase(paths, path) > 0 && write(paths);
}

bool RecentFiles::clear()
{
    return write({});
}

RecentFiles::Paths RecentFiles::read() const
{
    Paths paths;
    std::error_code error;
    if (m_file.empty() || !fs::is_regular_file(m_file, error) || fs::file_size(m_file, error) > LargestSize || error)
        return paths;
    std::ifstream stream(m_file, std::ios::binary);
    const std::string text{std::istreambuf_iterator<char>(stream), {}};
    try {
        const standin::JsonDocument document(text, Depth);
        const standin::JsonPlace place;
        const standin::JsonMembers members(document.root(), place);
        members.forEach(Key, [&](standin::JsonValue value, const standin::JsonPlace&) {
            if (!value.isText() || !canBeKept(value.text()) || paths.size() == Most)
                return;
            const fs::path path(value.text());
            if (std::ranges::find(paths, path) == paths.end())
                paths.push_back(path);
        });
    } catch (const standin::FileFault&) {
        // The next one that is opened makes a new list.
    }
    return paths;
}

bool RecentFiles::write(const Paths& paths) const
{
    if (m_file.empty())
        return false;
    std::string json = std::string("{\"").append(Key).append("\": [");
    for (const fs::path& path : paths)
        cadrel::util::appendJsonText(json.append(&path == paths.data() ? "\n  " : ",\n  "), path.string());
    json.append("\n]}\n");
    std::error_code error;
    fs::create_directories(m_file.parent_path(), error);
    try {
        cadrel::util::FileReplacement replacement(m_file);
        replacement.write(json);
        replacement.commit();
        return true;
    } catch (const cadrel::util::Result::Type&) {
        return false;
    }
}

} // namespace desktop
