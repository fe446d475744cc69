// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <algorithm>
#include <bit>
#include <cstddef>
#include <limits>
#include <vector>

namespace cadrel::host {

/// Numbers in an order, of which the highest of any stretch is found at once.
class HighestNumber {
public:
    static constexpr double None = -std::numeric_limits<double>::infinity();

    explicit HighestNumber(const std::vector<double>& numbers)
        : m_leaves(std::bit_ceil(std::max<std::size_t>(numbers.size(), 1))), m_tree(2 * m_leaves, None)
    {
        std::ranges::copy(numbers, m_tree.begin() + static_cast<std::ptrdiff_t>(m_leaves));
        for (std::size_t node = m_leaves - 1; node > 0; --node)
            m_tree[node] = std::max(m_tree[2 * node], m_tree[2 * node + 1]);
    }

    /// Of those from `first` up to `last`; None when there are none.
    double among(std::size_t first, std::size_t last) const
    {
        double highest = None;
        for (first += m_leaves, last += m_leaves; first < last; first /= 2, last /= 2) {
            if (first % 2 != 0)
                highest = std::max(highest, m_tree[first++]);
            if (last % 2 != 0)
                highest = std::max(highest, m_tree[--last]);
        }
        return highest;
    }
    /// Gives each index up to `last` at which the number is that high, in order.
    template <class Visit>
    void visit(double least, std::size_t last, const Visit& visit) const
    {
        descend(1, 0, m_leaves, least, last, visit);
    }

private:
    template <class Visit>
    void descend(std::size_t node, std::size_t first, std::size_t count, double least, std::size_t last,
                 const Visit& visit) const
    {
        if (first >= last || m_tree[node] < least)
            return;
        if (count == 1)
            return visit(first);
        descend(2 * node, first, count / 2, least, last, visit);
        descend(2 * node + 1, first + count / 2, count / 2, least, last, visit);
    }

    std::size_t m_leaves;
    std::vector<double> m_tree; ///< each from 1 on is the higher one of 2 * i and 2 * i + 1
};

} // namespace cadrel::host
