// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notes/SharedPicture.h"

#include <vector>

namespace cadrel::core {

/// Of shared stretches those that rise on both sides and keep the most frames between them; of several such choices one
/// with the fewest ends. Where one overlaps the one before it, in the old or the new programme, it loses its head.
///
///     old programme   |--- 1 ---|--- 2 ---|--- 3 ---|
///     new programme   |--- 2 ---|--- 1 ----|--- 3 ---|       2 and 3, or 1 and 3, whichever is longer
///
/// `shared` are in the order of their new runs, and within one in that of their new starts. The chain is in order.
std::vector<SharedPicture> longestChain(const std::vector<SharedPicture>& shared);

} // namespace cadrel::core
