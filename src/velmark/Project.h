// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

#include <cstddef>

namespace Velmark {

class IFilePath;
class ILocators;
class IMarkerTrack;
class IMediaPool;
class IProjectNotification;
class IProjectStorageNotification;

class IProjectDocument;

/// The projects that are open.
class IProjectManager : public FUnknown {
public:
    static constexpr InterfaceId<IProjectManager> iid{"3d7c28138abf4aaea23a11bf37214c36"};

    virtual int32 projectCount() = 0;
    /// Borrowed; null at an index that isn't there.
    virtual IProjectDocument* projectAt(int32 index) = 0;
    /// Borrowed; null when none is active.
    virtual IProjectDocument* activeProject() = 0;
    /// The listener isn't counted: remove it before you delete it. If it has an IProjectEditHook, that is added too. It
    /// isn't told of projects that are open already.
    virtual int32 addNotification(IProjectNotification* listener) = 0;
    virtual int32 removeNotification(IProjectNotification* listener) = 0;
};

/// A project. It is known by the address of this interface, which is the same in every call that names the project. Answers
/// to ITimeBase and to IProjectNode too, as the node that is the root of the tracks.
class IProjectDocument : public FUnknown {
public:
    static constexpr InterfaceId<IProjectDocument> iid{"5354d6acc0d44532b1bda33e229b9f3d"};

    /// Seconds from the time origin. What lies beyond isn't cut off: the root still ends at the later of the two.
    virtual int32 setProjectEnd(double seconds) = 0;
    /// Where this project is stored; `project` is this project. Counted, and null for one that never was.
    virtual IFilePath* getProjectFile(IProjectDocument* project) = 0;
    /// The track on which the host puts markers; borrowed, null when there is none. It may not be inserted yet, and has no
    /// parent then.
    virtual IMarkerTrack* getDefaultMarkerTrack() = 0;
    /// Borrowed.
    virtual ILocators* getLocators() = 0;
    /// The time context of an object, to be passed on as `container`, `parent` or `newParent`. For an object that can
    /// have children (a track, a folder, a part, a curve) it is the object itself, for any other its parent, and for
    /// null the root. Counted; null for an object that isn't in this project.
    virtual FUnknown* getContainer(FUnknown* object) = 0;
    /// A new track of the kind, with the interfaces of its kind; counted, and not inserted yet. Null for an unknown word.
    virtual FUnknown* createTrack(const char* typeWord) = 0;
    /// The listener isn't counted: remove it before you delete it.
    virtual int32 addStorageNotification(IProjectStorageNotification* listener) = 0;
    virtual int32 removeStorageNotification(IProjectStorageNotification* listener) = 0;
    /// Borrowed.
    virtual IMediaPool* getMediaPool() = 0;
};

/// What ITimeBase::getFrameRate fills.
struct FrameRateInfo {
    struct Flag {
        static constexpr uint32 DropFrame = 1;
        static constexpr uint32 PulledDown = 2;
    };

    double framesPerSecond = 0.0;
    uint32 flags = 0;
};

static_assert(sizeof(FrameRateInfo) == 16);
static_assert(offsetof(FrameRateInfo, framesPerSecond) == 0 && sizeof(FrameRateInfo::framesPerSecond) == 8);
static_assert(offsetof(FrameRateInfo, flags) == 8 && sizeof(FrameRateInfo::flags) == 4);

/// The clock of a project.
class ITimeBase : public FUnknown {
public:
    static constexpr InterfaceId<ITimeBase> iid{"e797277c02604adeb8cbac383346b5cd"};

    virtual int32 getFrameRate(FrameRateInfo& info) = 0;
    /// The time that the clock shows at time 0 of the project, in seconds.
    virtual double getTimeOrigin() = 0;
};

} // namespace Velmark
