// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/core/picture/Film.h"

#include "core/edl/EventBase.h"
#include "core/time/Timecode.h"

#include <memory>

namespace cadrel::tests {

using core::EventBase;
using core::EventList;
using core::FrameRange;
using core::Timecode;

Film& Film::at(std::int32_t frame)
{
    m_cursor = frame;
    return *this;
}

Film& Film::shot(const std::string& roll, std::int32_t srcIn, std::int32_t length)
{
    return retimed(roll, srcIn, length, length);
}

Film& Film::freeze(const std::string& roll, std::int32_t srcIn, std::int32_t length)
{
    return retimed(roll, srcIn, 0, length);
}

Film& Film::retimed(const std::string& roll, std::int32_t srcIn, std::int32_t sourceLength, std::int32_t length)
{
    m_shots.push_back({roll, srcIn, sourceLength, m_cursor, length, false});
    m_cursor += length;
    return *this;
}

Film& Film::flawed()
{
    m_shots.back().isFlawed = true;
    return *this;
}

Film& Film::append(const Film& other, std::int32_t start)
{
    for (Shot shot : other.m_shots) {
        shot.dstIn += m_cursor - start;
        m_shots.push_back(shot);
    }
    m_cursor += other.m_cursor - start;
    return *this;
}

FrameRange Film::framesOf(std::size_t shot) const
{
    const Shot& found = m_shots.at(shot);
    return {found.dstIn, found.dstIn + found.length};
}

bool Film::isPlain(std::size_t shot) const
{
    return m_shots.at(shot).sourceLength == m_shots.at(shot).length;
}

EventList Film::list() const
{
    EventList events;
    std::uint32_t number = 1;
    for (const Shot& shot : m_shots) {
        const auto event = std::make_shared<EventBase>();
        event->setRollName(shot.roll);
        event->setEventNumber(number++);
        event->setTimecodes(Timecode(shot.srcIn), Timecode(shot.srcIn + shot.sourceLength), Timecode(shot.dstIn),
                            Timecode(shot.dstIn + shot.length));
        if (shot.isFlawed)
            event->addFlaw(core::EventFlaw::EventNumberNotNumeric);
        events.add(event);
    }
    return events;
}

Film Film::withoutShot(std::size_t shot) const
{
    Film film = *this;
    film.move(shot + 1, -m_shots.at(shot).length);
    film.m_shots.erase(film.m_shots.begin() + static_cast<std::ptrdiff_t>(shot));
    return film;
}

Film Film::withInsertBefore(std::size_t shot, const std::string& roll, std::int32_t length) const
{
    Film film = *this;
    film.move(shot, length);
    const Shot insert{roll, 0, length, m_shots.at(shot).dstIn, length, false};
    film.m_shots.insert(film.m_shots.begin() + static_cast<std::ptrdiff_t>(shot), insert);
    return film;
}

Film Film::trimmedAtHead(std::size_t shot, std::int32_t frames) const
{
    Film film = trimmedAtTail(shot, frames);
    film.m_shots[shot].srcIn += frames;
    return film;
}

Film Film::trimmedAtTail(std::size_t shot, std::int32_t frames) const
{
    Film film = *this;
    film.m_shots.at(shot).sourceLength -= frames;
    film.m_shots[shot].length -= frames;
    film.move(shot + 1, -frames);
    return film;
}

void Film::move(std::size_t firstShot, std::int32_t frames)
{
    for (std::size_t shot = firstShot; shot < m_shots.size(); ++shot)
        m_shots[shot].dstIn += frames;
    m_cursor += frames;
}

std::string lineOf(const FrameRange& range)
{
    return std::to_string(range.start) + ".." + std::to_string(range.end);
}

std::vector<std::string> linesOf(const core::FrameRanges& ranges)
{
    std::vector<std::string> lines;
    for (const FrameRange& range : ranges)
        lines.push_back(lineOf(range));
    return lines;
}

} // namespace cadrel::tests
