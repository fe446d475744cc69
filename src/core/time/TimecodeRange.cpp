// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/time/TimecodeRange.h"

#include "util/Result.h"

namespace cadrel::core {

TimecodeRange::TimecodeRange(const Timecode& from, const Timecode& to) : start(from), end(to)
{
    if (end < start)
        throw util::Result::InvalidArgument;
}

TimecodeRange TimecodeRange::unite(const TimecodeRange& a, const TimecodeRange& b)
{
    return {b.start < a.start ? b.start : a.start, b.end > a.end ? b.end : a.end};
}

} // namespace cadrel::core
