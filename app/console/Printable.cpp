// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/Printable.h"

#include "util/PrintableCharacter.h"

namespace cadrel::app {

namespace {

struct Character {
    std::size_t bytes = 0; ///< 0 where the text doesn't begin with a well-formed character
    char32_t value = 0;
};

Character decode(char32_t lead, std::size_t bytes, char32_t least, std::string_view text)
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
    return value < least || value > 0x10ffff || surrogate ? Character{} : Character{bytes, value};
}

Character firstCharacter(std::string_view text)
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

} // namespace

PrintableText toPrintable(std::string_view text, std::size_t mostCharacters)
{
    PrintableText result;
    std::size_t lastStart = 0;
    while (!text.empty()) {
        if (result.width == mostCharacters) {
            result.text.replace(lastStart, std::string::npos, "…");
            break;
        }
        const Character character = firstCharacter(text);
        const std::size_t bytes = character.bytes == 0 ? 1 : character.bytes;
        lastStart = result.text.size();
        if (character.bytes != 0 && util::isPrintable(character.value)) {
            result.text += text.substr(0, bytes);
        } else {
            result.text += '?';
        }
        ++result.width;
        text.remove_prefix(bytes);
    }
    return result;
}

bool isUtf8(std::string_view text)
{
    while (!text.empty()) {
        const Character character = firstCharacter(text);
        if (character.bytes == 0)
            return false;
        text.remove_prefix(character.bytes);
    }
    return true;
}

} // namespace cadrel::app
