// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/settings/VfxPatternEntry.h"

#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace cadrel::core {

/// The compiled VFX patterns. A name that is a row's prefix, a version number and its postfix loses the number, so that
/// all versions of a VFX shot have the same name. In a row "." stands for itself and "*" for exactly one character, but
/// not for the end of a line.
class VfxNameMatcher {
public:
    /// The characters that a prefix or postfix may hold.
    static constexpr std::string_view AllowedCharacters =
        ".*-_ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789";

    /// Replaces the patterns by rows of prefix and postfix. Throws Result::InvalidArgument for a row of two empty texts
    /// or with a character outside AllowedCharacters; the rows before it stay compiled.
    void compile(const std::vector<std::pair<std::string, std::string>>& rows);
    /// Replaces the patterns by the enabled rows that are not empty; throws as above.
    void compileEnabled(const std::vector<VfxPatternEntry>& entries);

    /// The name without its version digits. The digits are looked for at the length of the compiled prefix, in which
    /// each "." counts as two places. This is deliberate.
    std::string stripVersion(const std::string& name) const;
    bool hasVersion(const std::string& name) const;

private:
    /// Prefix and postfix as fragments of a regular expression (ECMAScript).
    std::vector<std::pair<std::string, std::string>> m_patterns;
};

} // namespace cadrel::core
