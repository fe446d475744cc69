// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace cadrel::app {

/// What stops the work: the file, what is wrong with it and what the user can do. Thrown by value; ends the program
/// with status 1.
struct Failure {
    std::string file;
    std::string problem;
    std::string remedy;
};

/// A mistake in the command line. Thrown by value; ends the program with status 2.
struct UsageError {
    std::string problem;
    std::string remedy = "see --help";
};

} // namespace cadrel::app
