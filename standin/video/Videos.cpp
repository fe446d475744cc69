// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/Videos.h"

#include "standin/video/MediaPlaces.h"
#include "standin/video/VideoError.h"
#include "standin/video/VideoFile.h"
#include "standin/video/VideoThumbnailFactory.h"

#include <exception>

namespace standin {

using cadrel::util::FileStamp;

namespace {

/// Project files have no place for a lower one.
constexpr double LowestRate = 1.0;

} // namespace

std::optional<VideoSupport::Video> Videos::probe(const MediaReference& reference, double projectFramesPerSecond)
{
    std::filesystem::path path;
    FileStamp stamp;
    try {
        path = findMedia(placesOf(reference));
        stamp = FileStamp::of(path);
        if (const auto refused = m_refused.find(path); refused != m_refused.end() && refused->second == stamp)
            return std::nullopt;
        const VideoFile file(path, std::chrono::steady_clock::now() + VideoThumbnailFactory::MostTime);
        const double rate = file.rate().value();
        return Video{file.frameCount(exactRate(projectFramesPerSecond)), rate >= LowestRate ? rate : 0.0};
    } catch (const VideoError&) {
        if (!path.empty())
            m_refused[path] = stamp;
    } catch (const std::exception&) {
        // A path that can't be one, or a lack of memory.
    }
    return std::nullopt;
}

Velmark::Counted<Velmark::FObject> Videos::createThumbnailFactory()
{
    return Velmark::makeCounted<VideoThumbnailFactory>();
}

} // namespace standin
