// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notes/Programme.h"
#include "core/notes/StepMaker.h"

namespace cadrel::core {

/// Adds the steps that move reels as a whole, so that all begin where they do in the new cut, and none ever lies on another
/// on a timeline that all of them share. Tells all places in the rows where their reel begins by then.
void moveReels(StepList& list, const Programme& oldCut, const Programme& newCut, const Framerate& framerate);

} // namespace cadrel::core
