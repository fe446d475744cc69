// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/picture/VideoProviderBase.h"
#include "host/picture/SingleImageProvider.h"
#include "host/video/ProjectVideo.h"

#include <array>
#include <cstddef>

namespace cadrel::host {

/// The pictures of the current project for a window: the old one from its video track, the new one from the list of the new
/// videos.
class VideoProvider : public ProjectVideo, public gui::VideoProviderBase {
public:
    /// The context outlives the provider.
    explicit VideoProvider(Velmark::IHostContext* context);

    /// Delivers what has come and asks for what is wanted. While it has no listeners, nothing is drawn; what was wanted
    /// meanwhile comes when it has one again.
    void poll() override;

    VideoTrackHandler& getTrackHandler() override { return tracks(); }

protected:
    void requestImage(std::size_t side, int width, int height, bool lastFrame, double time) override;

private:
    std::array<SingleImageProvider, 2> m_images; ///< by side
};

} // namespace cadrel::host
