// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/JsonText.h"

#include <array>
#include <charconv>
#include <cmath>

namespace cadrel::util {

void appendJsonText(std::string& json, std::string_view text)
{
    static constexpr char HexDigits[] = "0123456789abcdef";
    json += '"';
    for (const char byte : text) {
        if (byte == '"' || byte == '\\')
            (json += '\\') += byte;
        else if (byte == '\n')
            json += "\\n";
        else if (byte == '\t')
            json += "\\t";
        else if (byte >= 0 && byte < 0x20)
            ((json += "\\u00") += HexDigits[byte >> 4]) += HexDigits[byte & 15];
        else
            json += byte;
    }
    json += '"';
}

void appendJsonNumber(std::string& json, double number)
{
    // Exponents only where the zeros would be too many to count. These bounds leave room for all digits.
    const bool isPlain = number == 0.0 || (std::abs(number) >= 1e-6 && std::abs(number) < 1e15);
    std::array<char, 32> digits;
    char* const last = digits.data() + digits.size();
    const auto written = isPlain ? std::to_chars(digits.data(), last, number, std::chars_format::fixed)
                                 : std::to_chars(digits.data(), last, number);
    json.append(digits.data(), written.ptr);
}

} // namespace cadrel::util
