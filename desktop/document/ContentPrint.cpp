// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/ContentPrint.h"

#include <array>
#include <charconv>
#include <fstream>
#include <system_error>

namespace desktop {

namespace fs = std::filesystem;

namespace {

// http://www.isthe.com/chongo/tech/comp/fnv
constexpr std::uint64_t OffsetBasis = 0xcbf29ce484222325;
constexpr std::uint64_t Prime = 0x100000001b3;
constexpr std::size_t HashDigits = 16;
constexpr std::size_t BlockSize = std::size_t{1} << 20U;

void add(ContentPrint& print, std::string_view content)
{
    std::uint64_t hash = print.hash;
    for (const char byte : content)
        hash = (hash ^ static_cast<unsigned char>(byte)) * Prime;
    print.hash = hash;
    print.size += content.size();
}

} // namespace

ContentPrint ContentPrint::of(std::string_view content)
{
    ContentPrint print{0, OffsetBasis};
    add(print, content);
    return print;
}

std::optional<ContentPrint> ContentPrint::ofFile(const fs::path& file)
{
    std::error_code error;
    if (!fs::is_regular_file(file, error))
        return std::nullopt;
    std::ifstream stream(file, std::ios::binary);
    ContentPrint print{0, OffsetBasis};
    std::string block(BlockSize, '\0');
    while (stream) {
        stream.read(block.data(), static_cast<std::streamsize>(block.size()));
        add(print, std::string_view(block).substr(0, static_cast<std::size_t>(stream.gcount())));
    }
    if (!stream.eof() || stream.bad())
        return std::nullopt;
    return print;
}

std::string ContentPrint::hashText() const
{
    std::array<char, HashDigits> digits{};
    const auto written = std::to_chars(digits.data(), digits.data() + digits.size(), hash, 16);
    std::string text(digits.data(), written.ptr);
    return std::string(HashDigits - text.size(), '0').append(text);
}

std::optional<std::uint64_t> ContentPrint::hashOf(std::string_view text)
{
    std::uint64_t hash = 0;
    const auto read = std::from_chars(text.data(), text.data() + text.size(), hash, 16);
    if (text.size() != HashDigits || read.ec != std::errc() || read.ptr != text.data() + text.size())
        return std::nullopt;
    return hash;
}

} // namespace desktop
