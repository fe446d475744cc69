// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/console/Replacing.h"
#include "app/edl/Generation.h"

#include <string>

namespace cadrel::app {

class Terminal;

struct GenerateOptions {
    GenerationOptions generation;
    std::string changeFile; ///< empty: none is written
    Replacing replacing;
    std::string jsonFile; ///< empty: none is written; "-": standard output
};

/// `cadrel generate`: makes the change EDL of two cuts, and a summary. The JSON is prepared before the change EDL is written,
/// and takes its place after it. Throws Failure and UsageError.
void runGenerate(const GenerateOptions& options, Terminal& terminal);

} // namespace cadrel::app
