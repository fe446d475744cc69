// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/VideoFile.h"

#include "standin/video/VideoError.h"

#include <algorithm>
#include <cmath>
#include <utility>

namespace standin {

using Reason = VideoError::Reason;

namespace {

/// How many decoded pictures are kept, so that one can go back by a few. Large ones are fewer.
constexpr std::size_t MostInRun = 12;
constexpr std::size_t MostBytesInRun = std::size_t{128} << 20;
/// So many pictures before the wanted one, all are decoded; and where the key pictures aren't known, it is quicker to go on so
/// far than to seek.
constexpr std::int64_t NearPictures = 14;

Orientation orientationIn(const AVStream& stream)
{
    std::size_t size = 0;
    const auto* const matrix =
        reinterpret_cast<const std::int32_t*>(av_stream_get_side_data(&stream, AV_PKT_DATA_DISPLAYMATRIX, &size));
    if (!matrix || size < 9 * sizeof(std::int32_t))
        return {};
    return orientationOf(matrix[0], matrix[1], matrix[3], matrix[4]);
}

/// What isn't known or makes no sense counts as square.
Ratio pixelAspectOf(const AVFrame& picture, const AVStream& stream)
{
    const AVRational aspect = stream.sample_aspect_ratio.num > 0 && stream.sample_aspect_ratio.den > 0
                                  ? stream.sample_aspect_ratio
                                  : picture.sample_aspect_ratio;
    return aspect.num > 0 && aspect.den > 0 ? Ratio{aspect.num, aspect.den} : Ratio{1, 1};
}

/// Whether parts of it had to be guessed.
bool isDamaged(const AVFrame& picture)
{
    return (picture.flags & AV_FRAME_FLAG_CORRUPT) != 0 || picture.decode_error_flags != 0;
}

} // namespace

VideoFile::VideoFile(const std::filesystem::path& file, Deadline deadline) : m_reader(file, deadline)
{
    m_orientation = orientationIn(m_reader.stream());
    if (!readNext())
        throw VideoError(Reason::Broken);
    m_origin = PictureReader::timeOf(*m_run.front());
    m_end = std::max(m_reader.findEnd(), m_origin + 1);
    forgetRun();
}

std::uint32_t VideoFile::frameCount(Ratio rate) const
{
    return std::max(clockOf(rate).frameCount(m_end), 1U);
}

Picture VideoFile::picture(std::uint32_t frame, Ratio rate, PictureSize box, Deadline deadline)
{
    if (frame >= frameCount(rate))
        throw VideoError(Reason::PastTheEnd);
    m_reader.setDeadline(deadline);
    try {
        const AVFrame& found = pictureAt(frame, clockOf(rate));
        if (isDamaged(found))
            throw VideoError(Reason::Broken);
        return m_drawing.draw(found, pixelAspectOf(found, m_reader.stream()), m_orientation, box);
    } catch (...) {
        forgetRun();
        throw;
    }
}

const AVFrame& VideoFile::pictureAt(std::uint32_t frame, const FrameClock& clock)
{
    if (const AVFrame* const known = findInRun(frame, clock))
        return *known;
    if (isNear(frame, clock))
        goForward(frame, clock);
    else
        seekTo(frame, clock);
    const AVFrame* const found = findInRun(frame, clock);
    if (!found)
        throw VideoError(Reason::Broken);
    // The picture before a part that can't be read isn't the one in that part.
    const std::int64_t shownUntil = PictureReader::timeOf(*found) + m_reader.durationOf(*found);
    if (m_runsToTheEnd && found == m_run.back().get() && shownUntil < m_end && clock.isBeforeMiddle(shownUntil, frame))
        throw VideoError(Reason::Broken);
    return *found;
}

const AVFrame* VideoFile::findInRun(std::uint32_t frame, const FrameClock& clock) const
{
    for (std::size_t index = m_run.size(); index > 0; --index) {
        const AVFrame& picture = *m_run[index - 1];
        if (clock.isBeforeMiddle(PictureReader::timeOf(picture), frame))
            return index < m_run.size() || m_runsToTheEnd ? &picture : nullptr;
    }
    return nullptr;
}

bool VideoFile::isNear(std::uint32_t frame, const FrameClock& clock) const
{
    if (m_run.empty() || !clock.isBeforeMiddle(PictureReader::timeOf(*m_run.back()), frame))
        return false;
    const std::int64_t here = PictureReader::timeOf(*m_run.back());
    const std::int64_t wanted = clock.lastTickOf(frame);
    return wanted - here <= NearPictures * m_reader.frameTicks() || m_reader.isWithoutKeyBetween(here, wanted);
}

void VideoFile::goForward(std::uint32_t frame, const FrameClock& clock)
{
    while (clock.isBeforeMiddle(PictureReader::timeOf(*m_run.back()), frame) && readNext())
        ;
}

void VideoFile::seekTo(std::uint32_t frame, const FrameClock& clock)
{
    const std::int64_t wanted = clock.lastTickOf(frame);
    const std::int64_t decodedFrom = wanted - NearPictures * m_reader.frameTicks();
    const std::int64_t firstStep = std::max<std::int64_t>(1, std::llround(1.0 / m_reader.timeBase().value()));
    bool leavesOut = true;
    std::int64_t back = 0;
    while (true) {
        const bool isAtStart = !seekBack(wanted - back);
        if (leavesOut)
            m_reader.leaveOutBefore(decodedFrom);
        if (readNext() && clock.isBeforeMiddle(PictureReader::timeOf(*m_run.back()), frame)) {
            goForward(frame, clock);
            if (!hasLeftOutTheRightOne(frame, clock))
                return dropBefore(m_reader.lastLeftOut().value_or(m_origin));
            leavesOut = false;
        } else if (isAtStart) {
            throw VideoError(Reason::Broken);
        } else {
            back = back == 0 ? firstStep : 2 * back;
        }
    }
}

bool VideoFile::seekBack(std::int64_t ticks)
{
    forgetRun();
    if (ticks >= m_origin && m_reader.seek(ticks))
        return true;
    m_reader.rewind();
    return false;
}

bool VideoFile::hasLeftOutTheRightOne(std::uint32_t frame, const FrameClock& clock) const
{
    const AVFrame* const found = findInRun(frame, clock);
    return m_reader.lastLeftOut() && (!found || PictureReader::timeOf(*found) < *m_reader.lastLeftOut());
}

/// Between those that come before, pictures may have been left out.
void VideoFile::dropBefore(std::int64_t ticks)
{
    while (m_run.size() > 1 && PictureReader::timeOf(*m_run.front()) < ticks)
        m_run.pop_front();
}

bool VideoFile::readNext()
{
    auto picture = owned(av_frame_alloc());
    m_runsToTheEnd = !m_reader.next(*picture);
    if (m_runsToTheEnd)
        return false;
    const std::size_t bytes = static_cast<std::size_t>(picture->width) * static_cast<std::size_t>(picture->height) * 4;
    m_run.push_back(std::move(picture));
    while (m_run.size() > 2 && (m_run.size() > MostInRun || m_run.size() * bytes > MostBytesInRun))
        m_run.pop_front();
    return true;
}

void VideoFile::forgetRun()
{
    m_run.clear();
    m_runsToTheEnd = false;
}

} // namespace standin
