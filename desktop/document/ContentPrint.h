// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <filesystem>
#include <optional>
#include <string>
#include <string_view>

namespace desktop {

/// By what a content is known again without being kept: its size and its FNV-1a hash of 64 bits.
struct ContentPrint {
    std::uint64_t size = 0; ///< bytes
    std::uint64_t hash = 0;

    static ContentPrint of(std::string_view content);
    /// Nothing for what can't be read or is no ordinary file.
    static std::optional<ContentPrint> ofFile(const std::filesystem::path& file);

    /// The hash as 16 hexadecimal digits, and back; nothing for any other text.
    std::string hashText() const;
    static std::optional<std::uint64_t> hashOf(std::string_view text);

    friend bool operator==(const ContentPrint&, const ContentPrint&) = default;
};

} // namespace desktop
