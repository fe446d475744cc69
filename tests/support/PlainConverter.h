// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/StringConverter.h"

namespace cadrel::tests {

/// A string converter whose translation is the text itself.
class PlainConverter : public util::StringConverter {
public:
    std::wstring translate(const std::wstring& text) const override { return text; }
};

} // namespace cadrel::tests
