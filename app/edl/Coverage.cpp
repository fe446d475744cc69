// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/Coverage.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/HealedEvent.h"
#include "core/edl/ProgrammePlace.h"
#include "core/picture/FrameRange.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace cadrel::app {

using core::EventBase;
using core::EventList;
using core::FrameRange;
using core::FrameRanges;
using core::Framerate;
using core::HealedEvent;

namespace {

/// A picture event in its programme.
struct Shot {
    FrameRange frames;
    const EventBase* event;
};

bool startsEarlier(const Shot& a, const Shot& b)
{
    return a.frames.start < b.frames.start;
}

void addShots(const EventList& events, const Framerate& framerate, std::vector<Shot>& shots)
{
    for (const auto& event : events.events()) {
        if (const auto* healed = dynamic_cast<const HealedEvent*>(event.get()))
            addShots(healed->healedEvents(), framerate, shots);
        else if (fillsProgramme(*event, framerate))
            shots.push_back(
                {{event->dstIn().toFrameCount(framerate), event->dstOut().toFrameCount(framerate)}, event.get()});
    }
}

/// All events, of healed ones the members, sorted by their starts.
std::vector<Shot> shotsOf(const EventList& events, const Framerate& framerate)
{
    std::vector<Shot> shots;
    shots.reserve(events.size());
    addShots(events, framerate, shots);
    std::stable_sort(shots.begin(), shots.end(), startsEarlier);
    return shots;
}

FrameRanges filledBy(const std::vector<Shot>& shots)
{
    std::vector<FrameRange> frames;
    frames.reserve(shots.size());
    for (const Shot& shot : shots)
        frames.push_back(shot.frames);
    return core::united(std::move(frames));
}

std::string nameOf(const EventBase& event)
{
    return event.clipName().empty() ? event.rollName() : event.clipName();
}

/// The gaps with the names of the shots; `shots` are sorted by their starts.
std::vector<Insert> describe(const FrameRanges& gaps, const std::vector<Shot>& shots)
{
    std::vector<Insert> inserts;
    auto next = shots.begin();
    const Shot* around = nullptr;
    for (const FrameRange& gap : gaps) {
        // Of all shots that have begun, the one that ends last surely lasts into the gap.
        for (; next != shots.end() && next->frames.start <= gap.start; ++next) {
            if (around == nullptr || next->frames.end > around->frames.end)
                around = &*next;
        }
        const auto after = std::lower_bound(next, shots.end(), Shot{{gap.end, gap.end}, nullptr}, startsEarlier);
        inserts.push_back(
            {gap.start, gap.end, nameOf(*around->event), static_cast<std::size_t>(std::distance(next, after))});
    }
    return inserts;
}

} // namespace

Coverage::Coverage(const EventList& newEvents, const EventList& changeEvents, const Framerate& framerate)
{
    const std::vector<Shot> shots = shotsOf(newEvents, framerate);
    const FrameRanges programme = filledBy(shots);
    const FrameRanges gaps = without(programme, filledBy(shotsOf(changeEvents, framerate)));
    programmeFrames = lengthOf(programme);
    coveredFrames = programmeFrames - lengthOf(gaps);
    inserts = describe(gaps, shots);
}

std::int32_t Coverage::permille() const
{
    return programmeFrames == 0 ? 0 : static_cast<std::int32_t>(std::int64_t{coveredFrames} * 1000 / programmeFrames);
}

} // namespace cadrel::app
