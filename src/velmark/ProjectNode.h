// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

namespace Velmark {

class FVariant;
class INodeIterator;
class IString;

/// The words of IProjectNode::isType. A node answers to several: a marker track to "track" and "marker", an event to the
/// kind of its track, a range marker to "range" and a part to "part" beside. They name the kind of what `createTrack` makes
/// and of the items of the media pool, too.
struct TypeWord {
    static constexpr const char* Track = "track";
    static constexpr const char* Audio = "audio";
    static constexpr const char* Video = "video";
    static constexpr const char* Marker = "marker";
    static constexpr const char* Folder = "folder";
    static constexpr const char* Ruler = "ruler";
    static constexpr const char* Part = "part";
    static constexpr const char* Range = "range";
};

/// The bits of IProjectNode::changeFlags.
struct ChangeFlag {
    /// The object was removed or moved away. It is kept alive until all listeners have been called.
    static constexpr uint32 Removed = 2;
    /// Children were added or removed. The project has it for tracks at any depth.
    static constexpr uint32 Children = 4;
    /// The content changed: for a track an event, a point, a name or an attribute in it; for the project any of these.
    static constexpr uint32 Content = 8;
};

/// Every object of a project: the project's root, tracks, parts, events, automation curves and their points.
///
/// Times are seconds from the project's time origin: the instant that the project's clock calls ITimeBase::getTimeOrigin
/// is time 0. `container` is the time context that IProjectDocument::getContainer gives. Null, the root, a folder, a track
/// and a curve all mean these times; a part means seconds from its own start.
///
/// A node that isn't inserted yet has times from the start of the project, and keeps them when it is inserted. Setters
/// work there too. They also work outside of transactions; inside one they belong to it.
class IProjectNode : public FUnknown {
public:
    static constexpr InterfaceId<IProjectNode> iid{"7a6f999fbdbc4bccac403dabace8a171"};

    virtual bool isType(const char* word) = 0;
    /// The change that listeners are being told of now, as ChangeFlag bits; 0 at any other time.
    virtual uint32 changeFlags() = 0;
    /// Replaces the attribute. A persistent one is stored with the project, any other is gone once it closes.
    virtual int32 setAttribute(const char* key, const FVariant& value, bool persistent) = 0;
    /// Nonzero, and `value` as it was, when it isn't there.
    virtual int32 getAttribute(const char* key, FVariant& value) = 0;
    /// 0 when it is there.
    virtual int32 hasAttribute(const char* key) = 0;
    /// Nonzero when it isn't there.
    virtual int32 removeAttribute(const char* key) = 0;
    /// UTF-16, zero-ended, never null; until the name changes.
    virtual const char16_t* getName() = 0;
    /// The text is only read during the call; `reserved` is 0.
    virtual int32 setName(FUnknown* container, IString* name, int32 reserved) = 0;
    virtual bool isSelected() = 0;
    virtual double getStart(FUnknown* container) = 0;
    /// Moves the object; its length stays. `reserved` is 0.
    virtual int32 setStart(FUnknown* container, int32 reserved, double seconds) = 0;
    /// Moves the end. The transaction is the open one, or null; it is borrowed.
    virtual int32 setLength(FUnknown* container, FUnknown* transaction, double seconds) = 0;
    /// Of the root: the later of the project's set end and the end of its last content.
    virtual double getEnd(FUnknown* container) = 0;
    /// Moves the end; the start stays. `reserved` is 0.
    virtual int32 setEnd(FUnknown* container, int32 reserved, double seconds) = 0;
    /// How far into its clip an event begins to play, in seconds; 0 for what has no clip.
    virtual double getSourceOffset(FUnknown* container) = 0;
    /// The children by their start, those of a folder or the root in their order from top to bottom; a part is one child.
    /// Counted.
    virtual INodeIterator* newChildIterator() = 0;
    /// Borrowed. The root and a node that isn't inserted have none; a track that is in no folder has the root.
    virtual IProjectNode* getParent() = 0;
};

/// Iterates over the children of a node. Don't use it after the node has been edited. It has no identifier.
class INodeIterator : public FUnknown {
public:
    virtual bool isDone() = 0;
    /// Returns the child and moves on; borrowed. Null when done.
    virtual IProjectNode* next() = 0;
};

} // namespace Velmark
