// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/Node.h"

#include "standin/edit/ChangeLog.h"
#include "standin/project/AttributeList.h"
#include "standin/project/Container.h"
#include "standin/project/Project.h"
#include "standin/project/Text.h"
#include "standin/project/Track.h"
#include "velmark/IString.h"

#include <algorithm>
#include <cmath>

using namespace Velmark;

namespace standin {

namespace {

/// An iterator over nothing, for what has no children.
class NoChildren : public Implements<NoChildren, FObject, INodeIterator> {
public:
    static constexpr const char* ClassName = "NoChildren";

    bool isDone() override { return true; }
    IProjectNode* next() override { return nullptr; }
};

/// A copy of a list of attributes; null for any other object. Lists go in and out as copies, so that nothing changes in the
/// project behind the back of its undo list.
Counted<FUnknown> copyOfList(FUnknown* object)
{
    const auto* const list = dynamic_cast<AttributeList*>(object);
    return list ? Counted<FObject>(makeCounted<AttributeList>(*list)) : nullptr;
}

/// Nothing for a value that no attribute can have.
std::optional<Attribute> readAttribute(const FVariant& value, bool persistent)
{
    if (value.isInteger())
        return Attribute{value.asInteger(), persistent};
    if (const char* const text = value.asString(); text && isWellFormed(text))
        return Attribute{std::string(text), persistent};
    FUnknown* const object = value.asObject();
    if (auto copy = copyOfList(object))
        return Attribute{std::move(copy), persistent};
    if (object && !persistent)
        return Attribute{Counted<FUnknown>::share(object), persistent};
    return std::nullopt;
}

struct ToVariant {
    FVariant operator()(int64 integer) const { return FVariant::integer(integer); }
    FVariant operator()(const std::string& text) const { return FVariant::string(text.c_str()); }
    FVariant operator()(const Counted<FUnknown>& object) const
    {
        const Counted<FUnknown> copy = copyOfList(object.get());
        return FVariant::object(copy ? copy.get() : object.get());
    }
};

} // namespace

Node::~Node() = default;

bool Node::isType(const char* /*word*/)
{
    return false;
}

int32 Node::setAttribute(const char* key, const FVariant& value, bool persistent)
{
    if (!key || !isWellFormed(key))
        return ResultFalse;
    std::optional<Attribute> attribute = readAttribute(value, persistent);
    if (!attribute)
        return ResultFalse;
    setAttribute(std::string(key), std::move(attribute));
    return ResultOk;
}

int32 Node::getAttribute(const char* key, FVariant& value)
{
    if (hasAttribute(key) != ResultOk)
        return ResultFalse;
    value = std::visit(ToVariant(), attributes().find(key)->second.value);
    return ResultOk;
}

int32 Node::hasAttribute(const char* key)
{
    return key && attributes().contains(key) ? ResultOk : ResultFalse;
}

int32 Node::removeAttribute(const char* key)
{
    if (hasAttribute(key) != ResultOk)
        return ResultFalse;
    setAttribute(std::string(key), std::nullopt);
    return ResultOk;
}

int32 Node::setName(FUnknown* /*container*/, IString* name, int32 /*reserved*/)
{
    const char16_t* const text = name ? name->text16() : nullptr;
    if (!text || !isWellFormed(text))
        return ResultFalse;
    setName(std::u16string(text));
    return ResultOk;
}

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

double Node::getSourceOffset(FUnknown* /*container*/)
{
    return 0.0;
}

INodeIterator* Node::newChildIterator()
{
    return makeCounted<NoChildren>().detach();
}

IProjectNode* Node::getParent()
{
    return m_parent;
}

Project* Node::project()
{
    return m_parent ? m_parent->project() : nullptr;
}

Track* Node::track()
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

void Node::remove()
{
    if (m_parent)
        moveTo({});
}

void Node::moveTo(Place place)
{
    const auto keptAlive = Counted<Node>::share(this);
    Project* const former = recordingProject();
    Place other = exchangePlace(place);
    if (Project* const recording = former ? former : recordingProject())
        record(*recording, std::make_unique<ValueEdit<Node, Place>>(*this, &Node::exchangePlace, other));
}

void Node::setName(std::u16string name)
{
    if (name != m_name)
        change(*this, &Node::exchangeName, std::move(name));
}

const Attributes& Node::attributes() const
{
    static const Attributes none;
    return m_extras ? m_extras->attributes : none;
}

void Node::setAttribute(const std::string& key, std::optional<Attribute> attribute)
{
    const auto found = attributes().find(key);
    const bool isThere = found != attributes().end();
    if (attribute ? isThere && found->second == *attribute : !isThere)
        return;
    change(*this, &Node::exchangeAttribute, KeyedAttribute{key, std::move(attribute)});
}

const std::string& Node::unknownMembers() const
{
    static const std::string none;
    return m_extras ? m_extras->unknownMembers : none;
}

void Node::setUnknownMembers(std::string json)
{
    if (json != unknownMembers())
        extras().unknownMembers = std::move(json);
}

void Node::mark(Project& project, uint32 flags)
{
    if (m_marks == 0)
        project.noteMarked(*this);
    m_marks = static_cast<uint8>(m_marks | flags);
}

void Node::markRemoved(Project& project)
{
    mark(project, ChangeFlag::Removed);
}

void Node::markContentChanged()
{
    Project* const project = this->project();
    if (!project)
        return;
    if (Track* const track = this->track())
        track->mark(*project, ChangeFlag::Content);
    project->mark(*project, ChangeFlag::Content);
}

bool Node::canBelongTo(const Project& project)
{
    const ProjectLink* const home = this->home();
    return !home || home->project == &project;
}

const ProjectLink* Node::home()
{
    Node* node = this;
    while (node && !node->m_home)
        node = static_cast<Node*>(node->getParent());
    return node ? node->m_home.get() : nullptr;
}

Project* Node::recordingProject()
{
    Project* project = this->project();
    // What was taken out comes back when that is undone, and has to be what it was.
    if (const ProjectLink* const home = project ? nullptr : this->home())
        project = home->project;
    return project && project->isOpen() && project->log().isOpen() ? project : nullptr;
}

void Node::record(Project& project, std::unique_ptr<Edit> edit)
{
    project.log().add(project, std::move(edit));
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
        if (Project* const project = this->project()) {
            m_home = project->link();
            markRemoved(*project);
            m_parent->markChildChanged(*project, *this);
        }
        leaveParent();
    }
    order = place.order;
    if (place.parent) {
        addRef();
        m_parent = place.parent;
        m_parent->m_children.insert(*this);
        if (Project* const project = this->project()) {
            m_home = project->link();
            m_parent->markChildChanged(*project, *this);
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

std::u16string Node::exchangeName(std::u16string name)
{
    std::swap(m_name, name);
    markContentChanged();
    return name;
}

Node::KeyedAttribute Node::exchangeAttribute(KeyedAttribute attribute)
{
    Attributes& attributes = extras().attributes;
    auto& [key, value] = attribute;
    const auto found = attributes.find(key);
    std::optional<Attribute> former;
    if (found != attributes.end())
        former = std::move(found->second);
    if (value)
        attributes[key] = std::move(*value);
    else if (found != attributes.end())
        attributes.erase(found);
    markContentChanged();
    return {std::move(key), std::move(former)};
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
    if (parentStart() + end > Project::FurthestTime)
        return ResultFalse;
    // Sums and differences of times are a hair off at times.
    start = std::max(start, 0.0);
    setSpan(start, std::max(start, end));
    return ResultOk;
}

Node::Extras& Node::extras()
{
    if (!m_extras)
        m_extras = std::make_unique<Extras>();
    return *m_extras;
}

} // namespace standin
