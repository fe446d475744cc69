// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/fileio/FileRemarks.h"

#include <cstddef>
#include <string>
#include <vector>

namespace cadrel::gui {

/// What the user reads of lines that could not be read: a line each for the first `mostLines`, and how many there are more.
///
///     Line 12 misses a field and isn't read: "001  AX V C 01:00:00:00"
///     and 3 more
std::wstring textOfUnread(const std::vector<core::fileio::UnreadLine>& lines, std::size_t mostLines);

} // namespace cadrel::gui
