// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <vector>

namespace cadrel::tests {

/// Drags files out of another program, such as a file manager, and lets them go over a pixel of the screen which belongs to the
/// window. Waits until the window has taken them; throws std::runtime_error when it hasn't within ten seconds.
void dragFilesTo(unsigned long window, const std::vector<std::filesystem::path>& files, int x, int y);

} // namespace cadrel::tests
