// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/StringConverter.h"

#include "util/Result.h"

#include <algorithm>
#include <codecvt>
#include <locale>
#include <stdexcept>

namespace cadrel::util {

namespace {

using Utf8Conversion = std::wstring_convert<std::codecvt_utf8<wchar_t>>;

// The halves of UTF-16 pairs are no characters, but the standard conversion lets them pass.
void refuseSurrogates(const std::wstring& text)
{
    const auto isSurrogate = [](wchar_t unit) { return unit >= 0xD800 && unit <= 0xDFFF; };
    if (std::any_of(text.begin(), text.end(), isSurrogate))
        throw Result::InvalidArgument;
}

} // namespace

std::string StringConverter::toUtf8(const std::wstring& text) const
{
    refuseSurrogates(text);
    try {
        return Utf8Conversion().to_bytes(text);
    } catch (const std::range_error&) {
        throw Result::InvalidArgument;
    }
}

std::wstring StringConverter::toWide(const std::string& text) const
{
    Utf8Conversion conversion;
    std::wstring wide;
    try {
        wide = conversion.from_bytes(text);
    } catch (const std::range_error&) {
        throw Result::InvalidArgument;
    }
    // A character that is cut off by the end of the text is left out without an error.
    if (conversion.converted() != text.size())
        throw Result::InvalidArgument;
    refuseSurrogates(wide);
    return wide;
}

} // namespace cadrel::util
