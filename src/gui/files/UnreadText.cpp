// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/files/UnreadText.h"

#include "util/FilledText.h"
#include "util/StringUtil.h"
#include "util/Utf8Text.h"

#include <algorithm>
#include <array>
#include <string_view>

namespace cadrel::gui {

using core::fileio::UnreadLine;
using util::StringUtil;

namespace {

/// What the reader says of a line, so that it stands in the table of translations.
constexpr std::array<std::wstring_view, 11> Problems{
    L"misses a field and isn't read",
    L"has a dissolve or wipe without a duration and isn't read",
    L"is a motion line whose speed can't be read",
    L"plays no event backwards, since none of its roll stands before it",
    L"is UTF-16 text and isn't read",
    L"holds a second event, which isn't read",
    L"holds a clip name or a motion after the event, which isn't read",
    L"holds an event in a comment, which isn't read",
    L"begins with a character that can't be read",
    L"begins with no event number and isn't read",
    L"comes after a line end of another kind than the first and isn't read",
};

/// Of a line's text.
constexpr std::size_t MostCharacters = 100;

std::wstring translatedProblem(const std::string& problem)
{
    const std::wstring text = util::toShownLine(problem);
    const bool isKnown = std::find(Problems.begin(), Problems.end(), text) != Problems.end();
    return isKnown ? StringUtil::translate(text) : text;
}

std::wstring quoted(const std::string& line)
{
    std::wstring text = util::toShownLine(line);
    if (text.size() > MostCharacters)
        text = text.substr(0, MostCharacters - 1) + L'\u2026';
    return L"\"" + text + L"\"";
}

std::wstring textOf(const UnreadLine& unread)
{
    return StringUtil::translate(L"Line") + L" " + std::to_wstring(unread.line.number) + L" " +
           translatedProblem(unread.problem) + L": " + quoted(unread.line.text);
}

} // namespace

std::wstring textOfUnread(const std::vector<UnreadLine>& lines, std::size_t mostLines)
{
    const std::size_t told = std::min(lines.size(), mostLines);
    std::wstring text;
    for (std::size_t index = 0; index < told; ++index)
        text += textOf(lines[index]) + L"\n";
    if (told < lines.size())
        text += util::filled(StringUtil::translate(L"and %s more"), std::to_wstring(lines.size() - told)) + L"\n";
    return text;
}

} // namespace cadrel::gui
