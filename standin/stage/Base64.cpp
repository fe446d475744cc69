// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/stage/Base64.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>

namespace standin {

namespace {

constexpr std::string_view Digits = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
constexpr char Padding = '=';
constexpr std::uint8_t NoDigit = 64;

constexpr std::array<std::uint8_t, 256> digitValues()
{
    std::array<std::uint8_t, 256> values{};
    values.fill(NoDigit);
    for (std::size_t value = 0; value < Digits.size(); ++value)
        values[static_cast<std::uint8_t>(Digits[value])] = static_cast<std::uint8_t>(value);
    return values;
}

constexpr std::array<std::uint8_t, 256> DigitValues = digitValues();

} // namespace

//     byte         |   first   |  second   |   third   |
//     character    |  1st  |  2nd  |  3rd  |  4th  |        of 6 bits each
std::string toBase64(const Bytes& bytes)
{
    std::string text;
    text.reserve((bytes.size() + 2) / 3 * 4);
    for (std::size_t index = 0; index < bytes.size(); index += 3) {
        const std::size_t count = std::min<std::size_t>(3, bytes.size() - index);
        std::uint32_t group = 0;
        for (std::size_t place = 0; place < 3; ++place)
            group = group << 8U | (place < count ? bytes[index + place] : 0U);
        for (std::size_t place = 0; place < 4; ++place)
            text += place <= count ? Digits[group >> (18 - 6 * place) & 63U] : Padding;
    }
    return text;
}

std::optional<Bytes> fromBase64(std::string_view text)
{
    if (text.size() % 4 != 0)
        return std::nullopt;
    std::size_t padding = 0;
    while (padding < 2 && padding < text.size() && text[text.size() - 1 - padding] == Padding)
        ++padding;
    text.remove_suffix(padding);

    Bytes bytes;
    bytes.reserve(text.size() / 4 * 3 + 2);
    std::uint32_t group = 0;
    unsigned bits = 0;
    for (const char character : text) {
        const std::uint32_t value = DigitValues[static_cast<std::uint8_t>(character)];
        if (value == NoDigit)
            return std::nullopt;
        group = (group << 6U | value) & 0xFFFU;
        bits += 6;
        if (bits >= 8) {
            bits -= 8;
            bytes.push_back(static_cast<Velmark::uint8>(group >> bits));
        }
    }
    // What is left of the last character belongs to no byte.
    if ((group & ((1U << bits) - 1)) != 0)
        return std::nullopt;
    return bytes;
}

} // namespace standin
