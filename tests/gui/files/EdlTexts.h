// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace cadrel::tests {

/// The line of an event in a CMX EDL, such as edlLine("001", "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00").
inline std::string edlLine(const std::string& number, const std::string& timecodes, const std::string& roll = "A001",
                           const std::string& kind = "V     C       ")
{
    return number + "  " + roll + " " + kind + " " + timecodes + "\n";
}

/// Five seconds at the start of the second hour, from the eleventh hour of the source.
inline std::string fiveSecondsEdl()
{
    return edlLine("001", "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00");
}

/// The ten seconds after that, from a later place of the source.
inline std::string tenSecondsEdl()
{
    return edlLine("001", "12:00:00:00 12:00:10:00 01:00:05:00 01:00:15:00");
}

/// An event that can be read, but not at 25 frames a second.
inline std::string invalidEdl()
{
    return "FCM: NON-DROP FRAME\n" + edlLine("001", "10:00:00:00 10:00:05:00 01:00:00:00 01:61:05:00");
}

} // namespace cadrel::tests
