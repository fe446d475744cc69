// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"

#include <cstdint>
#include <memory>
#include <string>

namespace cadrel::tests {

/// A plain event of four timecodes such as "01:00:00:00". Needs a TestProject.
inline std::shared_ptr<core::EventBase> makeEvent(const std::string& roll, const char* srcIn, const char* srcOut,
                                                  const char* dstIn, const char* dstOut, std::uint32_t number = 0)
{
    auto event = std::make_shared<core::EventBase>();
    event->setRollName(roll);
    event->setTimecodes(core::Timecode(srcIn), core::Timecode(srcOut), core::Timecode(dstIn), core::Timecode(dstOut));
    event->setEventNumber(number);
    return event;
}

/// The four timecodes with a blank between: SRC IN, SRC OUT, DST IN, DST OUT.
inline std::string timecodesOf(const core::EventBase& event)
{
    return event.srcIn().toString() + " " + event.srcOut().toString() + " " + event.dstIn().toString() + " " +
           event.dstOut().toString();
}

} // namespace cadrel::tests
