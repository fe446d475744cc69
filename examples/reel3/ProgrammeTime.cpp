// SPDX-License-Identifier: GPL-3.0-or-later

#include "examples/reel3/ProgrammeTime.h"

#include <stdexcept>

namespace reel3 {

Quarters parseQuarters(const std::string& text)
{
    const std::size_t point = text.find('.');
    Quarters rest = 0;
    if (point != std::string::npos)
        rest = std::stol(text.substr(point + 1)) / 25;
    long seconds = 0;
    std::size_t begin = 0;
    for (std::size_t colon = text.find(':'); colon != std::string::npos; colon = text.find(':', begin)) {
        seconds = 60 * seconds + std::stol(text.substr(begin, colon - begin));
        begin = colon + 1;
    }
    return frames(24 * seconds + std::stol(text.substr(begin))) + rest;
}

Quarters parseTime(const std::string& timecode)
{
    return parseQuarters(timecode) - parseQuarters("03:00:00:00");
}

} // namespace reel3
