// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/UnreadOfFile.h"

#include "app/console/Printable.h"
#include "app/console/Wording.h"

namespace cadrel::app {

using core::fileio::SourceLine;
using core::fileio::UnreadLine;
using nlohmann::ordered_json;

namespace {

/// A line of a file, shown in a message.
constexpr std::size_t MostCharactersOfALine = 120;

std::string numberOf(const SourceLine& line)
{
    return "line " + std::to_string(line.number);
}

std::string quotedTextOf(const SourceLine& line)
{
    return app::quoted(toPrintable(line.text, MostCharactersOfALine).text);
}

} // namespace

std::string quoted(const SourceLine& line)
{
    return numberOf(line) + ": " + quotedTextOf(line);
}

std::string textOf(const UnreadLine& line)
{
    return numberOf(line.line) + " " + line.problem + ": " + quotedTextOf(line.line);
}

std::size_t countOf(const std::vector<UnreadOfFile>& unread)
{
    std::size_t count = 0;
    for (const UnreadOfFile& file : unread)
        count += file.lines.size();
    return count;
}

ordered_json toJson(const std::vector<UnreadOfFile>& unread)
{
    ordered_json lines = ordered_json::array();
    for (const auto& [file, unreadLines] : unread) {
        for (const auto& [line, problem] : unreadLines)
            lines.push_back({{"file", file}, {"line", line.number}, {"problem", problem}, {"text", line.text}});
    }
    return lines;
}

} // namespace cadrel::app
