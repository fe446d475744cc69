// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/KeepPlanner.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/keep/BlackCarrying.h"
#include "core/keep/ChangeStretch.h"
#include "core/keep/Material.h"
#include "core/keep/PictureCarrying.h"
#include "core/picture/PictureLine.h"
#include "core/picture/PictureNames.h"
#include "core/picture/Reels.h"

#include <utility>

namespace cadrel::core {

namespace {

void append(FrameRanges& ranges, const FrameRanges& others)
{
    ranges.insert(ranges.end(), others.begin(), others.end());
}

std::optional<FrameRange> spanOf(const FrameRanges& ranges)
{
    if (ranges.empty())
        return std::nullopt;
    return FrameRange{ranges.front().start, ranges.back().end};
}

bool isOneShot(const CarriedStretch& a, const CarriedStretch& b)
{
    return a.from == b.from && a.event == b.event;
}

std::vector<KeptEvent> joined(const std::vector<CarriedStretch>& stretches)
{
    std::vector<KeptEvent> events;
    for (const CarriedStretch& stretch : stretches) {
        const bool continues = !events.empty() && events.back().shift == stretch.shift &&
                               events.back().destination.end == stretch.destination.start;
        if (!continues) {
            events.push_back({stretch.destination, stretch.shift, {stretch}});
            continue;
        }
        events.back().destination.end = stretch.destination.end;
        if (isOneShot(events.back().parts.back(), stretch))
            events.back().parts.back().destination.end = stretch.destination.end;
        else
            events.back().parts.push_back(stretch);
    }
    return events;
}

/// Everything that isn't the same afterwards: what has gone, what has come, and what has moved.
FrameRanges changedFrames(const PictureLine& oldLine, const PictureLine& newLine, const FrameRanges& blackMaterial,
                          const std::vector<CarriedStretch>& stretches)
{
    FrameRanges concerned = oldLine.lit();
    append(concerned, newLine.lit());
    append(concerned, blackMaterial);
    FrameRanges inPlace;
    for (const CarriedStretch& stretch : stretches) {
        if (stretch.shift == 0)
            inPlace.push_back(stretch.destination);
        else
            concerned.push_back(stretch.destination);
    }
    return without(united(std::move(concerned)), united(std::move(inPlace)));
}

KeepRefusal refusalFor(KeepRefusal::Reason reason, FrameRanges material)
{
    return {reason, {}, {}, std::move(material)};
}

} // namespace

KeepPlan KeepPlanner::plan(const EventList& oldEvents, const EventList& newEvents, const EventList& changeEvents) const
{
    const Framerate& framerate = m_context.framerate;
    PictureNames names(m_context.matchBy, m_context.vfxPatterns);
    const PictureLine oldLine(oldEvents, names, framerate);
    const PictureLine newLine(newEvents, names, framerate);
    const Reels reels(oldLine.lit(), newLine.lit(), framerate);

    CarriedStretches carried;
    PictureCarrying(oldLine, newLine, reels, carried).run(changeEvents, framerate);
    BlackCarrying black(oldLine.lit(), newLine.lit(), reels, framesOfEach(m_context.material, framerate), framerate,
                        carried);
    black.run(unhealedStretches(changeEvents, framerate));

    KeepPlan plan;
    plan.lost = black.lost();
    const std::vector<CarriedStretch> stretches = carried.stretches();
    restrictTo(spanOf(changedFrames(oldLine, newLine, black.material(), stretches)), joined(stretches), plan);
    if (!reels.canBePaired())
        plan.questions.push_back({KeepRefusal::UnequalReels, reels.ofOld(), reels.ofNew(), {}});
    if (!black.outsideOfDay().empty())
        plan.refusal = refusalFor(KeepRefusal::OutsideOfDay, united(black.outsideOfDay()));
    return plan;
}

KeepPlan KeepPlanner::planGiven(const EventList& changeEvents) const
{
    FrameRanges sources;
    FrameRanges destinations;
    std::vector<KeptEvent> events;
    for (const auto& event : changeEvents.events()) {
        const auto stretch = changeStretchOf(*event, m_context.framerate);
        if (!stretch)
            continue;
        sources.push_back(stretch->source());
        destinations.push_back(stretch->destination);
        const CarriedStretch part{stretch->destination, stretch->shift, CarriedFrom::Cut, CarriedStretch::NoEvent};
        events.push_back({stretch->destination, stretch->shift, {part}});
    }
    std::stable_sort(events.begin(), events.end(),
                     [](const KeptEvent& a, const KeptEvent& b) { return a.destination.start < b.destination.start; });
    KeepPlan plan;
    const auto source = spanOf(united(sources));
    const auto destination = spanOf(united(destinations));
    if (!source || !destination)
        return plan;
    const FrameRange hull{std::min(source->start, destination->start), std::max(source->end, destination->end)};
    const FrameRanges material = framesOfMaterial(m_context.material, m_context.framerate);
    const FrameRanges inTheWay = without(within(hull, material), {*source});
    plan.lost = inTheWay;
    for (const FrameRange& gap : without({*source}, united(std::move(sources)))) {
        if (const auto left = spanOf(within(gap, material)))
            plan.lost.push_back(*left);
    }
    plan.lost = united(std::move(plan.lost));
    restrictTo(hull, std::move(events), plan);
    if (!inTheWay.empty())
        plan.questions.push_back(refusalFor(KeepRefusal::MaterialInTheWay, inTheWay));
    return plan;
}

void KeepPlanner::restrictTo(const std::optional<FrameRange>& hull, std::vector<KeptEvent> events, KeepPlan& plan) const
{
    plan.hull = hull;
    if (hull && m_context.preserve) {
        const FrameRanges allowed = framesOfMaterial({*m_context.preserve}, m_context.framerate);
        plan.hull = spanOf(within(*hull, allowed));
        plan.isHeldBack = !plan.hull;
    }
    for (KeptEvent& event : events) {
        const bool isInHull = plan.hull && !intersect(event.destination, *plan.hull).isEmpty();
        (isInHull ? plan.events : plan.untouched).push_back(std::move(event));
    }
}

} // namespace cadrel::core
