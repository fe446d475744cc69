// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/FileFault.h"

#include "util/JsonText.h"

#include <algorithm>

using cadrel::util::appendJsonText;

namespace standin {

namespace {

bool isLetter(char character)
{
    return (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z');
}

} // namespace

std::string quoted(std::string_view text)
{
    constexpr std::size_t Longest = 40;
    const bool isLong = text.size() > Longest;
    if (isLong) {
        // Not within a character, whose bytes but the first are of this form.
        std::size_t size = Longest;
        while (size > 0 && (static_cast<unsigned char>(text[size]) & 0xC0U) == 0x80U)
            --size;
        text = text.substr(0, size);
    }
    std::string quoted;
    appendJsonText(quoted, text);
    return isLong ? quoted + "..." : quoted;
}

void appendMember(std::string& place, std::string_view key)
{
    if (key.empty() || key.size() > 20 || !std::all_of(key.begin(), key.end(), isLetter)) {
        place.append("[").append(quoted(key)).append("]");
        return;
    }
    if (!place.empty())
        place += '.';
    place += key;
}

void appendElement(std::string& place, std::size_t index)
{
    place.append("[").append(std::to_string(index)).append("]");
}

} // namespace standin
