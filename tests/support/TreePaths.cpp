// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/TreePaths.h"

namespace cadrel::tests {

std::string treePath(const std::string& relative)
{
    return std::string(CADREL_TREE).append("/").append(relative);
}

std::string programPath(const std::string& name)
{
    return std::string(CADREL_PROGRAMS).append("/").append(name);
}

} // namespace cadrel::tests
