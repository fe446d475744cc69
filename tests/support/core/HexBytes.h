// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/serialize/ByteArchive.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::tests {

/// Bytes written down as hexadecimal pairs; blanks between them are for the reader's eye alone.
inline std::vector<std::uint8_t> bytesOf(std::string_view hex)
{
    std::vector<std::uint8_t> bytes;
    std::string pair;
    for (const char digit : hex) {
        if (digit == ' ')
            continue;
        pair += digit;
        if (pair.size() == 2) {
            bytes.push_back(static_cast<std::uint8_t>(std::stoi(pair, nullptr, 16)));
            pair.clear();
        }
    }
    return bytes;
}

inline std::vector<std::uint8_t> bytesOf(const core::serialize::ByteArchive& archive)
{
    return {archive.data(), archive.data() + archive.size()};
}

inline core::serialize::ByteArchive archiveOf(const std::vector<std::uint8_t>& bytes)
{
    core::serialize::ByteArchive archive;
    archive.assign(bytes.data(), bytes.size());
    return archive;
}

inline core::serialize::ByteArchive archiveOf(std::string_view hex)
{
    return archiveOf(bytesOf(hex));
}

} // namespace cadrel::tests
