// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/edit/RangeEdits.h"

#include "standin/edit/RangeCurves.h"
#include "standin/project/Event.h"
#include "standin/project/Project.h"
#include "standin/project/Seams.h"

#include <algorithm>

using namespace Velmark;

namespace standin {

namespace {

/// Those that have something in a range, in order.
std::vector<Counted<Event>> eventsIn(const Track& track, double start, double end)
{
    std::vector<Counted<Event>> events;
    track.visitTouching(start - SameInstant, end, [&](Node& child) {
        auto& event = static_cast<Event&>(child);
        if (event.stretchIn(start, end))
            events.push_back(Counted<Event>::share(&event));
    });
    return events;
}

bool isEmptyRange(double start, double end)
{
    return !(end - start >= SameInstant);
}

//      from    ..|-- A --|---- B ----|..
//                   start        end
//      to      .....|- A-|---- B --|.......
//               destination
/// Copies what `from` has in a range to `to`, where nothing is in the way.
void copyEvents(const Track& from, double start, double end, Track& to, double destination)
{
    for (const Counted<Event>& event : eventsIn(from, start, end)) {
        const Event::Stretch stretch = *event->stretchIn(start, end);
        const Counted<Event> piece = event->cutOut(stretch.start, stretch.end);
        const double offset = std::max(stretch.start - start, 0.0);
        piece->setSpan(destination + offset, destination + std::max(stretch.end - start, offset));
        piece->insertInto(to);
    }
}

//      before    |---- A ----|   |-- B --|
//                      start       end
//      after     |- A -|           |- B -|
void clearEvents(Track& track, double start, double end)
{
    std::vector<Counted<Event>> rests;
    for (const Counted<Event>& event : eventsIn(track, start, end)) {
        const Event::Stretch stretch = *event->stretchIn(start, end);
        if (stretch.start - event->start() >= SameInstant)
            event->cutOut(event->start(), stretch.start)->takePlaceOf(*event);
        else
            event->remove();
        if (event->end() - stretch.end >= SameInstant)
            rests.push_back(event->cutOut(stretch.end, event->end()));
    }
    // They began before all that begins where they do now, and lie below it.
    std::ranges::reverse(rests);
    for (const Counted<Event>& rest : rests)
        rest->insertBeforeOthers(track);
}

} // namespace

RangeContent::RangeContent(const Project& project, const std::vector<Track*>& tracks, double start, double end)
    : m_project(Counted<ProjectLink>::share(project.link())), m_length(end - start)
{
    if (isEmptyRange(start, end))
        return;
    for (Track* const track : tracks) {
        auto content = Track::create(track->kind());
        copyEvents(*track, start, end, *content, 0.0);
        for (const auto& [number, curve] : track->curves()) {
            for (const Counted<AutomationPoint>& point : readCurve(*curve, start, end))
                point->insertInto(content->curve(number));
        }
        m_tracks.push_back({Counted<Track>::share(track), std::move(content)});
    }
}

bool RangeContent::isOf(const Project& project) const
{
    return m_project == project.link();
}

void RangeContent::writeAt(double destination) const
{
    const double start = std::max(destination, 0.0);
    const double end = destination + m_length;
    if (isEmptyRange(start, end))
        return;
    const double from = start - destination;
    for (const auto& [track, content] : m_tracks) {
        if (!track->project())
            continue;
        clearEvents(*track, start, end);
        copyEvents(*content, from, m_length, *track, start);
        for (const auto& [number, curve] : track->curves())
            replaceCurve(*curve, start, end, readRest(content->curve(number), from));
    }
}

void clearRange(const std::vector<Track*>& tracks, double start, double end)
{
    start = std::max(start, 0.0);
    if (isEmptyRange(start, end))
        return;
    for (Track* const track : tracks) {
        clearEvents(*track, start, end);
        for (const auto& [number, curve] : track->curves())
            replaceCurve(*curve, start, end, {});
    }
}

bool joinPieces(const std::vector<Track*>& tracks, double start, double end)
{
    bool joined = false;
    for (Track* const track : tracks) {
        std::vector<Counted<Event>> events;
        Seams heads;
        // What goes on at the end begins less than two instants after it.
        track->visitTouching(start - SameInstant, end + 2.0 * SameInstant, [&](Node& child) {
            auto& event = static_cast<Event&>(child);
            events.push_back(Counted<Event>::share(&event));
            heads.add(event.head(), event);
        });
        for (const Counted<Event>& event : events) {
            const auto goesOnIn = [&](const Event& next) { return &next != event.get() && event->isContinuedBy(next); };
            // Those to the left may have taken it in.
            while (event->parent() && event->end() > start - SameInstant && event->end() < end + SameInstant) {
                Event* const next = heads.take(event->tail(), goesOnIn);
                if (!next)
                    break;
                event->join(*next);
                joined = true;
            }
        }
    }
    return joined;
}

} // namespace standin
