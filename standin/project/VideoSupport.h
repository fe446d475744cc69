// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"
#include "velmark/FObject.h"

#include <optional>
#include <string>

namespace standin {

/// Where a project names a file of media.
struct MediaReference {
    std::u16string path;        ///< as the project has it
    std::u16string projectFile; ///< empty for a project that was never stored
};

/// What opens video files for a host. A host without it draws the names of frames, and brings no new videos into its pools.
class VideoSupport {
public:
    struct Video {
        Velmark::uint32 frameCount = 0; ///< in frames of the project
        double framesPerSecond = 0.0;   ///< of the file
    };

    virtual ~VideoSupport() = default;

    /// Reads what the video is. Nothing when the file has no picture or can't be used.
    virtual std::optional<Video> probe(const MediaReference& file, double projectFramesPerSecond) = 0;
    /// An object that is an IThumbnailFactory.
    virtual Velmark::Counted<Velmark::FObject> createThumbnailFactory() = 0;
};

} // namespace standin
