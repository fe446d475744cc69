// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Attributes.h"
#include "velmark/Editing.h"
#include "velmark/Events.h"
#include "velmark/Media.h"

namespace Velmark {

/// The classes of which IHostContext::getInterface makes new objects, not inserted anywhere. Use create().
struct ClassId {
    /// Both answer to IEventNode and IProjectNode.
    static constexpr Identifier PointMarker{"0499ab464c5f463d9baf00e704b52d35"};
    static constexpr Identifier RangeMarker{"b52fc642aa6f4d32afa27ce272c1f81b"};
    /// Answers to IAutomationPoint and IProjectNode.
    static constexpr Identifier AutomationPoint{"a17080f99f904198a6ed641a168e119e"};
    static constexpr Identifier AttributeList = IAttributeData::iid;
    static constexpr Identifier ClipEvent = IClipEvent::iid;
    static constexpr Identifier FilePath = IFilePath::iid;
    static constexpr Identifier ObjectList = IObjectList::iid;
};

} // namespace Velmark
