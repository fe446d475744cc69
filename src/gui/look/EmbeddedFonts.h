// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <span>

namespace cadrel::embedded {

/// The files of `resources/fonts`, in the program's data.
extern const std::span<const unsigned char> RegularFont;
extern const std::span<const unsigned char> BoldFont;

} // namespace cadrel::embedded
