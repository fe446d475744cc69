// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/edl/EdlLoader.h"

#include <string>
#include <vector>

namespace cadrel::app {

class Terminal;

struct ListOptions {
    std::vector<std::string> files;
    std::string jsonFile;     ///< empty: none is written; "-": standard output
    bool isReplacing = false; ///< whether a JSON file that exists may be replaced
    bool summary = false;     ///< the totals alone
    LoadOptions load;
    std::vector<std::string> shifts; ///< for FileShifts
};

/// `cadrel list`: shows the events of EDLs and what is wrong with them. Throws Failure and UsageError.
void runList(const ListOptions& options, Terminal& terminal);

} // namespace cadrel::app
