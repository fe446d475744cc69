// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <list>
#include <string>
#include <vector>

namespace cadrel::core {
class EventList;
} // namespace cadrel::core

namespace cadrel::app {

class Terminal;
struct LoadedEdl;

/// By how much the timecodes of some files are moved while they are read, so that files which all begin at the same
/// timecode can be given together.
class FileShifts {
public:
    /// Which times of an event are in the programme: those of an EDL, or of a change EDL.
    enum class Times { Destination, Both };

    /// Each text is "FILE=+TC" or "FILE=-TC", and the file one of `files`, by its path or its name alone. Throws
    /// UsageError.
    FileShifts(const std::vector<std::string>& texts, const std::vector<std::string>& files);
    FileShifts() = default;

    /// Moves the events of the file, at the rate of the project. Throws Failure when one would leave the day.
    void apply(const std::string& file, core::EventList& events, Times times) const;

private:
    struct Shift {
        std::string file;
        std::string timecode;
        bool isBackwards;
    };

    std::vector<Shift> m_shifts;
};

/// Tells when picture of two files lies on the same timecode, with the shift that parts them: throws Failure where that
/// is `refused`, and warns otherwise. Gives the names of the files that lie on what those before them take.
std::vector<std::string> requireParted(const std::list<LoadedEdl>& edls, bool isRefused, Terminal& terminal);

} // namespace cadrel::app
