// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"
#include "velmark/ProjectNode.h"

#include <string>
#include <vector>

namespace Velmark {
class ITrackNode;
}

namespace cadrel::host {

// What is read of any node of the host. All throw Result::HostObjectMissing when the host gives nothing.

/// Gathered first, so that an edit doesn't change them under the walk.
std::vector<Velmark::Counted<Velmark::IProjectNode>> childrenOf(Velmark::IProjectNode& node);
/// The automation curves of a track; none where there can be none.
std::vector<Velmark::Counted<Velmark::IProjectNode>> curvesOf(Velmark::ITrackNode& track);
std::wstring nameOf(Velmark::IProjectNode& node);

} // namespace cadrel::host
