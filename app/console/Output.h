// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/FileReplacement.h"

#include <optional>
#include <string>
#include <string_view>

namespace cadrel::app {

/// Where a document goes: standard output for "-", else a file, which takes its place only when all of it is written. A file
/// that isn't put in its place is removed again. Every failure is thrown as Failure.
class Output {
public:
    static bool isStandardOutput(const std::string& path) { return path == "-"; }
    /// Whether the user wants it, and in a file.
    static bool isFile(const std::string& path) { return !path.empty() && !isStandardOutput(path); }

    /// With `mayReplace` false a file that comes up under the name meanwhile stays, and ending the writing fails.
    Output(const std::string& path, bool mayReplace);

    void write(std::string_view text);
    /// Ends the writing; then all of it is on the disk, and what stood in its place still stands there.
    void finish();
    /// Finishes, and puts the file in its place.
    void place();

private:
    template <class Action>
    void orUnwritable(Action action);

    std::string m_path;
    bool m_mayReplace;
    std::optional<util::FileReplacement> m_file; ///< nothing for standard output
};

/// Throws Failure when not everything could be written to standard output.
void flushStandardOutput();

} // namespace cadrel::app
