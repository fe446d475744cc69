// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/ProjectNode.h"

#include <optional>
#include <vector>

namespace Velmark {
class IHostContext;
}

namespace cadrel::host {

// Numbers that a node of the host keeps as a persistent attribute. The host undoes and stores it with the node.

/// Nothing for an attribute that isn't there or isn't a list of finite numbers.
std::optional<std::vector<double>> readNumbers(Velmark::IProjectNode& node, const char* key);
/// Throws Result::HostObjectMissing when the host has no lists, and Result::HostCallFailed when it refuses.
void writeNumbers(Velmark::IHostContext* context, Velmark::IProjectNode& node, const char* key,
                  const std::vector<double>& numbers);
/// Does nothing without the attribute. Throws Result::HostCallFailed when the host refuses.
void removeNumbers(Velmark::IProjectNode& node, const char* key);

} // namespace cadrel::host
