// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/ReelTimeline.h"

#include "core/picture/Reels.h"
#include "core/time/Timecode.h"

#include <algorithm>
#include <limits>
#include <utility>

namespace cadrel::core {

namespace {

using Lengths = std::vector<ReelLength>::const_iterator;

std::int32_t longest(Lengths first, Lengths end)
{
    return std::max_element(first, end, [](const ReelLength& a, const ReelLength& b) { return a.frames < b.frames; })
        ->frames;
}

/// The length that holds at a moment.
Lengths since(const std::vector<ReelLength>& lengths, std::size_t moment)
{
    return std::partition_point(lengths.begin(), lengths.end(),
                                [moment](const ReelLength& length) { return length.moment <= moment; }) -
           1;
}

} // namespace

ReelTimeline::ReelTimeline(std::vector<ReelCourse> courses, std::vector<std::size_t> turns, const Framerate& framerate)
    : m_courses(std::move(courses)), m_turns(std::move(turns)), m_framerate(framerate),
      m_isAside(m_courses.size(), false)
{
    for (const ReelCourse& course : m_courses) {
        m_starts.push_back(course.oldStart ? *course.oldStart : course.newStart.value_or(0));
        m_mostEver.push_back(longest(course.lengths.begin(), course.lengths.end()));
    }
}

std::vector<ReelShift> ReelTimeline::makeRoomFor(std::size_t reel)
{
    m_turn = reel;
    m_shifts.clear();
    forgetEmptyReels();
    clear(atWork(reel));
    if (const auto& newStart = m_courses[reel].newStart; newStart && *newStart != m_starts[reel])
        shift(reel, *newStart, false);
    placeThoseThatGrow();
    return std::move(m_shifts);
}

std::size_t ReelTimeline::endOf(std::size_t turn) const
{
    return turn + 1 < m_turns.size() ? m_turns[turn + 1] : std::numeric_limits<std::size_t>::max();
}

std::int32_t ReelTimeline::lengthAt(std::size_t reel, std::size_t moment) const
{
    return since(m_courses[reel].lengths, moment)->frames;
}

std::int32_t ReelTimeline::mostBeforeItsTurn(std::size_t reel) const
{
    const auto& lengths = m_courses[reel].lengths;
    return longest(lengths.begin(), since(lengths, m_turns[reel]) + 1);
}

bool ReelTimeline::growsIn(std::size_t reel, const Moments& moments) const
{
    const auto& lengths = m_courses[reel].lengths;
    auto length = since(lengths, moments.begin);
    for (auto next = length + 1; next != lengths.end() && next->moment < moments.end; length = next++) {
        if (next->frames > length->frames)
            return true;
    }
    return false;
}

/// Whether one lies on the other at any of these moments. Where picture goes from one to the other, it is out of the one
/// when it is in the other.
bool ReelTimeline::meet(const PlacedReel& one, const PlacedReel& other, const Moments& moments) const
{
    if (!Span{one.start, m_mostEver[one.reel]}.meets({other.start, m_mostEver[other.reel]}))
        return false;
    const auto& ofOne = m_courses[one.reel].lengths;
    const auto& ofOther = m_courses[other.reel].lengths;
    for (std::size_t moment = moments.begin; moment < moments.end;) {
        const auto a = since(ofOne, moment);
        const auto b = since(ofOther, moment);
        if (Span{one.start, a->frames}.meets({other.start, b->frames}))
            return true;
        moment = moments.end;
        if (a + 1 != ofOne.end())
            moment = std::min(moment, (a + 1)->moment);
        if (b + 1 != ofOther.end())
            moment = std::min(moment, (b + 1)->moment);
    }
    return false;
}

/// A reel that has no picture stands nowhere.
void ReelTimeline::forgetEmptyReels()
{
    for (std::size_t reel = m_turn; reel < m_courses.size(); ++reel) {
        if (lengthAt(reel, m_turns[m_turn]) > 0)
            continue;
        m_starts[reel] = atWork(reel).start;
        m_isAside[reel] = false;
    }
}

/// Reels that get picture before their turn.
void ReelTimeline::placeThoseThatGrow()
{
    for (std::size_t reel = m_turn + 1; reel < m_courses.size(); ++reel) {
        if (!growsIn(reel, thisTurn()))
            continue;
        if (!canBegin(reel))
            makeWay(reel);
        clear(now(reel));
    }
}

/// Whether nothing that stays lies where a reel stands. One that has no picture yet may as well begin elsewhere.
bool ReelTimeline::canBegin(std::size_t reel) const
{
    const bool isEmpty = lengthAt(reel, m_turns[m_turn]) == 0;
    const std::size_t end = isEmpty ? m_courses.size() : m_turn + 1;
    for (std::size_t other = 0; other < end; ++other) {
        if (other != reel && meet(now(other), now(reel), thisTurn()))
            return false;
    }
    return !isEmpty || isFreeUntilItsTurn(now(reel));
}

/// Lets all reels whose steps are still to come make way.
void ReelTimeline::clear(const PlacedReel& target)
{
    m_waiting.push_back(target);
    for (std::size_t other = m_turn + 1; other < m_courses.size(); ++other) {
        const bool isWaiting = std::any_of(m_waiting.begin(), m_waiting.end(),
                                           [&](const PlacedReel& waiting) { return waiting.reel == other; });
        if (!isWaiting && meet(now(other), target, thisTurn()))
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

bool ReelTimeline::canSettle(std::size_t reel) const
{
    const auto& newStart = m_courses[reel].newStart;
    if (!newStart || *newStart == m_starts[reel])
        return false;
    const PlacedReel settled{reel, *newStart};
    const Moments atOnce{m_turns[m_turn], m_turns[m_turn] + 1};
    return isFreeUntilItsTurn(settled) &&
           std::none_of(m_waiting.begin(), m_waiting.end(), [&](const PlacedReel& waiting) {
               return meet(now(waiting.reel), settled, atOnce) || meet(waiting, settled, thisTurn());
           });
}

/// Whether a place is out of the way of all whose steps come before those of the reel.
bool ReelTimeline::isFreeUntilItsTurn(const PlacedReel& target) const
{
    for (std::size_t other = m_turn; other < target.reel; ++other) {
        if (meet(atWork(other), target, {m_turns[other], m_turns[target.reel]}))
            return false;
    }
    return true;
}

void ReelTimeline::settle(std::size_t reel)
{
    const std::int32_t newStart = *m_courses[reel].newStart;
    clear({reel, newStart});
    shift(reel, newStart, false);
}

void ReelTimeline::waitElsewhere(std::size_t reel)
{
    // Where a whole day has no free place for it, nothing is better than the place that it has.
    if (const auto start = freeStart(mostBeforeItsTurn(reel)))
        shift(reel, *start, true);
    else
        m_hasNoRoom = true;
}

/// A start on which nothing stands at any time, with a minute before and after it: the first full ten minutes after all
/// reels, or those of the day.
std::optional<std::int32_t> ReelTimeline::freeStart(std::int32_t length) const
{
    std::vector<Span> taken;
    std::int32_t end = 0;
    for (std::size_t reel = 0; reel < m_courses.size(); ++reel) {
        const std::int32_t most = mostBeforeItsTurn(reel);
        for (const Span& span : {Span{m_starts[reel], most}, Span{atWork(reel).start, m_mostEver[reel]},
                                 Span{m_courses[reel].oldStart.value_or(m_starts[reel]), most}}) {
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
    if (lengthAt(reel, m_turns[m_turn]) > 0)
        m_shifts.push_back({reel, m_starts[reel], to, isOutOfTheWay});
    m_starts[reel] = to;
    m_isAside[reel] = isOutOfTheWay;
}

} // namespace cadrel::core
