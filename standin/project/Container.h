// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/Node.h"

#include <cstddef>

namespace standin {

/// A node that holds others, in the order of their starts and, of those that start together, in the order in which they
/// were inserted. To find what lies in a range costs the logarithm of the number of children, plus the answer.
class Container : public Velmark::Implements<Container, Node> {
public:
    static constexpr const char* ClassName = "Container";

    /// Releases the children, which have no parent then.
    ~Container() override;

    Velmark::INodeIterator* newChildIterator() override;

    bool holdsChildren() const override { return true; }
    /// Whether the node may be inserted here: the right kind, and not this container itself or one around it.
    virtual bool accepts(const Node& child) const = 0;

    std::size_t childCount() const { return m_children.size(); }
    /// Null for an empty container, and after the last child.
    Node* firstChild() const;
    Node* lastChild() const;
    Node* childBehind(const Node& child) const;
    Node* childBefore(const Node& child) const;
    /// The first child that starts at or after a time, and the first that starts after it; seconds from the own start.
    Node* firstChildFrom(double time) const;
    Node* firstChildAfter(double time) const;
    /// The latest end of a child, in seconds from the own start; 0 without children.
    double contentEnd() const { return m_children.latestEnd(); }

    /// Calls `visit(Node&)` for each child that has an instant in common with `start` to `end`, both included and in seconds
    /// from the own start, in order. The visit must not edit this container.
    template <class Visit>
    void visitTouching(double start, double end, Visit visit) const
    {
        m_children.visitTouching(start, end, [&](TimeSpan& span) { visit(static_cast<Node&>(span)); });
    }

protected:
    Container() = default;

private:
    friend class Node;

    void markChildChanged(ChangeNotes& changes, Node& child);

    TimeTree m_children;
    std::uint64_t m_nextOrder = std::uint64_t{1} << 63; ///< of what comes after all with its start
    std::uint64_t m_previousOrder = m_nextOrder - 1;    ///< of what comes before them
};

} // namespace standin
