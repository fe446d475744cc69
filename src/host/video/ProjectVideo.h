// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/video/PoolVideoSource.h"
#include "host/video/TrackVideoSource.h"
#include "host/video/VideoSourceTrack.h"
#include "host/video/VideoTrackHandler.h"
#include "host/video/VideoWriting.h"

namespace Velmark {
class IEditTransaction;
class IHostContext;
} // namespace Velmark

namespace cadrel::host {

class Project;

/// The video of the current project: the old one on its track, the new one in the list of the new videos, which it writes on
/// the track of the new picture. It draws nothing; what shows the pictures derives from it.
class ProjectVideo {
public:
    /// The context outlives this object.
    explicit ProjectVideo(Velmark::IHostContext* context);
    ProjectVideo(const ProjectVideo&) = delete;
    ProjectVideo& operator=(const ProjectVideo&) = delete;
    virtual ~ProjectVideo();

    /// Not owned; null for none. A project is taken away before it goes.
    void setProject(Project* project);
    /// Looks for the tracks anew and, with `write`, puts the new videos on theirs, `offset` seconds later than they stand in
    /// the list. Does nothing without a project.
    VideoWriting apply(bool write, Velmark::IEditTransaction& transaction, double offset);
    /// To be called over and over, from the main thread.
    virtual void poll() {}

    VideoTrackHandler& tracks() { return m_trackHandler; }

protected:
    VideoSourceBase& oldSource() { return m_oldSource; }
    VideoSourceBase& newSource() { return m_newSource; }

private:
    VideoTrackHandler m_trackHandler;
    TrackVideoSource m_oldSource;
    PoolVideoSource m_newSource;
    VideoSourceTrack m_writer;
    Project* m_project = nullptr;
};

} // namespace cadrel::host
