// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/PictureRun.h"

#include "standin/video/PictureReader.h"

#include <utility>

namespace standin {

namespace {

std::size_t bytesOf(const AVFrame& picture)
{
    std::size_t bytes = 0;
    for (const AVBufferRef* const buffer : picture.buf)
        bytes += buffer ? buffer->size : 0;
    return bytes;
}

} // namespace

std::int64_t PictureRun::start() const
{
    return PictureReader::timeOf(*m_pictures.front());
}

std::int64_t PictureRun::last() const
{
    return PictureReader::timeOf(*m_pictures.back());
}

const AVFrame* PictureRun::find(std::uint32_t frame, const FrameClock& clock) const
{
    for (std::size_t index = m_pictures.size(); index > 0; --index) {
        const AVFrame& picture = *m_pictures[index - 1];
        if (clock.isBeforeMiddle(PictureReader::timeOf(picture), frame))
            return index < m_pictures.size() || m_isAtEnd ? &picture : nullptr;
    }
    return nullptr;
}

void PictureRun::add(AvOwner<AVFrame> picture)
{
    m_bytes += bytesOf(*picture);
    m_pictures.push_back(std::move(picture));
}

void PictureRun::dropFirst()
{
    m_bytes -= bytesOf(*m_pictures.front());
    m_pictures.pop_front();
}

void PictureRun::dropBefore(std::int64_t ticks)
{
    while (size() > 1 && start() < ticks)
        dropFirst();
}

void PictureRun::clear()
{
    *this = {};
}

} // namespace standin
