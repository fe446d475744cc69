// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/protect/ProtectedRun.h"

#include "core/keep/ChangeStretch.h"
#include "core/keep/KeepPlanner.h"
#include "core/keep/KeptChangeList.h"
#include "core/keep/Material.h"
#include "core/model/DataModel.h"
#include "core/settings/Settings.h"
#include "core/time/Timecode.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace cadrel::core {

namespace {

/// Beyond all that material can stand on.
constexpr FrameRange Everywhere{-(1 << 30), 1 << 30};

KeepContext contextOf(const DataModel& model, const std::vector<SecondsRange>& material)
{
    const Settings& settings = model.settings();
    KeepContext context;
    context.framerate = Timecode::framerate();
    context.matchBy = settings.matchBy();
    context.vfxPatterns = settings.vfxPatterns();
    context.material = material;
    if (settings.restrictRange())
        context.preserve = SecondsRange{settings.preserveMaterialBefore(), settings.preserveMaterialAfter()};
    return context;
}

SecondsRange intersect(const SecondsRange& a, const SecondsRange& b)
{
    return {std::max(a.start, b.start), std::min(a.end, b.end)};
}

FrameRanges intersect(const FrameRanges& a, const FrameRanges& b)
{
    return without(a, without(a, b));
}

/// What a plain run can take away.
FrameRanges replacedFrames(const Settings& settings, const Framerate& framerate)
{
    if (!settings.restrictRange())
        return {{0, framerate.lastFrame + 1}};
    return framesOfMaterial({{settings.preserveMaterialBefore(), settings.preserveMaterialAfter()}}, framerate);
}

/// What a plain run of the list carries over.
FrameRanges carriedSources(const EventList& changes, const Framerate& framerate)
{
    FrameRanges sources;
    for (const auto& event : changes.events()) {
        if (const auto stretch = changeStretchOf(*event, framerate))
            sources.push_back(stretch->source());
    }
    return united(std::move(sources));
}

/// The list of some events of a plan.
EventList listOf(std::vector<KeptEvent> events, const DataModel& model)
{
    KeepPlan plan;
    plan.events = std::move(events);
    return keptChangeList(plan, model.newEdl(), model.settings().matchBy(), Timecode::framerate());
}

void sortByDestination(std::vector<KeptEvent>& events)
{
    std::sort(events.begin(), events.end(),
              [](const KeptEvent& a, const KeptEvent& b) { return a.destination.start < b.destination.start; });
}

std::vector<KeptEvent> movedOf(const std::vector<KeptEvent>& events)
{
    std::vector<KeptEvent> moved;
    std::copy_if(events.begin(), events.end(), std::back_inserter(moved),
                 [](const KeptEvent& event) { return event.shift != 0; });
    return moved;
}

} // namespace

ProtectedRun::Source ProtectedRun::sourceOf(const DataModel& model)
{
    return model.oldEdl().isEmpty() || model.newEdl().isEmpty() ? Source::Given : Source::Generated;
}

ProtectedRun::ProtectedRun(const DataModel& model, const std::vector<SecondsRange>& material, Source source)
    : m_source(source)
{
    const KeepContext context = contextOf(model, material);
    const KeepPlanner planner(context);
    m_plan = source == Source::Given ? planner.planGiven(model.changeEdl())
                                     : planner.plan(model.oldEdl(), model.newEdl(), model.changeEdl());
    if (m_plan.needsRun()) {
        m_bounds = hullSeconds(m_plan, context.framerate);
        if (context.preserve)
            m_bounds = intersect(*m_bounds, *context.preserve);
    }
    m_protected = protectedOf(model, material);
}

FrameRanges ProtectedRun::protectedOf(const DataModel& model, const std::vector<SecondsRange>& material) const
{
    const Framerate framerate = Timecode::framerate();
    const FrameRanges standing =
        intersect(framesOfMaterial(material, framerate), replacedFrames(model.settings(), framerate));
    return intersect(without(standing, carriedSources(model.changeEdl(), framerate)), keptSources());
}

/// What of the old programme is still there afterwards.
FrameRanges ProtectedRun::keptSources() const
{
    if (!m_plan.hull)
        return {Everywhere};
    FrameRanges kept{{Everywhere.start, m_plan.hull->start}, {m_plan.hull->end, Everywhere.end}};
    for (const auto* events : {&m_plan.events, &m_plan.untouched}) {
        for (const KeptEvent& event : *events)
            kept.push_back(event.source());
    }
    return united(std::move(kept));
}

void ProtectedRun::putListInto(DataModel& model) const
{
    if (m_source == Source::Given)
        return;
    model.changeEdl() = listOf(m_plan.events, model);
}

EventList ProtectedRun::startableList(const DataModel& model) const
{
    return listOf(m_plan.events.empty() ? m_plan.untouched : m_plan.events, model);
}

EventList ProtectedRun::carried(const DataModel& model) const
{
    if (m_source == Source::Given)
        return EventList();
    std::vector<KeptEvent> all = m_plan.untouched;
    all.insert(all.end(), m_plan.events.begin(), m_plan.events.end());
    sortByDestination(all);
    return listOf(std::move(all), model);
}

EventList ProtectedRun::outside(const DataModel& model) const
{
    return m_source == Source::Given ? EventList() : listOf(movedOf(m_plan.untouched), model);
}

} // namespace cadrel::core
