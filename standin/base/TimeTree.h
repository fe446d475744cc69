// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <cstdint>
#include <utility>

namespace standin {

/// What a TimeTree orders: a stretch of time and its place among the others that start at the same time.
struct TimeSpan {
    double start = 0.0;
    double end = 0.0;        ///< at or after `start`
    std::uint64_t order = 0; ///< of two that start together the smaller comes first; never the same within a tree

private:
    friend class TimeTree;
    TimeSpan* m_left = nullptr;
    TimeSpan* m_right = nullptr;
    TimeSpan* m_parent = nullptr;
    double m_latestEnd = 0.0; ///< of this span and of all below it
};

/// Spans of time, which may overlap, in the order of their starts. It owns nothing: a span lives elsewhere, in one tree at
/// most, and is taken out before it changes. Everything but walking costs the logarithm of the size.
///
/// The tree is a treap (Seidel and Aragon, "Randomized search trees", 1996): in order from left to right, and with
/// random priorities, here a hash of `order`, falling from the root, which keeps it balanced. Each span knows the latest
/// end below it, so that a search skips what ends too early.
class TimeTree {
public:
    TimeTree() = default;
    TimeTree(const TimeTree&) = delete;
    TimeTree& operator=(const TimeTree&) = delete;

    bool isEmpty() const { return m_root == nullptr; }
    std::size_t size() const { return m_size; }

    void insert(TimeSpan& span);
    void erase(TimeSpan& span);

    /// Null after the last, or for an empty tree.
    TimeSpan* first() const;
    TimeSpan* last() const;
    static TimeSpan* next(const TimeSpan& span);
    static TimeSpan* previous(const TimeSpan& span);
    /// The first that starts at or after a time; null when there is none.
    TimeSpan* firstFrom(double time) const;
    /// The first that starts after a time; null when there is none.
    TimeSpan* firstAfter(double time) const;
    /// The latest end; 0 for an empty tree.
    double latestEnd() const { return m_root ? m_root->m_latestEnd : 0.0; }

    /// Calls `visit(TimeSpan&)` for each span that has an instant in common with `start` to `end`, both included, in order.
    /// The tree must not change meanwhile.
    template <class Visit>
    void visitTouching(double start, double end, Visit visit) const
    {
        for (TimeSpan* span = firstTouching(m_root, start, end); span; span = nextTouching(*span, start, end))
            visit(*span);
    }

private:
    static TimeSpan* firstTouching(TimeSpan* root, double start, double end);
    static TimeSpan* nextTouching(const TimeSpan& span, double start, double end);
    static void update(TimeSpan& span);
    TimeSpan*& linkTo(TimeSpan& span);
    void liftOverParent(TimeSpan& span);

    TimeSpan* m_root = nullptr;
    std::size_t m_size = 0;
};

} // namespace standin
