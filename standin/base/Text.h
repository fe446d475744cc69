// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string_view>

namespace standin {

/// Whether a text is well-formed UTF-16 or UTF-8, and so has a place in a project file.
bool isWellFormed(std::u16string_view text);
bool isWellFormed(std::string_view text);

} // namespace standin
