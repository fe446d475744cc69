// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/edit/RangeEdits.h"

#include "standin/edit/RangeCurves.h"
#include "standin/project/Event.h"
#include "standin/project/Project.h"

#include <algorithm>
#include <cstdint>
#include <unordered_map>

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
    for (const Counted<Event>& event : eventsIn(track, start, end)) {
        const Event::Stretch stretch = *event->stretchIn(start, end);
        if (stretch.start - event->start() >= SameInstant)
            event->cutOut(event->start(), stretch.start)->takePlaceOf(*event);
        else
            event->remove();
        if (event->end() - stretch.end >= SameInstant)
            event->cutOut(stretch.end, event->end())->insertInto(track);
    }
}

/// Those on a track that may be pieces of one event, in order.
using Pieces = std::vector<Counted<Event>>;

/// Null when none of the pieces goes on where this one ends.
Event* continuationOf(const Event& event, const Pieces& pieces)
{
    auto piece = std::ranges::partition_point(
        pieces, [&](const Counted<Event>& other) { return other->start() <= event.end() - SameInstant; });
    for (; piece != pieces.end() && (*piece)->start() < event.end() + SameInstant; ++piece) {
        if (piece->get() != &event && (*piece)->parent() && event.isContinuedBy(**piece))
            return piece->get();
    }
    return nullptr;
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
            replaceCurve(*curve, start, end, readCurve(content->curve(number), from, m_length));
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
        Pieces events;
        std::unordered_map<std::uint64_t, Pieces> piecesOf;
        // What goes on at the end begins less than two instants after it.
        track->visitTouching(start - SameInstant, end + 2.0 * SameInstant, [&](Node& child) {
            events.push_back(Counted<Event>::share(static_cast<Event*>(&child)));
            piecesOf[events.back()->origin()].push_back(events.back());
        });
        for (const Counted<Event>& event : events) {
            const Pieces& pieces = piecesOf[event->origin()];
            // Those to the left may have taken it in.
            while (event->parent() && event->end() > start - SameInstant && event->end() < end + SameInstant) {
                Event* const next = continuationOf(*event, pieces);
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
