// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/Autosave.h"

#include "desktop/document/DocumentError.h"
#include "desktop/document/FileBeside.h"
#include "standin/ardour/ArdourForm.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/FileFault.h"
#include "standin/stage/JsonMembers.h"
#include "util/FileReplacement.h"
#include "util/JsonText.h"
#include "util/Result.h"

#include <cstdint>
#include <fstream>
#include <system_error>
#include <utility>

namespace desktop {

namespace fs = std::filesystem;

using cadrel::util::FileReplacement;

namespace {

constexpr std::string_view FirstLine = "Cadrel autosave 1\n";
constexpr std::size_t LongestHeader = std::size_t{1} << 16U;
constexpr std::size_t HeaderDepth = 1;

void addMember(std::string& json, std::string_view key, std::string_view text)
{
    cadrel::util::appendJsonText(json.append(json.empty() ? "{" : ","), key);
    cadrel::util::appendJsonText(json.append(":"), text);
}

void addMember(std::string& json, std::string_view key, std::uint64_t number)
{
    cadrel::util::appendJsonText(json.append(json.empty() ? "{" : ","), key);
    json.append(":").append(std::to_string(number));
}

std::string headerOf(const fs::path& path, const ContentPrint& filePrint, std::string_view content, Autosave::Time time)
{
    const ContentPrint print = ContentPrint::of(content);
    const auto seconds = std::chrono::duration_cast<std::chrono::seconds>(time.time_since_epoch()).count();
    std::string json;
    addMember(json, "path", path.string());
    addMember(json, "form", standin::ArdourForm::recognises(content) ? "ardour" : "stage");
    addMember(json, "fileSize", filePrint.size);
    addMember(json, "fileHash", filePrint.hashText());
    addMember(json, "time", static_cast<std::uint64_t>(seconds));
    addMember(json, "size", print.size);
    addMember(json, "hash", print.hashText());
    return std::string(FirstLine).append(json).append("}\n");
}

std::uint64_t countOf(const standin::JsonMembers& members, std::string_view key)
{
    const std::optional<std::int64_t> count = members.get(key).integer();
    if (!count || *count < 0)
        throw standin::FileFault(std::string(key), "is no count");
    return static_cast<std::uint64_t>(*count);
}

ContentPrint printOf(const standin::JsonMembers& members, std::string_view sizeKey, std::string_view hashKey)
{
    const std::optional<std::uint64_t> hash = ContentPrint::hashOf(members.text(hashKey));
    if (!hash)
        throw standin::FileFault(std::string(hashKey), "is no hash");
    return {countOf(members, sizeKey), *hash};
}

Autosave::Time timeOf(const standin::JsonMembers& members, std::string_view key)
{
    constexpr auto Latest = std::chrono::floor<std::chrono::seconds>(Autosave::Time::max().time_since_epoch()).count();
    const std::uint64_t seconds = countOf(members, key);
    if (seconds > static_cast<std::uint64_t>(Latest))
        throw standin::FileFault(std::string(key), "is no time");
    return Autosave::Time(std::chrono::seconds(static_cast<std::int64_t>(seconds)));
}

/// Throws FileFault for what isn't whole.
Autosave parsed(std::string file)
{
    const std::size_t start = FirstLine.size();
    const std::size_t end = file.find('\n', start);
    if (!file.starts_with(FirstLine) || end == std::string::npos || end - start > LongestHeader)
        throw standin::FileFault("is no autosave");
    const standin::JsonDocument header(std::string_view(file).substr(start, end - start), HeaderDepth);
    const standin::JsonPlace place;
    const standin::JsonMembers members(header.root(), place);
    Autosave autosave;
    autosave.path = std::string(members.text("path"));
    autosave.form = members.text("form");
    autosave.filePrint = printOf(members, "fileSize", "fileHash");
    autosave.time = timeOf(members, "time");
    const ContentPrint whole = printOf(members, "size", "hash");
    file.erase(0, end + 1);
    if (ContentPrint::of(file) != whole)
        throw standin::FileFault("isn't whole");
    autosave.content = std::move(file);
    return autosave;
}

void replace(const fs::path& file, std::string_view header, std::string_view content)
{
    try {
        FileReplacement replacement(file);
        replacement.write(header);
        replacement.write(content);
        replacement.commit();
    } catch (const cadrel::util::Result::Type&) {
        throw DocumentError(file.string() + ": the autosave can't be written");
    }
}

/// Whether the file is an autosave, if not a whole one.
bool beginsLikeOne(const fs::path& file)
{
    std::string beginning(FirstLine.size(), '\0');
    std::ifstream stream(file, std::ios::binary);
    stream.read(beginning.data(), static_cast<std::streamsize>(beginning.size()));
    return stream.gcount() == static_cast<std::streamsize>(FirstLine.size()) && beginning == FirstLine;
}

/// Whether the name is that of an autosave, which links don't count as.
bool isOurs(const fs::path& file)
{
    std::error_code error;
    return fs::symlink_status(file, error).type() == fs::file_type::regular && beginsLikeOne(file);
}

} // namespace

fs::path Autosave::pathFor(const fs::path& project)
{
    return fileBeside(project, "", ".autosave");
}

std::optional<Autosave> Autosave::read(const fs::path& project)
{
    const fs::path file = pathFor(project);
    std::error_code error;
    if (!isOurs(file))
        return std::nullopt;
    const std::uintmax_t size = fs::file_size(file, error);
    if (error || size > standin::ProjectFile::LargestSize + LongestHeader)
        return std::nullopt;
    std::string content(size, '\0');
    std::ifstream stream(file, std::ios::binary);
    stream.read(content.data(), static_cast<std::streamsize>(content.size()));
    if (static_cast<std::size_t>(stream.gcount()) != content.size())
        return std::nullopt;
    try {
        return parsed(std::move(content));
    } catch (const standin::FileFault&) {
        return std::nullopt;
    }
}

void Autosave::write() const
{
    write(path, filePrint, content, time);
}

void Autosave::write(const fs::path& path, const ContentPrint& filePrint, std::string_view content, Time time)
{
    const fs::path file = pathFor(path);
    std::error_code error;
    if (fs::exists(fs::symlink_status(file, error)) && !isOurs(file))
        throw DocumentError(file.string() + ": is in the way of the autosave; give it another name");
    replace(file, headerOf(path, filePrint, content, time), content);
}

void Autosave::remove(const fs::path& project)
{
    const fs::path file = pathFor(project);
    std::error_code error;
    if (isOurs(file))
        fs::remove(file, error);
}

std::optional<fs::path> Autosave::keepAside(const fs::path& project)
{
    const fs::path file = pathFor(project);
    std::error_code error;
    if (!isOurs(file))
        return std::nullopt;
    const fs::path aside = asidePathFor(project);
    fs::rename(file, aside, error);
    return error ? std::nullopt : std::optional(aside);
}

fs::path Autosave::asidePathFor(const fs::path& project)
{
    for (int number = 1;; ++number) {
        fs::path aside = fileBeside(project, "", std::string(".autosave-").append(std::to_string(number)));
        std::error_code error;
        if (!fs::exists(fs::symlink_status(aside, error)))
            return aside;
    }
}

void Autosave::writeAside(const fs::path& path, const ContentPrint& filePrint, std::string_view content, Time time)
{
    replace(asidePathFor(path), headerOf(path, filePrint, content, time), content);
}

} // namespace desktop
