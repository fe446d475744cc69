// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/FUID.h"

#include <array>
#include <cstddef>
#include <cstdio>
#include <string_view>

namespace Velmark {

namespace {

/// The registry form with an X for each digit.
constexpr std::string_view RegistryForm = "{XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX}";

const char* codeFormat(FUID::CodeForm form)
{
    switch (form) {
    case FUID::CodeForm::InlineUid:
        return "INLINE_UID (0x%08X, 0x%08X, 0x%08X, 0x%08X)";
    case FUID::CodeForm::DeclareUid:
        return "DECLARE_UID (0x%08X, 0x%08X, 0x%08X, 0x%08X)";
    case FUID::CodeForm::DeclareClassIid:
        return "DECLARE_CLASS_IID (Interface, 0x%08X, 0x%08X, 0x%08X, 0x%08X)";
    case FUID::CodeForm::Fuid:
        break;
    }
    return "FUID (0x%08X, 0x%08X, 0x%08X, 0x%08X)";
}

} // namespace

std::string FUID::toString() const
{
    constexpr char Digits[] = "0123456789ABCDEF";
    std::string text;
    for (const uint8 byte : m_data.bytes) {
        text += Digits[byte / 16];
        text += Digits[byte % 16];
    }
    return text;
}

std::string FUID::toRegistryString() const
{
    const std::string digits = toString();
    std::string text(RegistryForm);
    auto digit = digits.begin();
    for (char& character : text)
        if (character == 'X')
            character = *digit++;
    return text;
}

std::string FUID::toCode(CodeForm form) const
{
    std::array<unsigned, 4> words{};
    for (std::size_t index = 0; index < Identifier::Size; ++index)
        words[index / 4] = words[index / 4] << 8U | m_data.bytes[index];

    std::array<char, 100> text{};
    std::snprintf(text.data(), text.size(), codeFormat(form), words[0], words[1], words[2], words[3]);
    return text.data();
}

bool FUID::fromString(const std::string& text)
{
    Identifier read;
    if (text.size() != 2 * Identifier::Size)
        return false;
    for (std::size_t index = 0; index < Identifier::Size; ++index) {
        const int high = Identifier::digitValue(text[2 * index]);
        const int low = Identifier::digitValue(text[2 * index + 1]);
        if (high < 0 || low < 0)
            return false;
        read.bytes[index] = static_cast<uint8>(16 * high + low);
    }
    m_data = read;
    return true;
}

bool FUID::fromRegistryString(const std::string& text)
{
    if (text.size() != RegistryForm.size())
        return false;
    std::string digits;
    for (std::size_t index = 0; index < text.size(); ++index) {
        if (RegistryForm[index] == 'X')
            digits += text[index];
        else if (RegistryForm[index] != text[index])
            return false;
    }
    return fromString(digits);
}

} // namespace Velmark
