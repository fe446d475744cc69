// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <vector>

namespace cadrel::core {

/// An ordered set of flaw numbers. The existing flaws fit into one word, but a stream may contain any number.
class FlawSet {
public:
    bool isEmpty() const { return m_common == 0 && m_others.empty(); }
    bool contains(std::int32_t flaw) const;
    /// Whether a number from `first` to `last` is in the set, both within 0 to 31.
    bool containsAny(std::int32_t first, std::int32_t last) const;
    void insert(std::int32_t flaw);
    void erase(std::int32_t flaw);
    /// Replaces the content.
    void assign(const std::vector<std::int32_t>& flaws);
    /// In ascending order.
    std::vector<std::int32_t> values() const;

private:
    std::uint32_t m_common = 0;         ///< a bit for each of the numbers 0 to 31
    std::vector<std::int32_t> m_others; ///< ascending
};

} // namespace cadrel::core
