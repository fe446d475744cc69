// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/core/keep/KeepFilm.h"

#include "core/change/ChangeEdlGenerator.h"
#include "core/change/HealProcessing.h"
#include "core/edl/EventBase.h"
#include "core/settings/Settings.h"
#include "core/time/Timecode.h"
#include "util/Result.h"

#include <array>
#include <memory>

namespace cadrel::tests {

using core::EventList;
using core::FrameRange;
using core::KeepPlan;
using core::KeptEvent;
using core::SecondsRange;

EventList generatedChanges(const EventList& oldEvents, const EventList& newEvents, std::int32_t matchBy,
                           std::int32_t healMode, const core::Framerate& framerate)
{
    EventList changes;
    try {
        core::ChangeEdlGenerator generator;
        generator.configure(matchBy, {});
        generator.generate(oldEvents, newEvents, changes);
        core::Settings settings;
        settings.setMatchBy(matchBy);
        settings.setHealMode(healMode);
        core::HealProcessing().process(changes, {&newEvents, &settings, framerate});
    } catch (util::Result::Type) {
        changes.clear();
    }
    return changes;
}

KeepPlan planFor(const Film& oldFilm, const Film& newFilm, const std::vector<SecondsRange>& material)
{
    const EventList oldEvents = oldFilm.list();
    const EventList newEvents = newFilm.list();
    core::KeepContext context;
    context.framerate = FrameASecond;
    context.material = material;
    return core::KeepPlanner(context).plan(
        oldEvents, newEvents,
        generatedChanges(oldEvents, newEvents, core::MatchBy::RollName, core::HealMode::Normal, FrameASecond));
}

std::string lineOf(const KeptEvent& event)
{
    static constexpr std::array<const char*, 4> Origins{"cut", "unchanged", "hole", "black"};
    std::string line = lineOf(event.source()) + " to " + lineOf(event.destination) + ":";
    std::string lastOrigin;
    for (const core::CarriedStretch& part : event.parts) {
        const std::string origin = Origins.at(static_cast<std::size_t>(part.from));
        if (origin != lastOrigin)
            line += " " + origin;
        lastOrigin = origin;
    }
    return line;
}

std::vector<std::string> linesOf(const std::vector<KeptEvent>& events)
{
    std::vector<std::string> lines;
    for (const KeptEvent& event : events)
        lines.push_back(lineOf(event));
    return lines;
}

std::string hullOf(const KeepPlan& plan)
{
    return plan.hull ? lineOf(*plan.hull) : "none";
}

} // namespace cadrel::tests
