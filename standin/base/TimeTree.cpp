// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/base/TimeTree.h"

#include <algorithm>

namespace standin {

namespace {

bool isEarlier(const TimeSpan& a, const TimeSpan& b)
{
    return a.start != b.start ? a.start < b.start : a.order < b.order;
}

/// The finalizer of SplitMix64 (Steele, Lea and Flood, "Fast splittable pseudorandom number generators", 2014).
std::uint64_t priority(const TimeSpan& span)
{
    std::uint64_t hash = span.order + 0x9E3779B97F4A7C15;
    hash = (hash ^ (hash >> 30)) * 0xBF58476D1CE4E5B9;
    hash = (hash ^ (hash >> 27)) * 0x94D049BB133111EB;
    return hash ^ (hash >> 31);
}

} // namespace

void TimeTree::update(TimeSpan& span)
{
    span.m_latestEnd = span.end;
    if (span.m_left)
        span.m_latestEnd = std::max(span.m_latestEnd, span.m_left->m_latestEnd);
    if (span.m_right)
        span.m_latestEnd = std::max(span.m_latestEnd, span.m_right->m_latestEnd);
}

TimeSpan*& TimeTree::linkTo(TimeSpan& span)
{
    if (!span.m_parent)
        return m_root;
    return span.m_parent->m_left == &span ? span.m_parent->m_left : span.m_parent->m_right;
}

//         parent                 span
//         /    \                 /    \ .
//      span     c      ->       a     parent        and mirrored
//      /  \                            /  \ .
//     a    b                          b    c
void TimeTree::liftOverParent(TimeSpan& span)
{
    TimeSpan& parent = *span.m_parent;
    linkTo(parent) = &span;
    span.m_parent = parent.m_parent;
    const bool wasLeft = parent.m_left == &span;
    TimeSpan*& inner = wasLeft ? span.m_right : span.m_left;
    (wasLeft ? parent.m_left : parent.m_right) = inner;
    if (inner)
        inner->m_parent = &parent;
    inner = &parent;
    parent.m_parent = &span;
    update(parent);
    update(span);
}

void TimeTree::insert(TimeSpan& span)
{
    TimeSpan* parent = nullptr;
    TimeSpan** link = &m_root;
    while (*link) {
        parent = *link;
        parent->m_latestEnd = std::max(parent->m_latestEnd, span.end);
        link = isEarlier(span, *parent) ? &parent->m_left : &parent->m_right;
    }
    *link = &span;
    span.m_parent = parent;
    span.m_left = span.m_right = nullptr;
    update(span);
    while (span.m_parent && priority(*span.m_parent) < priority(span))
        liftOverParent(span);
    ++m_size;
}

void TimeTree::erase(TimeSpan& span)
{
    while (span.m_left && span.m_right) {
        TimeSpan& child = priority(*span.m_left) < priority(*span.m_right) ? *span.m_right : *span.m_left;
        liftOverParent(child);
    }
    TimeSpan* const child = span.m_left ? span.m_left : span.m_right;
    linkTo(span) = child;
    if (child)
        child->m_parent = span.m_parent;
    for (TimeSpan* above = span.m_parent; above; above = above->m_parent)
        update(*above);
    span.m_left = span.m_right = span.m_parent = nullptr;
    --m_size;
}

TimeSpan* TimeTree::first() const
{
    TimeSpan* span = m_root;
    while (span && span->m_left)
        span = span->m_left;
    return span;
}

TimeSpan* TimeTree::last() const
{
    TimeSpan* span = m_root;
    while (span && span->m_right)
        span = span->m_right;
    return span;
}

TimeSpan* TimeTree::next(const TimeSpan& span)
{
    if (TimeSpan* below = span.m_right) {
        while (below->m_left)
            below = below->m_left;
        return below;
    }
    const TimeSpan* from = &span;
    while (from->m_parent && from->m_parent->m_right == from)
        from = from->m_parent;
    return from->m_parent;
}

TimeSpan* TimeTree::previous(const TimeSpan& span)
{
    if (TimeSpan* below = span.m_left) {
        while (below->m_right)
            below = below->m_right;
        return below;
    }
    const TimeSpan* from = &span;
    while (from->m_parent && from->m_parent->m_left == from)
        from = from->m_parent;
    return from->m_parent;
}

TimeSpan* TimeTree::firstFrom(double time) const
{
    TimeSpan* found = nullptr;
    for (TimeSpan* span = m_root; span;) {
        if (span->start < time) {
            span = span->m_right;
        } else {
            found = span;
            span = span->m_left;
        }
    }
    return found;
}

TimeSpan* TimeTree::firstAfter(double time) const
{
    TimeSpan* found = nullptr;
    for (TimeSpan* span = m_root; span;) {
        if (span->start <= time) {
            span = span->m_right;
        } else {
            found = span;
            span = span->m_left;
        }
    }
    return found;
}

TimeSpan* TimeTree::firstTouching(TimeSpan* root, double start, double end)
{
    while (root && root->m_latestEnd >= start) {
        // When something to the left ends late enough, the first that touches is there or, where that starts too late,
        // nowhere.
        if (root->m_left && root->m_left->m_latestEnd >= start)
            root = root->m_left;
        else if (root->start > end)
            return nullptr;
        else if (root->end >= start)
            return root;
        else
            root = root->m_right;
    }
    return nullptr;
}

TimeSpan* TimeTree::nextTouching(const TimeSpan& span, double start, double end)
{
    const TimeSpan* from = &span;
    while (true) {
        if (TimeSpan* const found = firstTouching(from->m_right, start, end))
            return found;
        while (from->m_parent && from->m_parent->m_right == from)
            from = from->m_parent;
        from = from->m_parent;
        if (!from || from->start > end)
            return nullptr;
        if (from->end >= start)
            return const_cast<TimeSpan*>(from);
    }
}

} // namespace standin
