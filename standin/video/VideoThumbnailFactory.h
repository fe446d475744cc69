// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/MediaClip.h"
#include "standin/video/VideoFile.h"
#include "util/FileStamp.h"
#include "velmark/Implements.h"
#include "velmark/Media.h"

#include <chrono>
#include <filesystem>
#include <memory>

namespace standin {

/// Draws the frames of clips out of their video files, on the thread that asks for them. The file of the last picture stays
/// open. Where there is no picture, it draws the reason.
class VideoThumbnailFactory
    : public Velmark::Implements<VideoThumbnailFactory, Velmark::FObject, Velmark::IThumbnailFactory> {
public:
    static constexpr const char* ClassName = "VideoThumbnailFactory";
    /// What a picture may take. A module waits for two seconds before it gives up a thread.
    static constexpr std::chrono::milliseconds MostTime{1500};

    /// Refuses what isn't a video of this host, and a side that no picture may have.
    Velmark::int32 setSource(Velmark::IMediaClip* clip, const Velmark::int32 size[2]) override;
    /// The picture fits the size that was asked for and keeps its shape. Null for a frame that the clip doesn't have.
    Velmark::IThumbnailImage* getImage(Velmark::uint32 frame) override;

private:
    Picture read(const std::filesystem::path& file, Velmark::uint32 frame, Deadline deadline);

    MediaClip::Caption m_caption; ///< without frames while there is no source
    PictureSize m_size;
    // The file that is open, if any, and what it was when it was opened.
    std::unique_ptr<VideoFile> m_file;
    std::filesystem::path m_path;
    cadrel::util::FileStamp m_stamp;
};

} // namespace standin
