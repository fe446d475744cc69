// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/base/Attribute.h"
#include "standin/base/TimeTree.h"
#include "standin/base/Times.h"
#include "standin/changes/ProjectLink.h"
#include "velmark/Implements.h"
#include "velmark/ProjectNode.h"

#include <memory>
#include <optional>
#include <string>
#include <utility>

namespace standin {

class Container;

/// The base of every object of a project. It lies in one container at most, which holds a reference to it; its times are
/// counted from the start of that container, and from time 0 while it lies in none.
///
/// Each change is made through an exchange of an old value for a new one. When the node belongs to a project, the change
/// goes to the ChangeLog, whose transaction may be open, and into the ChangeNotes, for those who are told of it.
class Node : public Velmark::Implements<Node, MarkedObject, Velmark::IProjectNode>, private TimeSpan {
public:
    static constexpr const char* ClassName = "Node";

    Node(const Node&) = delete;
    Node& operator=(const Node&) = delete;
    ~Node() override;

    // IProjectNode
    bool isType(const char* word) override;
    Velmark::uint32 changeFlags() override { return shownMarks(); }
    Velmark::int32 setAttribute(const char* key, const Velmark::FVariant& value, bool persistent) override;
    Velmark::int32 getAttribute(const char* key, Velmark::FVariant& value) override;
    Velmark::int32 hasAttribute(const char* key) override;
    Velmark::int32 removeAttribute(const char* key) override;
    const char16_t* getName() override { return m_name.c_str(); }
    Velmark::int32 setName(Velmark::FUnknown* container, Velmark::IString* name, Velmark::int32 reserved) override;
    bool isSelected() override { return m_isSelected; }
    double getStart(Velmark::FUnknown* container) override;
    Velmark::int32 setStart(Velmark::FUnknown* container, Velmark::int32 reserved, double seconds) override;
    Velmark::int32 setLength(Velmark::FUnknown* container, Velmark::FUnknown* transaction, double seconds) override;
    double getEnd(Velmark::FUnknown* container) override;
    Velmark::int32 setEnd(Velmark::FUnknown* container, Velmark::int32 reserved, double seconds) override;
    double getSourceOffset(Velmark::FUnknown* container) override;
    Velmark::INodeIterator* newChildIterator() override;
    Velmark::IProjectNode* getParent() override;

    // Where it stands.

    Container* parent() const { return m_parent; }
    /// The link of the project in which it is; null when it is in none.
    virtual ProjectLink* link() const;
    /// Null when it is in none.
    Project* project() const;
    /// The track that it is or on which it lies; null when there is none.
    virtual Node* track();
    /// Whether it is in the project or may be put into it: a node that has been in one is known to the undo list there, and
    /// not fit for another.
    bool canBelongTo(const Project& project);
    /// Seconds from the start of the parent.
    double start() const { return TimeSpan::start; }
    double end() const { return TimeSpan::end; }
    double length() const { return end() - start(); }
    /// The end that the interface gives, in seconds from the start of the parent: that of the content for what has no span.
    virtual double lastEnd() const { return end(); }
    /// Seconds from the start of the project.
    double absoluteStart() const;
    double absoluteEnd() const;
    /// `end` must not lie before `start`, and both must be finite.
    void setSpan(double start, double end);
    /// Takes the node out of its container, if it is in one, and puts it into another, after all that start at the same
    /// time. The container must accept it.
    void insertInto(Container& parent);
    /// The same, before all that start at the same time.
    void insertBeforeOthers(Container& parent);
    /// Takes `former` out of its container, in which it must be, and goes into it instead. Of two that start together it is
    /// in the same place among all that do.
    void takePlaceOf(Node& former)
    {
        const Place place{former.m_parent, former.order};
        former.remove();
        moveTo(place);
    }
    void remove();

    // What it is.

    /// Whether it is one of those that can have children, and so a context of times for them.
    virtual bool holdsChildren() const { return false; }
    const std::u16string& name() const { return m_name; }
    void setName(std::u16string name);
    const Attributes& attributes() const;
    void setAttribute(const std::string& key, std::optional<Attribute> attribute);
    bool selected() const { return m_isSelected; }
    /// Doesn't count as a change.
    void setSelected(bool selected);
    /// Members of the project file that this version doesn't know, as the text of a JSON object; empty without any.
    const std::string& unknownMembers() const;
    void setUnknownMembers(std::string json);

protected:
    /// What of its span can be changed through its interface: nothing, where it stands, or its length too.
    enum class Extent { Fixed, Instant, Stretch };

    Node() = default;

    virtual Extent extent() const { return Extent::Fixed; }
    /// Marks what has moved away with this node: itself, and the tracks below it.
    virtual void markRemoved(ChangeNotes& changes);
    /// Marks the track and the project of this node.
    virtual void markContentChanged();

    /// Changes a value by an exchange of `object`, which is this node, and takes it down.
    template <class Object, class Value>
    void change(Object& object, Value (Object::*exchange)(Value), Value value)
    {
        Value former = (object.*exchange)(std::move(value));
        if (ProjectLink* const recording = recordingLink())
            recording->record(std::make_unique<ValueEdit<Object, Value>>(object, exchange, std::move(former)));
        else
            countUnrecorded();
    }

private:
    friend class Container;

    /// A container and a place in it; none for a node that isn't inserted.
    struct Place {
        Container* parent = nullptr;
        std::uint64_t order = 0;
    };
    struct Span {
        double start;
        double end;
    };
    using KeyedAttribute = std::pair<std::string, std::optional<Attribute>>;
    /// What few nodes have.
    struct Extras {
        Attributes attributes;
        std::string unknownMembers;
    };

    Place exchangePlace(Place place);
    Span exchangeSpan(Span span);
    std::u16string exchangeName(std::u16string name);
    KeyedAttribute exchangeAttribute(KeyedAttribute attribute);

    void moveTo(Place place);
    void leaveParent();
    /// The link of the project that the node is in, or in which it was before it or something around it was taken out; null
    /// when there was none.
    ProjectLink* home();
    /// That link when edits are taken down; else null.
    ProjectLink* recordingLink();
    /// Notes that a change isn't taken down.
    void countUnrecorded();

    /// The absolute start of the parent; 0 without one.
    double parentStart() const;
    /// Seconds from the start of the parent to the start of a context of times; nothing for an object of another project or
    /// of none.
    std::optional<double> offsetOf(Velmark::FUnknown* container);
    /// Sets a span that came in through the interface. Refuses what isn't finite, not after the start of the parent, or
    /// beyond all time; and a negative length.
    Velmark::int32 setCheckedSpan(double start, double end);
    Extras& extras();

    Container* m_parent = nullptr;
    Velmark::Counted<ProjectLink> m_home; ///< to the project into which it was put; null when only its container was
    std::u16string m_name;
    std::unique_ptr<Extras> m_extras;
    bool m_isSelected = false;
};

} // namespace standin
