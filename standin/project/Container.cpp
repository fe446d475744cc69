// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/Container.h"

using namespace Velmark;

namespace standin {

namespace {

/// Walks over the children of a container. It holds the one to come, and ends when that has been taken out meanwhile.
class ChildIterator : public Implements<ChildIterator, FObject, INodeIterator> {
public:
    static constexpr const char* ClassName = "ChildIterator";

    explicit ChildIterator(Container& container)
        : m_container(Counted<Container>::share(&container)), m_next(Counted<Node>::share(container.firstChild()))
    {
    }

    bool isDone() override { return !m_next || m_next->parent() != m_container.get(); }
    IProjectNode* next() override
    {
        if (isDone())
            return nullptr;
        Node* const child = m_next.get();
        m_next = Counted<Node>::share(m_container->childBehind(*child));
        return child;
    }

private:
    Counted<Container> m_container;
    Counted<Node> m_next;
};

} // namespace

Container::~Container()
{
    while (Node* const child = firstChild())
        child->leaveParent();
}

INodeIterator* Container::newChildIterator()
{
    return makeCounted<ChildIterator>(*this).detach();
}

Node* Container::firstChild() const
{
    return static_cast<Node*>(m_children.first());
}

Node* Container::lastChild() const
{
    return static_cast<Node*>(m_children.last());
}

Node* Container::childBehind(const Node& child) const
{
    return static_cast<Node*>(TimeTree::next(child));
}

Node* Container::childBefore(const Node& child) const
{
    return static_cast<Node*>(TimeTree::previous(child));
}

Node* Container::firstChildFrom(double time) const
{
    return static_cast<Node*>(m_children.firstFrom(time));
}

Node* Container::firstChildAfter(double time) const
{
    return static_cast<Node*>(m_children.firstAfter(time));
}

void Container::markChildChanged(ChangeNotes& changes, Node& child)
{
    changes.mark(*this, ChangeFlag::Children);
    if (child.track() == &child)
        changes.markProject(ChangeFlag::Children);
    else
        markContentChanged();
}

} // namespace standin
