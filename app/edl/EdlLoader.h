// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/edl/FileShifts.h"
#include "app/edl/UnreadOfFile.h"
#include "core/edl/EventList.h"
#include "core/fileio/FileRemarks.h"
#include "core/fileio/SourceLine.h"
#include "core/time/Framerate.h"

#include <list>
#include <optional>
#include <string>
#include <vector>

namespace cadrel::app {

class Terminal;
struct Failure;

struct LoadOptions {
    std::string rateLabel;    ///< one of ProjectFramerate::Labels; empty: what the first file shows
    bool renameBRolls = true; ///< "A001B" is "A001" if the file has that too
    bool acceptAudio = false; ///< events of audio channels are no flaw
    bool strict = false;      ///< a warning is a failure
    FileShifts shifts;        ///< what is moved while it is read
    FileShifts::Times shiftedTimes = FileShifts::Times::Destination;
    bool refusesSameTimecodes = false; ///< two files of one cut on the same timecode are a failure, not a warning
    /// What the user can do about a file that doesn't fit the rate.
    std::string rateAdvice = "check the file or give another --rate";
};

struct LoadedEdl {
    std::string path;
    core::EventList events;
    core::Framerate shown;                            ///< the rate that the file shows; may be unknown
    std::optional<core::fileio::SourceLine> rateLine; ///< the line that says so; nothing where only timecodes show it
    core::fileio::FileRemarks remarks;
};

/// Reads EDL files one by one, each into a list of its own. Warns of lines that can't be read, and of files that don't fit
/// the project's rate.
class EdlLoader {
public:
    EdlLoader(const LoadOptions& options, Terminal& terminal) : m_options(options), m_terminal(terminal) {}

    /// The rate under which all files are to be read: that of the label, else that which `firstFile` shows.
    /// Throws Failure when it shows none.
    core::Framerate chooseRate(const std::string& firstFile) const;

    /// Reads the files in order under the rate of the installed ProjectFramerate; a file that is named twice is read
    /// once. Throws Failure for a file that can't be read or has no events.
    std::list<LoadedEdl> load(const std::vector<std::string>& files) const;

    /// Throws Failure when no event of the file can be read as picture.
    static void refuseUnreadable(const LoadedEdl& edl);

private:
    void load(LoadedEdl& edl) const;
    void tellUnread(const LoadedEdl& edl) const;
    void checkRate(const LoadedEdl& edl) const;
    /// Warns where a few timecodes alone show the highest rate and all of them exist at a lower one, too.
    void warnOfLikeRates(const std::string& file, const core::Framerate& judged) const;
    void checkLowerRate(const LoadedEdl& edl) const;
    void checkDropFrame(const LoadedEdl& edl) const;
    void tell(const Failure& failure) const;

    LoadOptions m_options;
    Terminal& m_terminal;
};

} // namespace cadrel::app
