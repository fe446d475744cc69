// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/VideoThumbnailFactory.h"

#include "standin/base/Text.h"
#include "standin/base/Utf16.h"
#include "standin/services/ThumbnailImage.h"
#include "standin/video/MediaPlaces.h"
#include "standin/video/VideoError.h"

#include <exception>
#include <string>
#include <utility>
#include <vector>

using namespace Velmark;

namespace standin {

namespace fs = std::filesystem;

using cadrel::util::FileStamp;

namespace {

std::u16string textOf(const fs::path& path)
{
    const std::string text = path.string();
    return isWellFormed(text) ? toUtf16(text) : u"?";
}

/// The reason, and the files that it speaks of.
std::vector<std::u16string> paragraphsOf(const MediaClip::Caption& caption, const char* reason,
                                         const std::vector<fs::path>& places)
{
    std::vector<std::u16string> paragraphs{caption.name, toUtf16(reason)};
    for (const fs::path& place : places)
        paragraphs.push_back(textOf(place));
    return paragraphs;
}

} // namespace

int32 VideoThumbnailFactory::setSource(IMediaClip* clip, const int32 size[2])
{
    m_caption = {};
    const auto* const video = dynamic_cast<MediaClip*>(clip);
    if (!video || video->kind() != MediaClip::Kind::Video || !ThumbnailImage::isSize(size))
        return ResultFalse;
    m_caption = video->caption();
    m_size = {size[0], size[1]};
    return ResultOk;
}

IThumbnailImage* VideoThumbnailFactory::getImage(uint32 frame)
{
    if (frame >= m_caption.frameCount)
        return nullptr;
    std::vector<fs::path> places;
    std::string reason;
    try {
        places = placesOf(m_caption.file);
        const fs::path file = findMedia(places);
        places = {file};
        Picture picture = read(file, frame, std::chrono::steady_clock::now() + MostTime);
        return makeCounted<ThumbnailImage>(picture.size.width, picture.size.height, std::move(picture.pixels)).detach();
    } catch (const VideoError& error) {
        // What takes too long goes on at the next request.
        if (error.reason() != VideoError::Reason::TooSlow)
            m_file.reset();
        reason = error.what();
    } catch (const std::exception&) {
        // Such as a lack of memory, or a path that can't be one.
        m_file.reset();
        reason = "The picture can't be read.";
    }
    const auto lines =
        ThumbnailImage::linesOf(paragraphsOf(m_caption, reason.c_str(), places), m_size.width, m_size.height);
    return makeCounted<ThumbnailImage>(m_size.width, m_size.height, lines).detach();
}

/// A file that is replaced while it is read is read again.
Picture VideoThumbnailFactory::read(const fs::path& file, uint32 frame, Deadline deadline)
{
    const Ratio rate = exactRate(m_caption.framesPerSecond);
    while (true) {
        const FileStamp stamp = FileStamp::of(file);
        try {
            if (!m_file || m_path != file || m_stamp != stamp) {
                m_file.reset();
                m_file = std::make_unique<VideoFile>(file, deadline);
                m_path = file;
                m_stamp = stamp;
            }
            Picture picture = m_file->picture(frame, rate, m_size, deadline);
            if (FileStamp::of(file) == stamp)
                return picture;
        } catch (const VideoError&) {
            if (FileStamp::of(file) == stamp)
                throw;
        }
        m_file.reset();
        if (std::chrono::steady_clock::now() >= deadline)
            throw VideoError(VideoError::Reason::TooSlow);
    }
}

} // namespace standin
