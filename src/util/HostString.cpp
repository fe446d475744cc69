// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/HostString.h"

#include <optional>

namespace cadrel::util {

namespace {

static_assert(sizeof(wchar_t) == sizeof(char32_t), "Wide text holds one character a unit.");

constexpr char32_t ByteOrderMark = 0xFEFF;
constexpr char32_t FirstHighSurrogate = 0xD800;
constexpr char32_t FirstLowSurrogate = 0xDC00;
constexpr char32_t LastSurrogate = 0xDFFF;
constexpr char32_t FirstPaired = 0x10000;
constexpr char32_t LastCharacter = 0x10FFFF;

bool isHighSurrogate(char32_t unit)
{
    return unit >= FirstHighSurrogate && unit < FirstLowSurrogate;
}

bool isLowSurrogate(char32_t unit)
{
    return unit >= FirstLowSurrogate && unit <= LastSurrogate;
}

template <class Unit>
std::basic_string_view<Unit> withoutByteOrderMark(std::basic_string_view<Unit> text)
{
    if (!text.empty() && text.front() == static_cast<Unit>(ByteOrderMark))
        text.remove_prefix(1);
    return text;
}

/// Nothing for a text with a unit that isn't a character.
std::optional<std::u16string> toUtf16(std::wstring_view wide)
{
    std::u16string utf16;
    for (const wchar_t unit : withoutByteOrderMark(wide)) {
        const auto character = static_cast<char32_t>(unit);
        if (isHighSurrogate(character) || isLowSurrogate(character) || character > LastCharacter)
            return std::nullopt;
        if (character < FirstPaired) {
            utf16 += static_cast<char16_t>(character);
            continue;
        }
        const char32_t offset = character - FirstPaired;
        utf16 += static_cast<char16_t>(FirstHighSurrogate + (offset >> 10U));
        utf16 += static_cast<char16_t>(FirstLowSurrogate + (offset & 0x3FFU));
    }
    return utf16;
}

/// Nothing for a text with half a pair.
std::optional<std::wstring> toWide(std::u16string_view utf16)
{
    std::wstring wide;
    utf16 = withoutByteOrderMark(utf16);
    for (std::size_t index = 0; index < utf16.size(); ++index) {
        char32_t character = utf16[index];
        if (isLowSurrogate(character))
            return std::nullopt;
        if (isHighSurrogate(character)) {
            ++index;
            if (index == utf16.size() || !isLowSurrogate(utf16[index]))
                return std::nullopt;
            character = FirstPaired + ((character - FirstHighSurrogate) << 10U) + (utf16[index] - FirstLowSurrogate);
        }
        wide += static_cast<wchar_t>(character);
    }
    return wide;
}

} // namespace

HostString::HostString(std::wstring_view wide) : m_length(0), m_wide(wide)
{
    if (!wide.empty()) {
        m_utf16 = toUtf16(wide).value_or(u"<StrErr_2>");
        if (m_utf16.empty())
            m_utf16 = u"<StrErr_1>";
    }
    m_length = m_utf16.size();
}

HostString::HostString(std::u16string_view utf16) : m_length(0), m_utf16(utf16)
{
    if (!utf16.empty()) {
        m_wide = toWide(utf16).value_or(L"<StrErr_4>");
        if (m_wide.empty())
            m_wide = L"<StrErr_3>";
    }
    m_length = m_wide.size();
}

} // namespace cadrel::util
