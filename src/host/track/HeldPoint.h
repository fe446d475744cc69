// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"
#include "velmark/ProjectNode.h"

namespace Velmark {
class IHostContext;
} // namespace Velmark

namespace cadrel::host {

// Automation points that the system writes. Those that only let a curve keep a value have a mark, and go once the curve runs
// the same without them.

/// A point of a curve, at a time in seconds from the time origin, that isn't inserted yet. Throws Result::HostObjectMissing
/// when the host makes none, and Result::HostCallFailed when it refuses the value or the time.
Velmark::Counted<Velmark::IProjectNode> makePoint(Velmark::IHostContext* context, Velmark::IProjectNode& curve,
                                                  double time, float value);
/// Marks a point of that value. One whose host refuses the mark stays for good.
void markAsHeld(Velmark::IProjectNode& point, float value);
/// Whether it has the mark, and still the value.
bool isHeld(Velmark::IProjectNode& point, float value);

} // namespace cadrel::host
