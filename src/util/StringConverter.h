// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/StringUtil.h"

namespace cadrel::util {

/// The conversions between UTF-8 and wide text; a derived class translates, because it knows the user's language.
class StringConverter : public StringUtil::StringConverterInterface {
public:
    /// Throws Result::InvalidArgument for a unit that is no Unicode character.
    std::string toUtf8(const std::wstring& text) const override;
    /// Throws Result::InvalidArgument for bytes that are no UTF-8.
    std::wstring toWide(const std::string& text) const override;

protected:
    ~StringConverter() = default;
};

} // namespace cadrel::util
