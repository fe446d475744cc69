// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace cadrel::gui {

/// The text in the user's language; the text itself where it can't be translated.
std::wstring translated(const std::wstring& text);

} // namespace cadrel::gui
