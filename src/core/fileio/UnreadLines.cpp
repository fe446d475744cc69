// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/fileio/UnreadLines.h"

#include "core/fileio/MotionLine.h"
#include "util/StringUtil.h"

#include <algorithm>

namespace cadrel::core::fileio {

using util::StringUtil;

namespace {

/// Enough to recognise a line by.
constexpr std::size_t MostBytesOfALine = 512;

/// An event has four timecodes with three separators each. One of its timecodes may be broken.
constexpr std::size_t FewestSeparatorsOfAnEvent = 9;

bool isDigit(char character)
{
    return character >= '0' && character <= '9';
}

/// Whether the text holds the timecodes of an event.
bool holdsAnEvent(std::string_view text)
{
    std::size_t separators = 0;
    for (std::size_t place = 1; place + 1 < text.size() && separators < FewestSeparatorsOfAnEvent; ++place) {
        const bool isSeparator = text[place] == ':' || text[place] == ';';
        if (isSeparator && isDigit(text[place - 1]) && isDigit(text[place + 1]))
            ++separators;
    }
    return separators == FewestSeparatorsOfAnEvent;
}

std::string_view withoutFront(std::string_view text, std::size_t count)
{
    return text.substr(std::min(count, text.size()));
}

/// An event line that was made a comment on purpose.
bool isCommentedOut(std::string_view comment)
{
    const std::string_view rest = StringUtil::trimView(withoutFront(comment, comment.find_first_not_of('*')));
    const std::string_view number = rest.substr(0, rest.find_first_of(" \t"));
    return !number.empty() && std::all_of(number.begin(), number.end(), isDigit);
}

/// Whether a number comes after bytes that nobody sees, such as a control character or a blank of another kind.
bool hidesANumber(std::string_view text)
{
    constexpr std::string_view NoBreakSpace = "\xC2\xA0";
    while (!text.empty()) {
        if (text.starts_with(NoBreakSpace))
            text.remove_prefix(NoBreakSpace.size());
        else if (static_cast<unsigned char>(text.front()) <= ' ' || text.front() == '\x7F')
            text.remove_prefix(1);
        else
            return isDigit(text.front());
    }
    return false;
}

/// Whether it is what the lines after an event say of it.
bool saysMoreOfAnEvent(std::string_view text)
{
    return MotionLine::isOne(text) || (text.starts_with('*') && text.find("CLIP NAME:") != std::string_view::npos);
}

/// The line ends within a line are all of the kind that the reader doesn't take for one.
char innerLineEndOf(std::string_view line)
{
    return line.find('\r') != std::string_view::npos ? '\r' : '\n';
}

std::string_view firstLineOf(std::string_view line)
{
    return line.substr(0, line.find(innerLineEndOf(line)));
}

} // namespace

bool UnreadLines::lookAfterEvent(std::string_view line, std::uint32_t number, std::size_t taken)
{
    const std::string_view first = firstLineOf(line);
    const std::size_t before = m_lines.size();
    if (holdsAnEvent(withoutFront(first, taken)))
        add(first, number, "holds a second event, which isn't read");
    lookAtFurther(line, number, taken);
    const bool isFound = m_lines.size() > before;
    if (!isFound && saysMoreOfAnEvent(StringUtil::trimView(withoutFront(first, taken))))
        add(first, number, "holds a clip name or a motion after the event, which isn't read");
    return isFound;
}

bool UnreadLines::lookAtDropped(std::string_view line, std::uint32_t number, const std::string& problem)
{
    add(firstLineOf(line), number, problem);
    lookAtFurther(line, number, 0);
    return true;
}

bool UnreadLines::lookAt(std::string_view line, std::uint32_t number, Kind kind)
{
    const std::string_view first = firstLineOf(line);
    const std::size_t before = m_lines.size();
    if (kind == Kind::Comment) {
        if (!isCommentedOut(first) && holdsAnEvent(first))
            add(first, number, "holds an event in a comment, which isn't read");
    } else if (hidesANumber(first)) {
        add(first, number, "begins with a character that can't be read");
    } else if (holdsAnEvent(first)) {
        add(first, number, "begins with no event number and isn't read");
    }
    lookAtFurther(line, number, 0);
    return m_lines.size() > before;
}

/// The lines after the first that stand in one line of the reader, because they end in another way than it expects.
void UnreadLines::lookAtFurther(std::string_view line, std::uint32_t number, std::size_t taken)
{
    const char lineEnd = innerLineEndOf(line);
    std::size_t end = line.find(lineEnd);
    while (end != std::string_view::npos) {
        const std::size_t start = end + 1;
        end = line.find(lineEnd, start);
        ++number;
        const std::string_view further = line.substr(start, end == std::string_view::npos ? end : end - start);
        if (holdsAnEvent(withoutFront(further, std::max(taken, start) - start)))
            add(further, number, "comes after a line end of another kind than the first and isn't read");
    }
}

void UnreadLines::add(std::string_view line, std::uint32_t number, const std::string& problem)
{
    m_lines.push_back({{number, std::string(StringUtil::trimView(line).substr(0, MostBytesOfALine))}, problem});
}

} // namespace cadrel::core::fileio
