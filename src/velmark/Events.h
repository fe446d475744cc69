// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

namespace Velmark {

class IMediaClip;

/// Says that a node is an event or a part. Answers to IProjectNode too.
class IEventNode : public FUnknown {
public:
    static constexpr InterfaceId<IEventNode> iid{"21ffe452d83240d6ae8b6db6ae400165"};

    /// The next event or part around this one; borrowed, and null for what lies on a track itself.
    virtual IEventNode* getOwner() = 0;
};

/// An event that plays a clip of the media pool. Its class identifier is its interface's. Answers to IEventNode and
/// IProjectNode too.
class IClipEvent : public FUnknown {
public:
    static constexpr InterfaceId<IClipEvent> iid{"ee190f09858b473bb1b4981bb7c9bd28"};

    /// Borrowed; null when the event has none.
    virtual IMediaClip* getClip() = 0;
    /// The event keeps a reference of its own; null takes the clip away. `flags` is 0.
    virtual int32 setClip(IMediaClip* clip, int32 flags) = 0;
};

} // namespace Velmark
