// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/String.h"

#include "util/HostString.h"
#include "util/Result.h"
#include "util/StringConverter.h"

#include <charconv>
#include <cstring>
#include <utility>

namespace Velmark {

namespace {

using cadrel::util::HostString;

/// The conversions without a translation.
class Conversion : public cadrel::util::StringConverter {
public:
    std::wstring translate(const std::wstring& text) const override { return text; }
};

std::u16string toUtf16(const std::string& text)
{
    try {
        return HostString(Conversion().toWide(text)).utf16();
    } catch (cadrel::util::Result::Type) {
        return u"<StrErr_2>";
    }
}

std::string toUtf8(const std::u16string& text)
{
    // Ill-formed UTF-16 comes out of HostString as the text that says so, which is plain UTF-8.
    return Conversion().toUtf8(HostString(text).wide());
}

template <class Number>
bool readWhole(const std::string& text, Number& value)
{
    Number read = 0;
    const char* const end = text.data() + text.size();
    const auto [stopped, error] = std::from_chars(text.data(), end, read);
    if (error != std::errc() || stopped != end)
        return false;
    value = read;
    return true;
}

} // namespace

ConstString::ConstString(const char* text)
{
    set(std::string(text ? text : ""));
}

ConstString::ConstString(const char16_t* text)
{
    set(std::u16string(text ? text : u""));
}

void ConstString::set(std::string text)
{
    m_text16 = toUtf16(text);
    m_text8 = std::move(text);
    m_is16 = false;
}

void ConstString::set(std::u16string text)
{
    m_text8 = toUtf8(text);
    m_text16 = std::move(text);
    m_is16 = true;
}

int32 ConstString::compare(const ConstString& other) const
{
    // The bytes of UTF-8 stand in the order of the characters.
    const int32 order = std::strcmp(text8(), other.text8());
    // Two texts in UTF-16 that can't be converted read the same in UTF-8.
    return order == 0 && m_is16 && other.m_is16 ? m_text16.compare(other.m_text16) : order;
}

bool ConstString::readInteger(int64& value) const
{
    return readWhole(m_text8, value);
}

bool ConstString::readNumber(double& value) const
{
    return readWhole(m_text8, value);
}

String& String::append(const ConstString& text)
{
    if (is16())
        set(std::u16string(text16()) + text.text16());
    else
        set(std::string(text8()) + text.text8());
    return *this;
}

void String::to8()
{
    set(std::string(text8()));
}

void String::to16()
{
    set(std::u16string(text16()));
}

} // namespace Velmark
