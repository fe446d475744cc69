// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace cadrel::tests {

/// The path of a file of this tree, which is named from its root: `treePath("examples/reel3/reel3.stage")`.
std::string treePath(const std::string& relative);

/// The path of a program of this build.
std::string programPath(const std::string& name);

} // namespace cadrel::tests
