// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <functional>

namespace cadrel::app {

class Terminal;

/// Does the work of a program and answers the exit status. Every exception becomes a message on the terminal.
int runProgram(const std::function<void(Terminal&)>& work);

} // namespace cadrel::app
