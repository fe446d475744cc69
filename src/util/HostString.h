// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace cadrel::util {

/// One text in two forms at once, for the host's calls, which take UTF-16. It is built from either form and makes the
/// other, without a byte order mark at the front. A text that can't be converted doesn't throw. The other form then is
/// a fixed text, so that the failure is visible in the interface:
///
///     "<StrErr_1>", "<StrErr_3>"  nothing is left of the text in UTF-16, or in wide form
///     "<StrErr_2>", "<StrErr_4>"  the wide text, or the UTF-16, is ill-formed
class HostString {
public:
    explicit HostString(std::wstring_view wide);
    explicit HostString(std::u16string_view utf16);

    /// The units of the form that was made, without the zero unit.
    std::size_t length() const { return m_length; }
    /// Both forms end with a zero unit.
    const char16_t* utf16() const { return m_utf16.c_str(); }
    const wchar_t* wide() const { return m_wide.c_str(); }

private:
    std::size_t m_length;
    std::u16string m_utf16;
    std::wstring m_wide;
};

} // namespace cadrel::util
