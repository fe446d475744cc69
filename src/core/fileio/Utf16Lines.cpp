// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/fileio/Utf16Lines.h"

#include "util/Result.h"
#include "util/StringUtil.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <fstream>
#include <optional>
#include <string>

namespace cadrel::core::fileio {

using util::Result;

namespace {

/// Enough to recognise a line by.
constexpr std::size_t MostBytesOfALine = 512;

enum class ByteOrder { LittleEndian, BigEndian };

std::ifstream opened(const std::filesystem::path& file)
{
    std::ifstream stream(file, std::ios::binary);
    if (!stream.is_open())
        throw Result::FileAccessFailed;
    return stream;
}

/// The order of the bytes in a file of UTF-16; nothing for another text. Without a mark the first two characters tell, which
/// in an EDL are of ASCII.
std::optional<ByteOrder> byteOrderOf(const std::filesystem::path& file)
{
    std::array<char, 4> start{};
    std::ifstream stream = opened(file);
    stream.read(start.data(), start.size());
    if (stream.gcount() < 2)
        return std::nullopt;
    if (start[0] == '\xFF' && start[1] == '\xFE')
        return ByteOrder::LittleEndian;
    if (start[0] == '\xFE' && start[1] == '\xFF')
        return ByteOrder::BigEndian;
    if (stream.gcount() < static_cast<std::streamsize>(start.size()))
        return std::nullopt;
    if (start[0] != 0 && start[1] == 0 && start[2] != 0 && start[3] == 0)
        return ByteOrder::LittleEndian;
    if (start[0] == 0 && start[1] != 0 && start[2] == 0 && start[3] != 0)
        return ByteOrder::BigEndian;
    return std::nullopt;
}

/// Appends a unit; half of a pair becomes "?".
void append(std::string& text, char16_t unit)
{
    constexpr unsigned Continued = 0x80U;
    const auto low = [unit](unsigned shift) { return static_cast<char>(Continued | ((unit >> shift) & 0x3FU)); };
    if (text.size() >= MostBytesOfALine)
        return;
    if (unit >= 0xD800 && unit <= 0xDFFF) {
        text += '?';
    } else if (unit < 0x80) {
        text += static_cast<char>(unit);
    } else if (unit < 0x800) {
        text += static_cast<char>(0xC0U | (unit >> 6U));
        text += low(0);
    } else {
        text += static_cast<char>(0xE0U | (unit >> 12U));
        text += low(6);
        text += low(0);
    }
}

} // namespace

bool isUtf16(const std::filesystem::path& file)
{
    return byteOrderOf(file).has_value();
}

std::vector<SourceLine> numberedUtf16Lines(const std::filesystem::path& file)
{
    constexpr char16_t ByteOrderMark = 0xFEFF;
    const bool isLittle = byteOrderOf(file) == ByteOrder::LittleEndian;
    std::vector<SourceLine> lines;
    SourceLine line{1, {}};
    const auto finish = [&] {
        const std::string_view text = util::StringUtil::trimView(line.text);
        if (!text.empty() && text.front() >= '0' && text.front() <= '9')
            lines.push_back({line.number, std::string(text)});
        line.text.clear();
        ++line.number;
    };
    std::ifstream stream = opened(file);
    std::array<char, 2> bytes{};
    char16_t last = 0;
    while (stream.read(bytes.data(), bytes.size())) {
        const auto first = static_cast<unsigned char>(bytes[0]);
        const auto second = static_cast<unsigned char>(bytes[1]);
        const auto unit = static_cast<char16_t>(isLittle ? first | (second << 8U) : second | (first << 8U));
        if (unit == u'\r' || (unit == u'\n' && last != u'\r'))
            finish();
        else if (unit != u'\n' && unit != ByteOrderMark)
            append(line.text, unit);
        last = unit;
    }
    finish();
    return lines;
}

} // namespace cadrel::core::fileio
