// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/Utf8Text.h"

#include "util/PrintableCharacter.h"

namespace cadrel::util {

namespace {

Utf8Character decode(char32_t lead, std::size_t bytes, char32_t least, std::string_view text)
{
    if (text.size() < bytes)
        return {};
    char32_t value = lead;
    for (const char next : text.substr(1, bytes - 1)) {
        const auto unit = static_cast<unsigned char>(next);
        if ((unit & 0xc0U) != 0x80U)
            return {};
        value = (value << 6U) | (unit & 0x3fU);
    }
    const bool surrogate = value >= 0xd800 && value <= 0xdfff;
    return value < least || value > 0x10ffff || surrogate ? Utf8Character{} : Utf8Character{bytes, value};
}

} // namespace

Utf8Character firstUtf8Character(std::string_view text)
{
    const auto lead = static_cast<unsigned char>(text.front());
    if (lead < 0x80)
        return {1, lead};
    if ((lead & 0xe0U) == 0xc0U)
        return decode(lead & 0x1fU, 2, 0x80, text);
    if ((lead & 0xf0U) == 0xe0U)
        return decode(lead & 0x0fU, 3, 0x800, text);
    if ((lead & 0xf8U) == 0xf0U)
        return decode(lead & 0x07U, 4, 0x10000, text);
    return {};
}

std::wstring toShownLine(std::string_view utf8)
{
    std::wstring shown;
    shown.reserve(utf8.size());
    while (!utf8.empty()) {
        const Utf8Character character = firstUtf8Character(utf8);
        const bool canBeShown = character.bytes != 0 && isPrintable(character.value);
        shown += static_cast<wchar_t>(canBeShown ? character.value : ReplacementCharacter);
        utf8.remove_prefix(character.bytes == 0 ? 1 : character.bytes);
    }
    return shown;
}

} // namespace cadrel::util
