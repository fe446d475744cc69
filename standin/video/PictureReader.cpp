// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/PictureReader.h"

#include "standin/video/MediaOpening.h"
#include "standin/video/VideoError.h"

#include <algorithm>
#include <utility>
#include <vector>

namespace standin {

namespace fs = std::filesystem;

using Reason = VideoError::Reason;

namespace {

constexpr std::int64_t NoTime = AV_NOPTS_VALUE;
/// Times of any film are less, so that sums of a few of them are numbers, too.
constexpr std::int64_t MostTicks = std::int64_t{1} << 60;
/// How far the search for a last picture goes back at first, in seconds.
constexpr int FirstStep = 1;

AvOwner<AVDictionary> decoderOptions()
{
    AVDictionary* options = nullptr;
    av_dict_set_int(&options, "max_pixels", PictureReader::MostPixels, 0);
    av_dict_set_int(&options, "threads", 1, 0);
    return AvOwner<AVDictionary>(options);
}

/// Whether it is one of a film, and not the picture of an album.
bool isFilm(const AVStream& stream)
{
    return stream.codecpar->codec_type == AVMEDIA_TYPE_VIDEO && (stream.disposition & AV_DISPOSITION_ATTACHED_PIC) == 0;
}

/// What a file tells, or `unless` when no film has such a time.
std::int64_t sensible(std::int64_t ticks, std::int64_t unless)
{
    return ticks >= -MostTicks && ticks <= MostTicks ? ticks : unless;
}

/// Of the picture in the packet, as far as it is known.
std::int64_t decodeTimeOf(const AVPacket& packet)
{
    return packet.pts != NoTime ? packet.pts : packet.dts;
}

bool isPositive(AVRational ratio)
{
    return ratio.num > 0 && ratio.den > 0;
}

void refuseTooLarge(const AVFormatContext& format)
{
    for (unsigned index = 0; index < format.nb_streams; ++index) {
        const AVCodecParameters& parameters = *format.streams[index]->codecpar;
        if (isFilm(*format.streams[index]) &&
            std::int64_t{parameters.width} * parameters.height > PictureReader::MostPixels)
            throw VideoError(Reason::TooLarge);
    }
}

/// Looks into the streams for what the head of the file doesn't tell.
void findStreams(AVFormatContext& format, Deadline deadline)
{
    // The libraries take an array of bare dictionaries, one for each stream that is known so far.
    std::vector<AVDictionary*> perStream(format.nb_streams);
    for (AVDictionary*& dictionary : perStream)
        dictionary = decoderOptions().release();
    const int found = avformat_find_stream_info(&format, perStream.empty() ? nullptr : perStream.data());
    for (AVDictionary* dictionary : perStream)
        av_dict_free(&dictionary);
    if (found < 0)
        throwFailure(deadline, Reason::Unreadable);
}

/// The video; nothing else is read from then on.
AVStream& chooseFilm(AVFormatContext& format)
{
    const int index = av_find_best_stream(&format, AVMEDIA_TYPE_VIDEO, -1, -1, nullptr, 0);
    if (index < 0 || !isFilm(*format.streams[index]))
        throw VideoError(Reason::NoPicture);
    for (unsigned other = 0; other < format.nb_streams; ++other)
        format.streams[other]->discard = static_cast<int>(other) == index ? AVDISCARD_DEFAULT : AVDISCARD_ALL;
    return *format.streams[index];
}

AvOwner<AVCodecContext> openDecoder(const AVStream& stream, Deadline deadline)
{
    const AVCodecParameters& parameters = *stream.codecpar;
    const AVCodec* const codec = avcodec_find_decoder(parameters.codec_id);
    if (!codec)
        throw VideoError(Reason::UnknownKind);
    if (!isPositive(stream.time_base))
        throw VideoError(Reason::Broken);
    auto decoder = owned(avcodec_alloc_context3(codec));
    if (avcodec_parameters_to_context(decoder.get(), &parameters) < 0)
        throwFailure(deadline, Reason::Broken);
    decoder->pkt_timebase = stream.time_base;
    AVDictionary* options = decoderOptions().release();
    const int error = avcodec_open2(decoder.get(), codec, &options);
    av_dict_free(&options);
    if (error < 0)
        throwFailure(deadline, Reason::Broken);
    return decoder;
}

Ratio rateOf(AVFormatContext& format, AVStream& stream)
{
    const AVRational guessed = av_guess_frame_rate(&format, &stream, nullptr);
    return exactRate(isPositive(guessed) ? std::clamp(av_q2d(guessed), 0.001, 1000.0) : 25.0);
}

} // namespace

bool PictureReader::isDamaged(const AVFrame& picture)
{
    return (picture.flags & AV_FRAME_FLAG_CORRUPT) != 0 || picture.decode_error_flags != 0;
}

PictureReader::PictureReader(const fs::path& file, Deadline deadline) : m_file(file), m_deadline(deadline)
{
    rewind();
}

bool PictureReader::next(AVFrame& picture)
{
    av_frame_unref(&picture);
    if (m_heldBack) {
        av_frame_move_ref(&picture, m_heldBack.get());
        m_heldBack.reset();
    } else if (!decodeNext(picture)) {
        return false;
    } else if (const auto hole = holeBefore(timeOf(picture))) {
        m_heldBack = owned(av_frame_alloc());
        av_frame_move_ref(m_heldBack.get(), &picture);
        picture.best_effort_timestamp = *hole;
        picture.flags |= AV_FRAME_FLAG_CORRUPT;
    }
    if (m_damage.isAt(timeOf(picture)))
        picture.flags |= AV_FRAME_FLAG_CORRUPT;
    m_lastTime = timeOf(picture);
    m_hasBegun = true;
    return true;
}

/// Where pictures are missing that should come before that time and couldn't be decoded.
std::optional<std::int64_t> PictureReader::holeBefore(std::int64_t ticks) const
{
    return m_hasBegun ? m_damage.firstBetween(*m_lastTime, ticks) : std::nullopt;
}

bool PictureReader::decodeNext(AVFrame& picture)
{
    while (true) {
        if (isLate())
            throw VideoError(Reason::TooSlow);
        av_frame_unref(&picture);
        const int error = avcodec_receive_frame(m_decoder.get(), &picture);
        if (error == AVERROR_EOF)
            return false;
        if (error == AVERROR(EAGAIN)) {
            feed();
            continue;
        }
        if (error < 0) {
            noteDamage(decodeTimeOf(*m_packet)); // The decoder goes on with what comes after the damage.
            continue;
        }
        if (timeOf(picture) == NoTime) {
            if (!m_lastTime)
                continue;
            picture.best_effort_timestamp = *m_lastTime + m_frameTicks;
        }
        if (m_entry && timeOf(picture) < *m_entry)
            continue;
        if (isDamaged(picture))
            noteDamage(timeOf(picture));
        return true;
    }
}

void PictureReader::feed()
{
    if (m_isDrained || !readPacket()) {
        m_isDrained = true;
        avcodec_send_packet(m_decoder.get(), nullptr);
        return;
    }
    decide(*m_packet);
    const std::int64_t time = decodeTimeOf(*m_packet);
    if (time != NoTime)
        m_damage.feed(time, (m_packet->flags & AV_PKT_FLAG_KEY) != 0);
    const bool isCutOff = (m_packet->flags & AV_PKT_FLAG_CORRUPT) != 0;
    if (avcodec_send_packet(m_decoder.get(), m_packet.get()) < 0 || isCutOff)
        noteDamage(time);
}

/// The pictures before the key picture at which it began are left out, and aren't expected to be whole.
void PictureReader::noteDamage(std::int64_t ticks)
{
    if (ticks != NoTime && (!m_entry || ticks >= *m_entry))
        m_damage.note(ticks);
}

/// Reads the next packet of the video. False at the end of the file, and where it can't be read any further.
bool PictureReader::readPacket()
{
    while (true) {
        av_packet_unref(m_packet.get());
        const int error = av_read_frame(m_format.get(), m_packet.get());
        if (error < 0 && isLate()) {
            m_hasLostItsPlace = true;
            throw VideoError(Reason::TooSlow);
        }
        if (error < 0)
            return false;
        if (m_packet->stream_index != m_stream->index)
            continue;
        m_packet->pts = sensible(m_packet->pts, NoTime);
        m_packet->dts = sensible(m_packet->dts, NoTime);
        m_packet->duration = sensible(m_packet->duration, 0);
        m_tellsPlaces = m_tellsPlaces || m_packet->pos >= 0;
        if (!m_waitsForKey)
            return true;
        if (!isEntry(*m_packet))
            continue;
        m_waitsForKey = false;
        if (m_packet->pts != NoTime)
            m_entry = m_packet->pts;
        return true;
    }
}

/// Whether decoding can begin there after a seek. Some files tell only the time of every few pictures, which are those that have
/// a place in the file. The first packet after a seek may be the rest of a picture and take that time instead, so that all up to
/// the next such picture are counted from the wrong one.
bool PictureReader::isEntry(const AVPacket& packet)
{
    const bool isKey = (packet.flags & AV_PKT_FLAG_KEY) != 0;
    const bool isFirst = std::exchange(m_isAfterSeek, false);
    m_hasTrueTimes = m_hasTrueTimes || !m_tellsPlaces || (packet.pos >= 0 && (isKey || !isFirst));
    return isKey && m_hasTrueTimes;
}

/// Says whether the decoder leaves the packet out if no other depends on it.
void PictureReader::decide(const AVPacket& packet)
{
    const bool canBeLeftOut = m_leaveOutBefore && packet.pts != NoTime && packet.pts < *m_leaveOutBefore;
    m_decoder->skip_frame = canBeLeftOut ? AVDISCARD_NONREF : AVDISCARD_DEFAULT;
    if (canBeLeftOut)
        m_lastLeftOut = std::max(m_lastLeftOut.value_or(packet.pts), packet.pts);
}

bool PictureReader::seek(std::int64_t ticks)
{
    m_hasLostItsPlace = true;
    if (av_seek_frame(m_format.get(), m_stream->index, ticks, AVSEEK_FLAG_BACKWARD) < 0) {
        if (isLate())
            throw VideoError(Reason::TooSlow);
        return false;
    }
    avcodec_flush_buffers(m_decoder.get());
    restart();
    m_waitsForKey = true;
    m_isAfterSeek = true;
    m_hasTrueTimes = false;
    return true;
}

void PictureReader::rewind()
{
    // What can't be opened again leaves the reader whole.
    auto format = openMedia(m_file, m_deadline);
    refuseTooLarge(*format);
    findStreams(*format, m_deadline);
    AVStream& stream = chooseFilm(*format);
    refuseTooLarge(*format);
    auto decoder = openDecoder(stream, m_deadline);

    m_rate = rateOf(*format, stream);
    m_frameTicks = std::max<std::int64_t>(
        1,
        av_rescale_q(1, {static_cast<int>(m_rate.denominator), static_cast<int>(m_rate.numerator)}, stream.time_base));
    m_decoder = std::move(decoder);
    m_format = std::move(format);
    m_stream = &stream;
    restart();
    m_waitsForKey = false;
    // A film without times begins where the file says, or at 0.
    m_lastTime = sensible(m_stream->start_time, 0) - m_frameTicks;
}

void PictureReader::restart()
{
    m_hasLostItsPlace = false;
    m_isDrained = false;
    m_entry.reset();
    m_leaveOutBefore.reset();
    m_lastLeftOut.reset();
    m_lastTime.reset();
    m_heldBack.reset();
    m_damage = {};
    m_hasBegun = false;
}

std::int64_t PictureReader::findEnd()
{
    const std::int64_t second = std::max<std::int64_t>(1, av_rescale_q(FirstStep, {1, 1}, m_stream->time_base));
    const std::int64_t start = sensible(m_stream->start_time, 0);
    const std::int64_t length = toldLength();
    for (std::int64_t back = 0; back < length; back = back == 0 ? second : 2 * back) {
        if (!seek(start + length - back))
            break;
        const Tail tail = readTail();
        const bool isDecoded = tail.hasUnknownTimes && seek(start + length - back);
        if (const auto end = isDecoded ? decodeTail() : tail.end)
            return *end;
    }
    rewind();
    if (const auto end = decodeTail())
        return *end;
    throw VideoError(Reason::Broken);
}

/// The length in ticks that the file claims to have; 0 when it tells none.
std::int64_t PictureReader::toldLength() const
{
    if (m_stream->duration != NoTime)
        return sensible(m_stream->duration, 0);
    if (m_format->duration != NoTime)
        return sensible(av_rescale_q(m_format->duration, AVRational{1, AV_TIME_BASE}, m_stream->time_base), 0);
    return 0;
}

PictureReader::Tail PictureReader::readTail()
{
    Tail tail;
    while (readPacket()) {
        if (isLate())
            throw VideoError(Reason::TooSlow);
        // A file that was cut short may end within a picture.
        if ((m_packet->flags & (AV_PKT_FLAG_CORRUPT | AV_PKT_FLAG_DISCARD)) != 0)
            continue;
        if (m_packet->pts == NoTime) {
            tail.hasUnknownTimes = true;
            continue;
        }
        const std::int64_t end = m_packet->pts + (m_packet->duration > 0 ? m_packet->duration : m_frameTicks);
        tail.end = std::max(tail.end.value_or(end), end);
    }
    return tail;
}

/// Nothing when no picture from here on has a time.
std::optional<std::int64_t> PictureReader::decodeTail()
{
    const auto picture = owned(av_frame_alloc());
    std::optional<std::int64_t> end;
    while (next(*picture))
        end = timeOf(*picture) + durationOf(*picture);
    return end;
}

std::int64_t PictureReader::durationOf(const AVFrame& picture) const
{
    return picture.pkt_duration > 0 ? picture.pkt_duration : m_frameTicks;
}

Ratio PictureReader::timeBase() const
{
    return {m_stream->time_base.num, m_stream->time_base.den};
}

bool PictureReader::isWithoutKeyBetween(std::int64_t first, std::int64_t second) const
{
    const auto keyBeside = [&](int direction) {
        return avformat_index_get_entry_from_timestamp(m_stream, second, direction);
    };
    const AVIndexEntry* const before = keyBeside(AVSEEK_FLAG_BACKWARD);
    if (!before || before->timestamp > first)
        return false;
    // An index that is made while the file is read ends where nobody has read yet.
    return keyBeside(0) != nullptr;
}

} // namespace standin
