// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace cadrel::util {

/// The sentence with the value in place of its "%s".
inline std::wstring filled(std::wstring sentence, const std::wstring& value)
{
    const std::size_t place = sentence.find(L"%s");
    return place == std::wstring::npos ? sentence : sentence.replace(place, 2, value);
}

} // namespace cadrel::util
