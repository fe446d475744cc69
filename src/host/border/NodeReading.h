// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"
#include "velmark/ProjectNode.h"

#include <string>
#include <vector>

namespace cadrel::host {

// What is read of any node of the host. Both throw Result::HostObjectMissing when the host gives nothing.

/// Gathered first, so that an edit doesn't change them under the walk.
std::vector<Velmark::Counted<Velmark::IProjectNode>> childrenOf(Velmark::IProjectNode& node);
std::wstring nameOf(Velmark::IProjectNode& node);

} // namespace cadrel::host
