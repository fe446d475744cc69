// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/fileio/EventLine.h"

#include "util/StringUtil.h"

#include <algorithm>

namespace cadrel::core::fileio {

namespace {

/// Takes the next column off the front of `rest`; nothing when there is none. A column that has only tabs counts as an
/// empty column.
std::optional<std::string_view> takeColumn(std::string_view& rest)
{
    rest.remove_prefix(std::min(rest.find_first_not_of(' '), rest.size()));
    if (rest.empty())
        return std::nullopt;
    const std::string_view column = rest.substr(0, rest.find(' '));
    rest.remove_prefix(column.size());
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

EventLine::EventLine(std::string_view line)
{
    const auto take = [&line](std::string_view& column) {
        const std::optional<std::string_view> found = takeColumn(line);
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

} // namespace cadrel::core::fileio
