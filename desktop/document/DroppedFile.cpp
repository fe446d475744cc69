// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/DroppedFile.h"

#include "standin/file/ProjectFile.h"

#include <algorithm>
#include <fstream>
#include <string>
#include <system_error>

namespace desktop {

namespace fs = std::filesystem;

namespace {

constexpr std::size_t BeginningSize = std::size_t{1} << 16U;

bool isDigit(char byte)
{
    return byte >= '0' && byte <= '9';
}

/// Whether the text begins with a timecode, such as 01:00:10:05 or 01:00:10;05.
bool beginsWithTimecode(std::string_view text)
{
    constexpr std::size_t Size = 11;
    if (text.size() < Size || (text.size() > Size && isDigit(text[Size])))
        return false;
    for (std::size_t index = 0; index < Size; ++index) {
        const bool isSeparator = index % 3 == 2;
        if (isSeparator ? std::string_view(":;.,").find(text[index]) == std::string_view::npos : !isDigit(text[index]))
            return false;
    }
    return true;
}

/// An event begins with its number and has four timecodes: source in and out, record in and out.
bool isEvent(std::string_view line)
{
    line.remove_prefix(std::min(line.find_first_not_of(" \t"), line.size()));
    const auto number = static_cast<std::size_t>(std::ranges::find_if_not(line, isDigit) - line.begin());
    if (number == 0 || number == line.size() || (line[number] != ' ' && line[number] != '\t'))
        return false;
    int count = 0;
    for (std::size_t index = 0; index < line.size(); ++index) {
        if ((index == 0 || !isDigit(line[index - 1])) && beginsWithTimecode(line.substr(index)))
            ++count;
    }
    return count >= 4;
}

bool isEdl(std::string_view text)
{
    if (text.starts_with("TITLE:"))
        return true;
    while (!text.empty()) {
        const std::size_t end = std::min(text.find_first_of("\r\n"), text.size());
        if (isEvent(text.substr(0, end)))
            return true;
        text.remove_prefix(std::min(end + 1, text.size()));
    }
    return false;
}

/// Each form begins so; the whole of it is told when it is opened.
bool isProject(std::string_view text)
{
    const std::size_t head = 1024;
    const std::string_view beginning = text.substr(0, head);
    if (text.starts_with('<'))
        return beginning.find("<Session") != std::string_view::npos;
    return text.starts_with('{') && beginning.find("\"format\"") != std::string_view::npos &&
           beginning.find("\"stage\"") != std::string_view::npos;
}

} // namespace

DroppedFile droppedFile(const fs::path& path)
{
    std::error_code error;
    if (fs::is_directory(path, error)) {
        try {
            standin::ProjectFile::fileIn(path);
            return DroppedFile::Project;
        } catch (const standin::ProjectFileError&) {
            return DroppedFile::Other;
        }
    }
    // A pipe isn't waited for.
    if (!fs::is_regular_file(path, error))
        return DroppedFile::Other;
    std::string beginning(BeginningSize, '\0');
    std::ifstream stream(path, std::ios::binary);
    stream.read(beginning.data(), static_cast<std::streamsize>(beginning.size()));
    beginning.resize(static_cast<std::size_t>(stream.gcount()));
    return droppedFileOf(beginning);
}

DroppedFile droppedFileOf(std::string_view beginning)
{
    if (beginning.starts_with("\xEF\xBB\xBF"))
        beginning.remove_prefix(3);
    const std::size_t first = beginning.find_first_not_of(" \t\r\n");
    if (first == std::string_view::npos)
        return DroppedFile::Other;
    beginning.remove_prefix(first);
    if (isProject(beginning))
        return DroppedFile::Project;
    return isEdl(beginning) ? DroppedFile::Edl : DroppedFile::Other;
}

} // namespace desktop
