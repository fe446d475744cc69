// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/fileio/EventLine.h"

#include "util/StringUtil.h"

#include <algorithm>

namespace cadrel::core::fileio {

namespace {

/// Takes the next column off the front of `rest`; nothing when there is none. A column that has only tabs counts as an
/// empty column.
template <class IsSeparator>
std::optional<std::string_view> takeColumn(std::string_view& rest, IsSeparator isSeparator)
{
    const auto start = std::find_if_not(rest.begin(), rest.end(), isSeparator);
    const auto end = std::find_if(start, rest.end(), isSeparator);
    const std::string_view column(start, end);
    rest = std::string_view(end, rest.end());
    if (column.empty())
        return std::nullopt;
    return util::StringUtil::trimView(column);
}

std::optional<TransitionType::Type> transitionTypeOf(std::string_view column)
{
    switch (column.empty() ? '\0' : column.front()) {
    case 'C':
        return TransitionType::Cut;
    case 'D':
        return TransitionType::Dissolve;
    case 'W':
        return TransitionType::Wipe;
    default:
        return std::nullopt;
    }
}

} // namespace

EventLine::EventLine(std::string_view line, Separators separators)
{
    const bool alsoTabs = separators == Separators::BlanksAndTabs;
    const auto isSeparator = [alsoTabs](char character) { return character == ' ' || (alsoTabs && character == '\t'); };
    const auto take = [&](std::string_view& column) {
        const std::optional<std::string_view> found = takeColumn(line, isSeparator);
        column = found.value_or(std::string_view());
        return found.has_value();
    };

    std::string_view transition;
    if (!take(number) || !take(rollName) || !take(channel) || !take(transition))
        return;
    transitionType = transitionTypeOf(transition);
    if (transitionType == TransitionType::Dissolve || transitionType == TransitionType::Wipe) {
        duration.emplace();
        if (!take(*duration))
            return;
    }
    while (timecodeCount < timecodes.size() && take(timecodes[timecodeCount]))
        ++timecodeCount;
}

EventLine EventLine::withTabs(std::string_view line)
{
    const EventLine columns(line);
    if (columns.isComplete())
        return columns;
    const EventLine tabbed(line, Separators::BlanksAndTabs);
    return tabbed.isComplete() ? tabbed : columns;
}

std::size_t EventLine::lengthIn(std::string_view line) const
{
    const std::string_view last = timecodes.back();
    return static_cast<std::size_t>(last.data() + last.size() - line.data());
}

} // namespace cadrel::core::fileio
