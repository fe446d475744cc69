// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <string>
#include <unordered_map>

namespace cadrel::core {

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
