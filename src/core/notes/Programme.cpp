// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/Programme.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/MatchedName.h"
#include "core/edl/ProgrammePlace.h"
#include "core/notes/EventPicture.h"
#include "core/picture/Reels.h"

#include <algorithm>
#include <queue>
#include <tuple>

namespace cadrel::core {

namespace {

/// Timecodes as frame counts.
struct Place {
    std::int32_t in;
    std::int32_t out;
    std::int32_t event;
};

/// A stretch in which one event is seen.
using Seen = Place;

std::vector<Place> placesOf(const EventList& events, const Framerate& framerate)
{
    std::vector<Place> places;
    for (std::size_t index = 0; index < events.size(); ++index) {
        const EventBase& event = events.at(index);
        if (fillsProgramme(event, framerate))
            places.push_back({event.dstIn().toFrameCount(framerate), event.dstOut().toFrameCount(framerate),
                              static_cast<std::int32_t>(index)});
    }
    std::stable_sort(places.begin(), places.end(), [](const Place& a, const Place& b) { return a.in < b.in; });
    return places;
}

bool liesUnder(const Place& a, const Place& b)
{
    return std::tie(a.in, a.event) < std::tie(b.in, b.event);
}

/// `places` are in the order of their starts.
std::vector<Seen> seenOf(const std::vector<Place>& places)
{
    std::vector<Seen> seen;
    std::priority_queue<Place, std::vector<Place>, decltype(&liesUnder)> open(&liesUnder);
    auto next = places.begin();
    std::int32_t now = 0;
    while (next != places.end() || !open.empty()) {
        while (!open.empty() && open.top().out <= now)
            open.pop();
        if (open.empty()) {
            if (next == places.end())
                break;
            now = std::max(now, next->in);
        }
        while (next != places.end() && next->in <= now)
            open.push(*next++);
        while (!open.empty() && open.top().out <= now)
            open.pop();
        if (open.empty())
            continue;
        const Place& top = open.top();
        const std::int32_t end = next == places.end() ? top.out : std::min(top.out, next->in);
        if (!seen.empty() && seen.back().event == top.event && seen.back().out == now)
            seen.back().out = end;
        else
            seen.push_back({now, end, top.event});
        now = end;
    }
    return seen;
}

std::vector<DoubtfulEvent> doubtsOf(const EventList& events, const PictureRules& rules,
                                    const std::vector<Place>& places, const std::vector<Seen>& seen)
{
    std::vector<std::int32_t> hidden(events.size(), 0);
    for (const Place& place : places)
        hidden[static_cast<std::size_t>(place.event)] += place.out - place.in;
    for (const Seen& stretch : seen)
        hidden[static_cast<std::size_t>(stretch.event)] -= stretch.out - stretch.in;

    std::vector<DoubtfulEvent> doubts;
    for (std::size_t index = 0; index < events.size(); ++index) {
        const EventBase& event = events.at(index);
        const auto add = [&](PictureDoubt doubt) { doubts.push_back({doubt, static_cast<std::int32_t>(index)}); };
        const bool isOutgoingSide = event.isValid() && event.dstIn() == event.dstOut();
        if (isOutgoingSide)
            continue;
        if (!fillsProgramme(event, rules.framerate)) {
            add(PictureDoubt::NoPicture);
            continue;
        }
        // A timecode that can't be read puts no event in any order.
        if (event.hasFlaw(EventFlaw::TimecodeRangeInvalid) && !event.hasFlaw(EventFlaw::TimecodeInvalid))
            add(PictureDoubt::Reversed);
        else if (!event.isValid())
            add(PictureDoubt::Flawed);
        else if (tellsNothing(nameBy(rules.matchBy, event)))
            add(PictureDoubt::Nameless);
        if (hidden[index] > 0)
            add(PictureDoubt::Covered);
    }
    return doubts;
}

} // namespace

Programme::Programme(const EventList& events, const PictureRules& rules, TextNumbers& numbers) : m_events(&events)
{
    const std::vector<Place> places = placesOf(events, rules.framerate);
    const std::vector<Seen> seen = seenOf(places);
    m_doubts = doubtsOf(events, rules, places, seen);
    const std::int32_t gapMaterial = numbers.numberOf("gap");
    const std::int32_t gapBetweenReels = partingGap(rules.framerate);

    const auto append = [this](ShownRun run, std::int32_t runLength) {
        run.start = length();
        run.length = runLength;
        m_runs.push_back(run);
        m_reels.back().length += runLength;
    };
    std::int32_t lastOut = 0;
    const EventBase* before = nullptr;
    for (const Seen& stretch : seen) {
        const std::int32_t gap = stretch.in - lastOut;
        if (m_reels.empty() || gap >= gapBetweenReels)
            m_reels.push_back({stretch.in, length(), 0});
        else if (gap > 0)
            append({0, 0, gapMaterial, gapMaterial, gapMaterial, 0.0, 1.0, ShownRun::NoEvent, false}, gap);
        const EventBase& event = events.at(static_cast<std::size_t>(stretch.event));
        const EventPicture picture(events, static_cast<std::size_t>(stretch.event), before, rules, numbers);
        const std::int32_t dstIn = event.dstIn().toFrameCount(rules.framerate);
        const std::int32_t from = stretch.in - dstIn;
        const std::int32_t to = stretch.out - dstIn;
        const std::int32_t body = std::clamp(picture.transitionLength(), from, to);
        if (from < body)
            append(picture.runFrom(from), body - from);
        if (body < to)
            append(picture.runFrom(body), to - body);
        lastOut = stretch.out;
        before = &event;
    }
}

std::size_t Programme::runAt(std::int32_t frame) const
{
    const auto after = std::upper_bound(m_runs.begin(), m_runs.end(), frame,
                                        [](std::int32_t value, const ShownRun& run) { return value < run.start; });
    return static_cast<std::size_t>(after - m_runs.begin()) - 1;
}

std::size_t Programme::reelAt(std::int32_t frame) const
{
    const auto after = std::upper_bound(m_reels.begin(), m_reels.end(), frame,
                                        [](std::int32_t value, const Reel& reel) { return value < reel.start; });
    return static_cast<std::size_t>(after - m_reels.begin()) - 1;
}

std::int32_t Programme::timecodeOf(std::int32_t frame, std::size_t reel) const
{
    return m_reels[reel].timecodeStart + frame - m_reels[reel].start;
}

const EventBase* Programme::eventOf(const ShownRun& run) const
{
    return run.isGap() ? nullptr : &m_events->at(static_cast<std::size_t>(run.event));
}

} // namespace cadrel::core
