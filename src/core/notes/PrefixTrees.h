// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace cadrel::core {

/// The greatest of the values at the first places of a row; each question and each change takes log n.
template <typename Value>
class PrefixMaximum {
public:
    PrefixMaximum(std::size_t size, const Value& least) : m_tree(size + 1, least) {}

    /// Raises the value at `place`; a smaller value changes nothing.
    void raise(std::size_t place, const Value& value)
    {
        for (std::size_t node = place + 1; node < m_tree.size(); node += node & (~node + 1)) {
            if (m_tree[node] < value)
                m_tree[node] = value;
        }
    }

    /// Of the first `count` places.
    Value ofFirst(std::size_t count) const
    {
        Value greatest = m_tree[0];
        for (std::size_t node = count; node > 0; node -= node & (~node + 1)) {
            if (greatest < m_tree[node])
                greatest = m_tree[node];
        }
        return greatest;
    }

private:
    std::vector<Value> m_tree;
};

/// The sum of the numbers at the first places of a row; each question and each change takes log n.
class PrefixSum {
public:
    explicit PrefixSum(std::size_t size) : m_tree(size + 1, 0), m_values(size, 0) {}

    void set(std::size_t place, std::int32_t value)
    {
        const std::int32_t change = value - m_values[place];
        m_values[place] = value;
        for (std::size_t node = place + 1; node < m_tree.size(); node += node & (~node + 1))
            m_tree[node] += change;
    }

    /// Of the first `count` places.
    std::int32_t ofFirst(std::size_t count) const
    {
        std::int32_t sum = 0;
        for (std::size_t node = count; node > 0; node -= node & (~node + 1))
            sum += m_tree[node];
        return sum;
    }

private:
    std::vector<std::int32_t> m_tree;
    std::vector<std::int32_t> m_values;
};

} // namespace cadrel::core
