// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <algorithm>
#include <cstddef>
#include <limits>
#include <vector>

namespace desktop {

/// Stretches of time in the order of their starts, which may overlap. What lies in a range is found in the logarithm of their
/// number, plus the answer.
///
/// It is a balanced tree in an array: the middle of each stretch of the array is the root of what is left and right of it, and
/// knows the latest end of all of that. So a search passes over what ends too early.
class SpanIndex {
public:
    struct Span {
        double start;
        double end;
    };

    SpanIndex() = default;
    /// The spans have to be in order.
    explicit SpanIndex(std::vector<Span> spans) : m_spans(std::move(spans)), m_latest(m_spans.size())
    {
        computeLatest(0, m_spans.size());
    }

    std::size_t size() const { return m_spans.size(); }
    const Span& operator[](std::size_t index) const { return m_spans[index]; }
    /// The latest end; minus infinity without spans.
    double latestEnd() const { return m_spans.empty() ? NoEnd : m_latest[m_spans.size() / 2]; }

    /// Calls `visit(index)` for each span that has an instant in common with `start` to `end`, both included, in order.
    template <class Visit>
    void visitTouching(double start, double end, Visit&& visit) const
    {
        visitWithin(0, m_spans.size(), start, end, visit);
    }

private:
    static constexpr double NoEnd = -std::numeric_limits<double>::infinity();

    double computeLatest(std::size_t first, std::size_t end)
    {
        if (first == end)
            return NoEnd;
        const std::size_t middle = first + (end - first) / 2;
        m_latest[middle] =
            std::max({m_spans[middle].end, computeLatest(first, middle), computeLatest(middle + 1, end)});
        return m_latest[middle];
    }

    template <class Visit>
    void visitWithin(std::size_t first, std::size_t last, double start, double end, Visit& visit) const
    {
        while (first < last) {
            const std::size_t middle = first + (last - first) / 2;
            if (m_latest[middle] < start)
                return;
            visitWithin(first, middle, start, end, visit);
            if (m_spans[middle].start > end)
                return;
            if (m_spans[middle].end >= start)
                visit(middle);
            first = middle + 1;
        }
    }

    std::vector<Span> m_spans;
    std::vector<double> m_latest; ///< of each span and of what it is the root of
};

} // namespace desktop
