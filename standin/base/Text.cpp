// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/base/Text.h"

#include "util/Result.h"
#include "util/StringConverter.h"

#include <cstddef>

namespace standin {

namespace {

/// The conversions without a translation.
class Conversion : public cadrel::util::StringConverter {
public:
    std::wstring translate(const std::wstring& text) const override { return text; }
};

bool isHighSurrogate(char16_t unit)
{
    return unit >= 0xD800 && unit <= 0xDBFF;
}

bool isLowSurrogate(char16_t unit)
{
    return unit >= 0xDC00 && unit <= 0xDFFF;
}

} // namespace

bool isWellFormed(std::u16string_view text)
{
    for (std::size_t index = 0; index < text.size(); ++index) {
        if (isLowSurrogate(text[index]))
            return false;
        if (isHighSurrogate(text[index]) && (++index == text.size() || !isLowSurrogate(text[index])))
            return false;
    }
    return true;
}

bool isWellFormed(std::string_view text)
{
    try {
        Conversion().toWide(std::string(text));
        return true;
    } catch (cadrel::util::Result::Type) {
        return false;
    }
}

} // namespace standin
