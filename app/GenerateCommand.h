#pragma once

#include "app/EdlLoader.h"

#include <cstdint>
#include <string>
#include <vector>

namespace cadrel::app {

class Terminal;

struct GenerateOptions {
    std::vector<std::string> oldFiles;
    std::vector<std::string> newFiles;
    std::string changeFile; ///< empty: none is written
    std::string jsonFile;   ///< empty: none is written; "-": standard output
    LoadOptions load;
    std::int32_t matchBy = 0;
    std::int32_t healMode = 0;
    std::vector<std::string> vfxPatterns; ///< "PREFIX,POSTFIX"
};

/// `cadrel generate`: two cuts in, the change EDL and a summary of it out. The files appear together when all has gone
/// well, or not at all. Throws Failure and UsageError.
void runGenerate(const GenerateOptions& options, Terminal& terminal);

} // namespace cadrel::app
