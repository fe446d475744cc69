// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace cadrel::app {

/// "1 event", "2 events".
std::string counted(std::size_t count, const std::string& word);

/// The text in double quotes.
std::string quoted(const std::string& text);

/// "a, b, c".
std::string joined(const std::vector<std::string>& texts);

} // namespace cadrel::app
