// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/video/VideoProviderBase.h"
#include "host/picture/SingleImageProvider.h"
#include "host/video/PoolVideoSource.h"
#include "host/video/TrackVideoSource.h"
#include "host/video/VideoSourceTrack.h"
#include "host/video/VideoTrackHandler.h"

#include <array>
#include <cstddef>

namespace Velmark {
class IEditTransaction;
class IHostContext;
} // namespace Velmark

namespace cadrel::host {

class Project;

/// The pictures of the current project: the old one from its video track, the new one from the list of the new videos. It also
/// writes that list on the track of the new picture.
class VideoProvider : public gui::VideoProviderBase {
public:
    /// The context outlives the provider.
    explicit VideoProvider(Velmark::IHostContext* context);
    ~VideoProvider() override;

    /// Not owned; null for none. A project is taken away before it goes.
    void setProject(Project* project);
    /// Looks for the tracks anew and, with `write`, puts the new videos on theirs, `offset` seconds later than they stand in
    /// the list. Does nothing without a project.
    void apply(bool write, Velmark::IEditTransaction& transaction, double offset);
    /// Delivers what has come and asks for what is wanted; to be called over and over.
    void poll();

    VideoTrackHandler& getTrackHandler() override { return m_trackHandler; }

protected:
    void requestImage(std::size_t side, int width, int height, bool lastFrame, double time) override;

private:
    VideoTrackHandler m_trackHandler;
    TrackVideoSource m_oldSource;
    PoolVideoSource m_newSource;
    VideoSourceTrack m_writer;
    std::array<SingleImageProvider, 2> m_images; ///< by side
    Project* m_project = nullptr;
};

} // namespace cadrel::host
