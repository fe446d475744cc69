// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/settings/MatchBy.h"
#include "core/settings/VfxNameMatcher.h"
#include "core/time/Framerate.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <unordered_map>

namespace cadrel::core {

/// How two programmes are compared.
struct PictureRules {
    Framerate framerate;
    std::int32_t matchBy = MatchBy::RollName; ///< which name tells the material
    VfxNameMatcher versions;                  ///< takes the version out of the names of VFX shots
};

/// Gives equal texts equal numbers.
class TextNumbers {
public:
    std::int32_t numberOf(const std::string& text)
    {
        return m_numbers.try_emplace(text, static_cast<std::int32_t>(m_numbers.size())).first->second;
    }

private:
    std::unordered_map<std::string, std::int32_t> m_numbers;
};

} // namespace cadrel::core
