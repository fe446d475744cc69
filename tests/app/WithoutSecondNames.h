// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/app/ProgramRun.h"

#include <cstddef>
#include <string>
#include <vector>

namespace cadrel::tests {

/// Runs `cadrel` as on a disk where a file can't have a second name. No file may become longer than `mostBytes`; 0 is no limit.
Outcome runCadrelWithoutSecondNames(const std::vector<std::string>& arguments, std::size_t mostBytes = 0);

} // namespace cadrel::tests
