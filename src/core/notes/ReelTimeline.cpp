// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/ReelTimeline.h"

#include "core/picture/Reels.h"
#include "core/time/Timecode.h"

#include <algorithm>
#include <utility>

namespace cadrel::core {

ReelTimeline::ReelTimeline(std::vector<ReelCourse> courses, const Framerate& framerate)
    : m_courses(std::move(courses)), m_framerate(framerate)
{
    for (const ReelCourse& course : m_courses)
        m_starts.push_back(course.oldStart ? *course.oldStart : course.newStart.value_or(0));
    placeNewReels();
}

std::vector<ReelShift> ReelTimeline::makeRoomFor(std::size_t reel)
{
    m_turn = reel;
    m_shifts.clear();
    if (reel == 0)
        partThoseThatGrow();
    clear(spanAtWork(reel), reel);
    if (const auto& newStart = m_courses[reel].newStart; newStart && *newStart != m_starts[reel])
        shift(reel, *newStart, false);
    return std::move(m_shifts);
}

ReelTimeline::Span ReelTimeline::spanAtWork(std::size_t reel) const
{
    const ReelCourse& course = m_courses[reel];
    return {course.newStart.value_or(m_starts[reel]), course.mostEver};
}

/// A new reel that gets picture before its turn, and whose place isn't free until then, begins elsewhere.
void ReelTimeline::placeNewReels()
{
    for (std::size_t reel = 0; reel < m_courses.size(); ++reel) {
        if (m_courses[reel].oldStart || m_courses[reel].mostBefore == 0)
            continue;
        bool isFree = true;
        for (std::size_t other = 0; other < m_courses.size(); ++other)
            isFree = isFree && (other == reel || (!spanNow(other).meets(spanNow(reel)) &&
                                                  (other > reel || !spanAtWork(other).meets(spanNow(reel)))));
        if (const auto start = isFree ? std::nullopt : freeStart(m_courses[reel].mostBefore))
            m_starts[reel] = *start;
    }
}

/// Reels that get so much picture before their turn that they don't fit between the others.
void ReelTimeline::partThoseThatGrow()
{
    for (std::size_t reel = 0; reel < m_courses.size(); ++reel)
        clear(spanNow(reel), reel);
}

/// Lets all reels whose steps are still to come make way.
void ReelTimeline::clear(const Span& span, std::size_t forReel)
{
    m_waiting.push_back(forReel);
    for (std::size_t other = m_turn; other < m_courses.size(); ++other) {
        if (other != forReel && spanNow(other).meets(span))
            makeWay(other);
    }
    m_waiting.pop_back();
}

void ReelTimeline::makeWay(std::size_t reel)
{
    if (canSettle(reel))
        settle(reel);
    else
        waitElsewhere(reel);
}

/// Whether its new place is out of the way of all whose steps come before its own.
bool ReelTimeline::canSettle(std::size_t reel) const
{
    const auto& newStart = m_courses[reel].newStart;
    if (!newStart || *newStart == m_starts[reel])
        return false;
    const Span span{*newStart, m_courses[reel].mostBefore};
    for (std::size_t other = m_turn; other < reel; ++other) {
        if (spanAtWork(other).meets(span))
            return false;
    }
    return std::none_of(m_waiting.begin(), m_waiting.end(),
                        [&](std::size_t other) { return spanNow(other).meets(span); });
}

void ReelTimeline::settle(std::size_t reel)
{
    const std::int32_t newStart = *m_courses[reel].newStart;
    clear({newStart, m_courses[reel].mostBefore}, reel);
    shift(reel, newStart, false);
}

void ReelTimeline::waitElsewhere(std::size_t reel)
{
    // Where a whole day has no free place for it, nothing is better than the place that it has.
    if (const auto start = freeStart(m_courses[reel].mostBefore))
        shift(reel, *start, true);
}

/// A start on which nothing stands at any time, with a minute before and after it: the first full ten minutes after all
/// reels, or those of the day.
std::optional<std::int32_t> ReelTimeline::freeStart(std::int32_t length) const
{
    std::vector<Span> taken;
    std::int32_t end = 0;
    for (std::size_t reel = 0; reel < m_courses.size(); ++reel) {
        const std::int32_t mostBefore = m_courses[reel].mostBefore;
        for (const Span& span :
             {spanNow(reel), spanAtWork(reel), Span{m_courses[reel].oldStart.value_or(m_starts[reel]), mostBefore}}) {
            taken.push_back(span);
            end = std::max(end, span.start + span.length);
        }
    }
    const std::int32_t minute = partingGap(m_framerate);
    const auto isFree = [&](std::int32_t start) {
        const Span wanted{start - minute, length + 2 * minute};
        return start + length <= m_framerate.lastFrame + 1 &&
               std::none_of(taken.begin(), taken.end(), [&](const Span& span) { return span.meets(wanted); });
    };
    std::vector<std::int32_t> starts;
    for (int minutes = 0; minutes < 24 * 60; minutes += 10)
        starts.push_back(Timecode(minutes / 60, minutes % 60, 0, 0).toFrameCount(m_framerate));
    std::rotate(starts.begin(), std::lower_bound(starts.begin(), starts.end(), end), starts.end());
    const auto found = std::find_if(starts.begin(), starts.end(), isFree);
    return found == starts.end() ? std::nullopt : std::optional(*found);
}

void ReelTimeline::shift(std::size_t reel, std::int32_t to, bool isOutOfTheWay)
{
    m_shifts.push_back({reel, m_starts[reel], to, isOutOfTheWay});
    m_starts[reel] = to;
}

} // namespace cadrel::core
