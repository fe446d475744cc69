// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>
#include <vector>

namespace cadrel::app {

/// Goes on as another program that lies beside this one. Throws Failure when it can't be started.
[[noreturn]] void goOnAs(const std::string& program, const std::vector<std::string>& arguments);

} // namespace cadrel::app
