// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"

namespace Velmark {
class FUnknown;
class IHostContext;
class ITrackNode;
} // namespace Velmark

namespace cadrel::host {

class ProjectListener;

/// What the handles on tracks need of the project in which the tracks stand.
class TrackProject {
public:
    /// Listeners are not owned.
    virtual void addListener(ProjectListener* listener) = 0;
    virtual void removeListener(ProjectListener* listener) = 0;
    /// Whether the host still has the track.
    virtual bool isTrackAlive(const Velmark::ITrackNode* track) = 0;
    /// At what time the project's clock begins, in seconds.
    virtual double timeOrigin() const = 0;
    /// The context of an object's times; null gives the root's.
    virtual Velmark::Counted<Velmark::FUnknown> containerOf(Velmark::FUnknown* object) = 0;
    virtual Velmark::IHostContext* hostContext() const = 0;

protected:
    ~TrackProject() = default;
};

} // namespace cadrel::host
