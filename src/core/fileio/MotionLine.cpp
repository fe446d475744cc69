// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/fileio/MotionLine.h"

#include "util/StringUtil.h"

#include <algorithm>

namespace cadrel::core::fileio {

using util::StringUtil;

namespace {

constexpr std::string_view Key = "M2";
constexpr std::string_view Blanks = " \t";

/// Takes the last column off a text without blanks at its ends.
std::string_view takeLast(std::string_view& text)
{
    const std::size_t blank = text.find_last_of(Blanks);
    const std::string_view column = text.substr(blank == std::string_view::npos ? 0 : blank + 1);
    text = StringUtil::trimView(text.substr(0, text.size() - column.size()));
    return column;
}

/// Digits with at most one point, after a sign or none.
bool isSpeed(std::string_view text)
{
    if (text.starts_with('-') || text.starts_with('+'))
        text.remove_prefix(1);
    return text.find_first_not_of("0123456789.") == std::string_view::npos && std::ranges::count(text, '.') <= 1 &&
           text.find_first_of("0123456789") != std::string_view::npos;
}

} // namespace

bool MotionLine::isOne(std::string_view line)
{
    return line.starts_with(Key) && line.size() > Key.size() && Blanks.find(line[Key.size()]) != std::string_view::npos;
}

MotionLine::MotionLine(std::string_view line)
{
    std::string_view rest = StringUtil::trimView(line.substr(Key.size()));
    std::string_view speed = takeLast(rest);
    start = Timecode::parse(speed);
    if (start)
        speed = takeLast(rest);
    roll = rest;
    isReadable = isSpeed(speed);
    isBackwards = isReadable && speed.front() == '-' && speed.find_first_of("123456789") != std::string_view::npos;
}

} // namespace cadrel::core::fileio
