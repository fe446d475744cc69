// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>
#include <string_view>

namespace cadrel::util {

/// Texts and numbers as they stand in JSON. A number has as few digits as lead back to it.
void appendJsonText(std::string& json, std::string_view text);
void appendJsonNumber(std::string& json, double number);

} // namespace cadrel::util
