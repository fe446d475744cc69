// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/VideoFile.h"

#include "standin/video/VideoError.h"

#include <algorithm>
#include <chrono>
#include <cmath>
#include <limits>
#include <utility>

namespace standin {

using Reason = VideoError::Reason;

namespace {

/// How many decoded pictures are kept; many only for one who goes back step by step.
constexpr std::size_t MostInRun = 20;
constexpr std::size_t MostInRunBack = 250;
constexpr std::size_t MostBytesInRun = std::size_t{128} << 20;
/// So many pictures before the wanted one, all are decoded; and where the key pictures aren't known, it is quicker to go on so
/// far than to seek.
constexpr std::int64_t NearPictures = 14;
/// What reading ahead may add to a step back.
constexpr std::chrono::milliseconds MostReadingAhead{25};

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

} // namespace

VideoFile::VideoFile(const std::filesystem::path& file, Deadline deadline) : m_reader(file, deadline)
{
    m_orientation = orientationIn(m_reader.stream());
    if (!readNext(m_run))
        throw VideoError(Reason::Broken);
    m_origin = m_run.start();
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
        const FrameClock clock = clockOf(rate);
        const std::int64_t wanted = clock.lastTickOf(frame);
        m_goesBack =
            m_lastWanted && wanted < *m_lastWanted && *m_lastWanted - wanted <= NearPictures * m_reader.frameTicks();
        m_lastWanted = wanted;
        const bool isKnown = m_run.find(frame, clock) != nullptr;
        const AVFrame& found = pictureAt(frame, clock);
        m_onTheWayTo.reset();
        if (PictureReader::isDamaged(found))
            throw VideoError(Reason::Broken);
        Picture drawn = m_drawing.draw(found, pixelAspectOf(found, m_reader.stream()), m_orientation, box);
        if (m_goesBack && isKnown)
            readEarlier();
        return drawn;
    } catch (const VideoError& error) {
        giveUp(error.reason());
        throw;
    } catch (...) {
        forgetRun();
        throw;
    }
}

const AVFrame& VideoFile::pictureAt(std::uint32_t frame, const FrameClock& clock)
{
    if (!m_run.find(frame, clock))
        reach(frame, clock);
    const AVFrame* const found = m_run.find(frame, clock);
    if (!found)
        throw VideoError(Reason::Broken);
    // The picture before a part that can't be read isn't the one in that part.
    const std::int64_t shownUntil = PictureReader::timeOf(*found) + m_reader.durationOf(*found);
    if (m_run.isAtEnd() && m_run.isLast(*found) && shownUntil < m_end && clock.isBeforeMiddle(shownUntil, frame))
        throw VideoError(Reason::Broken);
    return *found;
}

void VideoFile::reach(std::uint32_t frame, const FrameClock& clock)
{
    if (isNear(frame, clock) ? goOn(frame, clock) : takeEarlier(frame, clock))
        return;
    seekTo(frame, clock);
}

bool VideoFile::isNear(std::uint32_t frame, const FrameClock& clock) const
{
    if (m_readsEarlier || m_run.isEmpty() || !clock.isBeforeMiddle(m_run.last(), frame))
        return false;
    const std::int64_t wanted = clock.lastTickOf(frame);
    const std::int64_t near = NearPictures * m_reader.frameTicks();
    const bool isOnTheWay = m_onTheWayTo && wanted <= *m_onTheWayTo + near;
    return isOnTheWay || wanted - m_run.last() <= near || m_reader.isWithoutKeyBetween(m_run.last(), wanted);
}

bool VideoFile::goOn(std::uint32_t frame, const FrameClock& clock)
{
    const std::int64_t wanted = clock.lastTickOf(frame);
    m_reader.leaveOutBefore(wholeFrom(wanted));
    readUpTo(m_run, wanted);
    return !hasLeftOutTheRightOne(frame, clock);
}

bool VideoFile::takeEarlier(std::uint32_t frame, const FrameClock& clock)
{
    if (m_earlier.isEmpty() || clock.isBeforeMiddle(m_run.start(), frame))
        return false;
    const std::int64_t joint = m_run.start();
    readUpTo(m_earlier, joint - 1);
    m_run = std::exchange(m_earlier, {});
    m_readsEarlier = false;
    // A picture that can't be read again would be missing between the two.
    return m_run.last() == joint && m_run.find(frame, clock) != nullptr;
}

void VideoFile::seekTo(std::uint32_t frame, const FrameClock& clock)
{
    const std::int64_t wanted = clock.lastTickOf(frame);
    constexpr std::int64_t Nothing = std::numeric_limits<std::int64_t>::min();
    for (const std::int64_t leaveOutBefore : {wholeFrom(wanted), Nothing}) {
        forgetRun();
        begin(m_run, wanted, leaveOutBefore);
        readUpTo(m_run, wanted);
        if (!hasLeftOutTheRightOne(frame, clock))
            return;
    }
}

void VideoFile::begin(PictureRun& run, std::int64_t ticks, std::int64_t leaveOutBefore)
{
    const std::int64_t firstStep = std::max<std::int64_t>(1, std::llround(1.0 / m_reader.timeBase().value()));
    for (std::int64_t back = 0;; back = back == 0 ? firstStep : 2 * back) {
        run.clear();
        const bool isAtStart = !seekBack(ticks - back);
        m_reader.leaveOutBefore(leaveOutBefore);
        if (readNext(run) && run.last() <= ticks)
            return;
        if (isAtStart)
            throw VideoError(Reason::Broken);
    }
}

bool VideoFile::seekBack(std::int64_t ticks)
{
    if (ticks >= m_origin && m_reader.seek(ticks))
        return true;
    m_reader.rewind();
    return false;
}

void VideoFile::readUpTo(PictureRun& run, std::int64_t ticks)
{
    while (run.last() <= ticks && readNext(run))
        ;
    dropLeftOut(run);
}

/// Lets go of those between which pictures may be missing.
void VideoFile::dropLeftOut(PictureRun& run) const
{
    run.dropBefore(m_reader.lastLeftOut().value_or(m_origin));
}

bool VideoFile::readNext(PictureRun& run)
{
    auto picture = owned(av_frame_alloc());
    if (!m_reader.next(*picture)) {
        run.setAtEnd();
        return false;
    }
    run.add(std::move(picture));
    const std::size_t most = m_goesBack ? MostInRunBack : MostInRun;
    while (run.size() > 2 && (run.size() > most || run.bytes() > MostBytesInRun))
        run.dropFirst();
    return true;
}

bool VideoFile::hasLeftOutTheRightOne(std::uint32_t frame, const FrameClock& clock) const
{
    const AVFrame* const found = m_run.find(frame, clock);
    return m_reader.lastLeftOut() && (!found || PictureReader::timeOf(*found) < *m_reader.lastLeftOut());
}

std::int64_t VideoFile::wholeFrom(std::int64_t ticks) const
{
    std::int64_t pictures = NearPictures;
    if (m_goesBack && !m_run.isEmpty()) {
        const std::size_t fitting = MostBytesInRun / std::max<std::size_t>(1, m_run.bytes() / m_run.size());
        pictures = static_cast<std::int64_t>(std::clamp(fitting, MostInRun, MostInRunBack));
    }
    return ticks - pictures * m_reader.frameTicks();
}

/// Reads on for a moment in what comes before the run. A failure is that of the frame there, when it is asked for.
void VideoFile::readEarlier()
{
    const Deadline until = std::chrono::steady_clock::now() + MostReadingAhead;
    if (m_run.start() <= m_origin)
        return;
    try {
        if (m_earlier.isEmpty()) {
            m_readsEarlier = true;
            begin(m_earlier, m_run.start() - 1, wholeFrom(m_run.start()));
        }
        while (!isEarlierRead() && std::chrono::steady_clock::now() < until && readNext(m_earlier))
            ;
    } catch (const VideoError&) {
        m_earlier.clear();
    }
}

/// What takes too long goes on where it was, if the same frame or one close to it is asked for next.
void VideoFile::giveUp(Reason reason)
{
    if (reason != Reason::TooSlow || m_readsEarlier || m_reader.hasLostItsPlace() || m_run.isEmpty())
        return forgetRun();
    dropLeftOut(m_run);
    m_onTheWayTo = m_lastWanted;
}

void VideoFile::forgetRun()
{
    m_run.clear();
    m_earlier.clear();
    m_readsEarlier = false;
    m_onTheWayTo.reset();
}

} // namespace standin
