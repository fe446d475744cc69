// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <array>
#include <cstdio>
#include <string>

namespace cadrel::tests {

/// A line of an EDL for a cut of picture.
inline std::string cut(const std::string& number, const std::string& roll, const std::string& source,
                       const std::string& destination)
{
    return number + "  " + roll + "  V  C  " + source + " " + destination + "\n";
}

inline std::string clipName(const std::string& name)
{
    return "* FROM CLIP NAME: " + name + "\n";
}

/// A film of three shots at 24 frames a second:
///
///     01:00:00:00      01:00:10:00      01:00:20:00      01:00:30:00
///     |------ A001 ONE ------|------ A002 TWO -----|---- A003 THREE ----|
inline std::string oldCut()
{
    return "TITLE: OLD\n" + cut("001", "A001", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00") + clipName("ONE") +
           cut("002", "A002", "11:00:00:12 11:00:10:12", "01:00:10:00 01:00:20:00") + clipName("TWO") +
           cut("003", "A003", "12:00:00:00 12:00:10:00", "01:00:20:00 01:00:30:00") + clipName("THREE");
}

/// The same film after a re-edit: TWO has lost its first two seconds, and four seconds of a new shot stand before
/// THREE.
///
///     01:00:00:00      01:00:10:00     01:00:18:00  01:00:22:00      01:00:32:00
///     |------ A001 ONE ------|--- A002 TWO ---|-- B009 NEW --|---- A003 THREE ----|
inline std::string newCut()
{
    return "TITLE: NEW\n" + cut("001", "A001", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00") + clipName("ONE") +
           cut("002", "A002", "11:00:02:12 11:00:10:12", "01:00:10:00 01:00:18:00") + clipName("TWO") +
           cut("003", "B009", "05:00:00:00 05:00:04:00", "01:00:18:00 01:00:22:00") + clipName("NEW") +
           cut("004", "A003", "12:00:00:00 12:00:10:00", "01:00:22:00 01:00:32:00") + clipName("THREE");
}

/// The timecode so many seconds after 01:00:00:00.
inline std::string secondsOn(int seconds)
{
    std::array<char, 40> text{};
    std::snprintf(text.data(), text.size(), "%02d:%02d:%02d:00", 1 + seconds / 3600, seconds / 60 % 60, seconds % 60);
    return text.data();
}

/// So many shots of one second, each on a roll of its own.
inline std::string manyShots(int count)
{
    std::string text;
    for (int shot = 0; shot < count; ++shot)
        text += cut("001", std::string("R").append(std::to_string(shot)), "10:00:00:12 10:00:01:12",
                    secondsOn(shot) + " " + secondsOn(shot + 1));
    return text;
}

} // namespace cadrel::tests
