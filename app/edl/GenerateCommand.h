// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/edl/Generation.h"

#include <string>

namespace cadrel::app {

class Terminal;

struct GenerateOptions {
    GenerationOptions generation;
    std::string changeFile; ///< empty: none is written
    std::string jsonFile;   ///< empty: none is written; "-": standard output
};

/// `cadrel generate`: makes the change EDL of two cuts, and a summary. The files appear together when all has gone
/// well, or not at all. Throws Failure and UsageError.
void runGenerate(const GenerateOptions& options, Terminal& terminal);

} // namespace cadrel::app
