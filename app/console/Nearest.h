// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>
#include <vector>

namespace cadrel::app {

/// The one of the words that the user may have meant by another, mistyped one: with a letter left out, added or replaced, or
/// two of them exchanged, twice at most. Empty without any that is near.
std::string nearestWord(const std::string& typed, const std::vector<std::string>& words);

} // namespace cadrel::app
