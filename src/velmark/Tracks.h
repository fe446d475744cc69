// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

namespace Velmark {

class IObjectList;

/// The flags of ITrackNode.
struct TrackFlag {
    /// The track's lock button.
    static constexpr const char* Lock = "lock";
};

/// Says that a node is a track. Answers to IProjectNode too.
class ITrackNode : public FUnknown {
public:
    static constexpr InterfaceId<ITrackNode> iid{"ae3a033c70e0456887150f35a8a446f2"};

    /// Nonzero for a name that isn't known.
    virtual int32 setFlag(const char* name, bool value) = 0;
    /// 0 when the flag is set.
    virtual int32 getFlag(const char* name) = 0;
    /// The track's automation curves: a list of IEnvelopeTrack. Counted, and null where there can be none.
    virtual IObjectList* getAutomation() = 0;
};

/// Says that a track is a marker track. It has no operations of its own.
class IMarkerTrack : public FUnknown {
public:
    static constexpr InterfaceId<IMarkerTrack> iid{"e9c743a16c484afa99bc24c081225239"};
};

} // namespace Velmark
