// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/Node.h"

#include "standin/base/AttributeList.h"
#include "standin/base/Text.h"
#include "velmark/IString.h"

#include <utility>

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

double Node::getSourceOffset(FUnknown* /*container*/)
{
    return 0.0;
}

INodeIterator* Node::newChildIterator()
{
    return makeCounted<NoChildren>().detach();
}

void Node::setSelected(bool selected)
{
    if (std::exchange(m_isSelected, selected) != selected)
        countUnrecorded();
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

void Node::markRemoved(ChangeNotes& changes)
{
    changes.mark(*this, ChangeFlag::Removed);
}

void Node::markContentChanged()
{
    ProjectLink* const link = this->link();
    if (!link)
        return;
    if (Node* const track = this->track())
        link->changes().mark(*track, ChangeFlag::Content);
    link->changes().markProject(ChangeFlag::Content);
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

Node::Extras& Node::extras()
{
    if (!m_extras)
        m_extras = std::make_unique<Extras>();
    return *m_extras;
}

} // namespace standin
