// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>
#include <vector>

namespace desktop {

/// A row of the list of keys: those of the program, of the tracks and of Cadrel's window.
struct KeyRow {
    std::string keys;
    std::string meaning;
};

/// In the order in which the manual has them.
const std::vector<KeyRow>& keyTable();

/// For the help of the program, a line for each.
std::string keyTableText();

} // namespace desktop
