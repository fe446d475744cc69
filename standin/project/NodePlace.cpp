// SPDX-License-Identifier: GPL-3.0-or-later

// Where a node stands: the container in which it lies, and its times.

#include "standin/project/Container.h"
#include "standin/project/Project.h"

#include <algorithm>
#include <cmath>

using namespace Velmark;

namespace standin {

double Node::getStart(FUnknown* container)
{
    return start() - offsetOf(container).value_or(-parentStart());
}

int32 Node::setStart(FUnknown* container, int32 /*reserved*/, double seconds)
{
    const std::optional<double> offset = offsetOf(container);
    if (!offset || extent() == Extent::Fixed)
        return ResultFalse;
    const double moved = seconds + *offset;
    return setCheckedSpan(moved, moved + length());
}

int32 Node::setLength(FUnknown* container, FUnknown* /*transaction*/, double seconds)
{
    if (!offsetOf(container) || extent() != Extent::Stretch)
        return ResultFalse;
    return setCheckedSpan(start(), start() + seconds);
}

double Node::getEnd(FUnknown* container)
{
    return lastEnd() - offsetOf(container).value_or(-parentStart());
}

int32 Node::setEnd(FUnknown* container, int32 /*reserved*/, double seconds)
{
    const std::optional<double> offset = offsetOf(container);
    if (!offset || extent() != Extent::Stretch)
        return ResultFalse;
    return setCheckedSpan(start(), seconds + *offset);
}

IProjectNode* Node::getParent()
{
    return m_parent;
}

ProjectLink* Node::link() const
{
    return m_parent ? m_parent->link() : nullptr;
}

Project* Node::project() const
{
    const ProjectLink* const link = this->link();
    return link ? link->project() : nullptr;
}

Node* Node::track()
{
    return m_parent ? m_parent->track() : nullptr;
}

double Node::absoluteStart() const
{
    return parentStart() + start();
}

double Node::absoluteEnd() const
{
    return parentStart() + end();
}

void Node::setSpan(double start, double end)
{
    if (start != this->start() || end != this->end())
        change(*this, &Node::exchangeSpan, Span{start, end});
}

void Node::insertInto(Container& parent)
{
    moveTo({&parent, parent.m_nextOrder++});
}

void Node::insertBeforeOthers(Container& parent)
{
    moveTo({&parent, parent.m_previousOrder--});
}

void Node::remove()
{
    if (m_parent)
        moveTo({});
}

void Node::moveTo(Place place)
{
    const auto keptAlive = Counted<Node>::share(this);
    ProjectLink* const former = recordingLink();
    Place other = exchangePlace(place);
    if (ProjectLink* const recording = former ? former : recordingLink())
        recording->record(std::make_unique<ValueEdit<Node, Place>>(*this, &Node::exchangePlace, other));
    else
        countUnrecorded();
}

bool Node::canBelongTo(const Project& project)
{
    const ProjectLink* const home = this->home();
    return !home || home->project() == &project;
}

ProjectLink* Node::home()
{
    Node* node = this;
    while (node && !node->m_home)
        node = static_cast<Node*>(node->getParent());
    return node ? node->m_home.get() : nullptr;
}

ProjectLink* Node::recordingLink()
{
    ProjectLink* const link = this->link();
    // What was taken out comes back when that is undone, and has to be what it was.
    ProjectLink* const found = link ? link : home();
    return found && found->isRecording() ? found : nullptr;
}

void Node::countUnrecorded()
{
    ProjectLink* const link = this->link();
    ProjectLink* const found = link ? link : home();
    if (found && found->project() != this)
        found->countUnrecorded();
}

void Node::leaveParent()
{
    m_parent->m_children.erase(*this);
    m_parent = nullptr;
    release();
}

Node::Place Node::exchangePlace(Place place)
{
    const auto keptAlive = Counted<Node>::share(this);
    const Place former{m_parent, order};
    if (m_parent) {
        if (ProjectLink* const link = this->link()) {
            m_home = Counted<ProjectLink>::share(link);
            markRemoved(link->changes());
            m_parent->markChildChanged(link->changes(), *this);
        }
        leaveParent();
    }
    order = place.order;
    if (place.parent) {
        addRef();
        m_parent = place.parent;
        m_parent->m_children.insert(*this);
        if (ProjectLink* const link = this->link()) {
            m_home = Counted<ProjectLink>::share(link);
            m_parent->markChildChanged(link->changes(), *this);
        }
    }
    return former;
}

Node::Span Node::exchangeSpan(Span span)
{
    if (m_parent)
        m_parent->m_children.erase(*this);
    const Span former{std::exchange(TimeSpan::start, span.start), std::exchange(TimeSpan::end, span.end)};
    if (m_parent)
        m_parent->m_children.insert(*this);
    markContentChanged();
    return former;
}

double Node::parentStart() const
{
    return m_parent ? m_parent->absoluteStart() : 0.0;
}

std::optional<double> Node::offsetOf(FUnknown* container)
{
    if (!container)
        return -parentStart();
    auto* const node = dynamic_cast<Node*>(container);
    if (!node || (node->project() && project() && node->project() != project()))
        return std::nullopt;
    const Node* const context = node->holdsChildren() ? node : node->parent();
    if (!context)
        return std::nullopt;
    return context->absoluteStart() - parentStart();
}

int32 Node::setCheckedSpan(double start, double end)
{
    if (!std::isfinite(start) || !std::isfinite(end) || start <= -SameInstant || end - start <= -SameInstant)
        return ResultFalse;
    if (parentStart() + end > FurthestTime)
        return ResultFalse;
    // Sums and differences of times are a hair off at times.
    start = std::max(start, 0.0);
    setSpan(start, std::max(start, end));
    return ResultOk;
}

} // namespace standin
