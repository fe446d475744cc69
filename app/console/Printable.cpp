// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/Printable.h"

#include "util/PrintableCharacter.h"
#include "util/Utf8Text.h"

#include <algorithm>
#include <clocale>
#include <cwchar>
#include <locale.h> // NOLINT(modernize-deprecated-headers): the locales of POSIX

namespace cadrel::app {

namespace {

/// The first letter of Latin-1 after its control characters.
constexpr unsigned char FirstLatin1Letter = 0xa0;

/// What the first character of a text is shown as.
struct Shown {
    std::size_t bytes; ///< that it takes of the text
    std::string text;
    std::size_t columns;
};

std::size_t columnsOf(char32_t character)
{
    if (character < 0x80)
        return 1;
    static const locale_t utf8 = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
    if (!utf8)
        return 1;
    const locale_t former = uselocale(utf8);
    const int columns = wcwidth(static_cast<wchar_t>(character));
    uselocale(former);
    // The library doesn't know the characters for private use, which take one.
    return columns < 0 ? 1 : static_cast<std::size_t>(columns);
}

std::string latin1ToUtf8(unsigned char letter)
{
    return {static_cast<char>(0xc0U | (letter >> 6U)), static_cast<char>(0x80U | (letter & 0x3fU))};
}

Shown firstShown(std::string_view text)
{
    const util::Utf8Character character = util::firstUtf8Character(text);
    if (character.bytes != 0 && util::isPrintable(character.value))
        return {character.bytes, std::string(text.substr(0, character.bytes)), columnsOf(character.value)};
    const auto byte = static_cast<unsigned char>(text.front());
    if (character.bytes == 0 && byte >= FirstLatin1Letter)
        return {1, latin1ToUtf8(byte), 1};
    return {character.bytes == 0 ? 1 : character.bytes, "?", 1};
}

bool isPlain(std::string_view text)
{
    return std::all_of(text.begin(), text.end(), [](char letter) { return letter >= ' ' && letter <= '~'; });
}

} // namespace

PrintableText toPrintable(std::string_view text, std::size_t mostColumns)
{
    if (text.size() <= mostColumns && isPlain(text))
        return {std::string(text), text.size()};
    PrintableText result;
    // Of the longest beginning that leaves a column for the "…".
    std::size_t cutSize = 0;
    std::size_t cutWidth = 0;
    while (!text.empty()) {
        const Shown next = firstShown(text);
        if (next.columns > mostColumns - result.width) {
            result.text.replace(cutSize, std::string::npos, "…");
            result.width = cutWidth + 1;
            break;
        }
        result.text += next.text;
        result.width += next.columns;
        if (result.width < mostColumns) {
            cutSize = result.text.size();
            cutWidth = result.width;
        }
        text.remove_prefix(next.bytes);
    }
    return result;
}

std::size_t displayWidth(std::string_view utf8)
{
    std::size_t width = 0;
    while (!utf8.empty()) {
        const util::Utf8Character character = util::firstUtf8Character(utf8);
        width += columnsOf(character.value);
        utf8.remove_prefix(character.bytes == 0 ? 1 : character.bytes);
    }
    return width;
}

bool isUtf8(std::string_view text)
{
    while (!text.empty()) {
        const util::Utf8Character character = util::firstUtf8Character(text);
        if (character.bytes == 0)
            return false;
        text.remove_prefix(character.bytes);
    }
    return true;
}

} // namespace cadrel::app
