// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/support/TempFolder.h"

#include <functional>
#include <string>
#include <vector>

namespace cadrel::tests {

/// What a run of the program gave.
struct Outcome {
    int status = -1; ///< the exit status; -1 when a signal ended it
    std::string out;
    std::string err;
};

/// Runs `cadrel` with the arguments and standard output caught, or going to `outPath` if given. Standard input is
/// empty, and neither output is a terminal.
Outcome runCadrel(const std::vector<std::string>& arguments, const std::string& outPath = {});

/// Likewise any program.
Outcome runProgram(const std::string& program, const std::vector<std::string>& arguments);

/// Runs `cadrel` as a user without root's rights: as "nobody" where the tests themselves run as root.
Outcome runCadrelUnprivileged(const std::vector<std::string>& arguments);
/// Runs `cadrel` and interrupts it, as Ctrl-C does, once it has begun to write a file beside others in `folder`, if it
/// doesn't end before.
Outcome runCadrelInterrupted(const std::vector<std::string>& arguments, const TempFolder& folder);
/// Makes that user the owner of a file or folder.
void giveToUnprivileged(const std::filesystem::path& path);

/// Runs `cadrel` with both outputs on a terminal; what it showed stands in `out`. `environment` is added to what is
/// set for the run, such as "NO_COLOR=1".
Outcome runCadrelOnTerminal(const std::vector<std::string>& arguments, const std::string& environment = {});
/// Likewise on one that has so many columns.
Outcome runCadrelOnNarrowTerminal(const std::vector<std::string>& arguments, unsigned short columns);
/// Likewise, and interrupts it, as Ctrl-C does, as soon as it shows the text.
Outcome runCadrelInterruptedAt(const std::string& text, const std::vector<std::string>& arguments);
/// Likewise, but does something else once it shows the text.
Outcome runCadrelDisturbedAt(const std::string& text, const std::vector<std::string>& arguments,
                             const std::function<void()>& disturb);

} // namespace cadrel::tests
