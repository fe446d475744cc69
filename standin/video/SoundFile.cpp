// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/SoundFile.h"

#include "standin/video/MediaOpening.h"

namespace standin {

SoundFile SoundFile::read(const std::filesystem::path& file, Deadline deadline)
{
    const auto format = openMedia(file, deadline);
    if (avformat_find_stream_info(format.get(), nullptr) < 0)
        throwFailure(deadline, VideoError::Reason::Unreadable);
    const int index = av_find_best_stream(format.get(), AVMEDIA_TYPE_AUDIO, -1, -1, nullptr, 0);
    if (index < 0)
        throw VideoError(VideoError::Reason::NoSound);
    const AVStream& stream = *format->streams[index];
    SoundFile sound;
    sound.samplesPerSecond = stream.codecpar->sample_rate;
    if (stream.duration != AV_NOPTS_VALUE)
        sound.seconds = static_cast<double>(stream.duration) * av_q2d(stream.time_base);
    else if (format->duration != AV_NOPTS_VALUE)
        sound.seconds = static_cast<double>(format->duration) / AV_TIME_BASE;
    return sound;
}

} // namespace standin
