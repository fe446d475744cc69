// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/Coverage.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/HealedEvent.h"
#include "core/edl/ProgrammePlace.h"

#include <algorithm>
#include <iterator>

namespace cadrel::app {

using core::EventBase;
using core::EventList;
using core::Framerate;
using core::HealedEvent;

namespace {

/// From `start` up to and including the frame before `end`, in the destination of `event`.
struct Stretch {
    std::int32_t start;
    std::int32_t end;
    const EventBase* event;
};

bool startsEarlier(const Stretch& a, const Stretch& b)
{
    return a.start < b.start;
}

void addStretches(const EventList& events, const Framerate& framerate, std::vector<Stretch>& stretches)
{
    for (const auto& event : events.events()) {
        if (const auto* healed = dynamic_cast<const HealedEvent*>(event.get()))
            addStretches(healed->healedEvents(), framerate, stretches);
        else if (fillsProgramme(*event, framerate))
            stretches.push_back(
                {event->dstIn().toFrameCount(framerate), event->dstOut().toFrameCount(framerate), event.get()});
    }
}

/// The stretches of all events, of healed ones those of their members, sorted by their starts.
std::vector<Stretch> stretchesOf(const EventList& events, const Framerate& framerate)
{
    std::vector<Stretch> stretches;
    stretches.reserve(events.size());
    addStretches(events, framerate, stretches);
    std::stable_sort(stretches.begin(), stretches.end(), startsEarlier);
    return stretches;
}

/// Disjoint stretches that don't touch, in order; each has the first of its events.
std::vector<Stretch> uniteSorted(const std::vector<Stretch>& sorted)
{
    std::vector<Stretch> united;
    for (const Stretch& stretch : sorted) {
        if (united.empty() || stretch.start > united.back().end) {
            united.push_back(stretch);
        } else {
            united.back().end = std::max(united.back().end, stretch.end);
        }
    }
    return united;
}

/// The parts of `whole` outside `taken`; both are disjoint and in order.
std::vector<Stretch> subtract(const std::vector<Stretch>& whole, const std::vector<Stretch>& taken)
{
    std::vector<Stretch> left;
    auto next = taken.begin();
    for (Stretch rest : whole) {
        while (next != taken.end() && next->end <= rest.start)
            ++next;
        for (auto cover = next; cover != taken.end() && cover->start < rest.end; ++cover) {
            if (cover->start > rest.start)
                left.push_back({rest.start, cover->start, rest.event});
            rest.start = std::max(rest.start, cover->end);
            next = cover;
        }
        if (rest.start < rest.end)
            left.push_back(rest);
    }
    return left;
}

std::int32_t sumOf(const std::vector<Stretch>& disjoint)
{
    std::int32_t frames = 0;
    for (const Stretch& stretch : disjoint)
        frames += stretch.end - stretch.start;
    return frames;
}

std::string nameOf(const EventBase& event)
{
    return event.clipName().empty() ? event.rollName() : event.clipName();
}

/// The gaps with the names of the shots; `shots` are sorted by their starts.
std::vector<Insert> describe(const std::vector<Stretch>& gaps, const std::vector<Stretch>& shots)
{
    std::vector<Insert> inserts;
    auto next = shots.begin();
    const Stretch* around = nullptr;
    for (const Stretch& gap : gaps) {
        // Of all shots that have begun, the one that ends last surely lasts into the gap.
        for (; next != shots.end() && next->start <= gap.start; ++next) {
            if (around == nullptr || next->end > around->end)
                around = &*next;
        }
        const auto behind = std::lower_bound(next, shots.end(), Stretch{gap.end, gap.end, nullptr}, startsEarlier);
        inserts.push_back(
            {gap.start, gap.end, nameOf(*around->event), static_cast<std::size_t>(std::distance(next, behind))});
    }
    return inserts;
}

} // namespace

Coverage::Coverage(const EventList& newEvents, const EventList& changeEvents, const Framerate& framerate)
{
    const std::vector<Stretch> shots = stretchesOf(newEvents, framerate);
    const std::vector<Stretch> programme = uniteSorted(shots);
    const std::vector<Stretch> gaps = subtract(programme, uniteSorted(stretchesOf(changeEvents, framerate)));
    programmeFrames = sumOf(programme);
    coveredFrames = programmeFrames - sumOf(gaps);
    inserts = describe(gaps, shots);
}

std::int32_t Coverage::permille() const
{
    return programmeFrames == 0 ? 0 : static_cast<std::int32_t>(std::int64_t{coveredFrames} * 1000 / programmeFrames);
}

} // namespace cadrel::app
