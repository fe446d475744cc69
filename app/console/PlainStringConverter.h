// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/StringConverter.h"

namespace cadrel::app {

/// Doesn't translate: the program uses its own texts.
class PlainStringConverter : public util::StringConverter {
public:
    std::wstring translate(const std::wstring& text) const override { return text; }
};

} // namespace cadrel::app
