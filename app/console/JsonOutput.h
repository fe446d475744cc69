// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/FileReplacement.h"

#include <optional>
#include <string>
#include <string_view>

namespace cadrel::app {

/// Where `--json` goes: standard output for "-", else a file, which appears only when all of it is written and is
/// removed again unless it is kept. Every failure is thrown as Failure.
class JsonOutput {
public:
    static bool isStandardOutput(const std::string& path) { return path == "-"; }
    /// Whether the user wants it, and in a file.
    static bool isFile(const std::string& path) { return !path.empty() && !isStandardOutput(path); }

    explicit JsonOutput(const std::string& path);

    void write(std::string_view text);
    /// Ends the writing.
    void finish();
    void keep();

private:
    template <class Action>
    void orUnwritable(Action action);

    std::string m_path;
    std::optional<util::FileReplacement> m_file; ///< nothing for standard output
};

/// Throws Failure when not everything could be written to standard output.
void flushStandardOutput();

} // namespace cadrel::app
