// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/GenerationFailure.h"

#include "core/edl/EventList.h"
#include "core/model/DataModel.h"
#include "util/Result.h"

#include <cstddef>
#include <functional>

namespace cadrel::app {

using core::DataModel;
using core::EventList;
using core::Settings;

namespace {

bool fails(const EventList& oldEvents, const EventList& newEvents, const Settings& settings)
{
    DataModel model;
    model.settings() = settings;
    model.oldEdl() = oldEvents;
    model.newEdl() = newEvents;
    return model.generateChangeEdl() != util::Result::Ok;
}

EventList beginningOf(const EventList& events, std::size_t count)
{
    EventList beginning;
    beginning.append(events, 0, count);
    return beginning;
}

/// The length of the beginning that fails while the one without its last event doesn't; the whole list has to fail,
/// and the empty one mustn't.
std::size_t shortestFailure(const EventList& events, const std::function<bool(const EventList&)>& failsWith)
{
    std::size_t good = 0;
    std::size_t bad = events.size();
    while (bad - good > 1) {
        const std::size_t middle = good + (bad - good) / 2;
        if (failsWith(beginningOf(events, middle)))
            bad = middle;
        else
            good = middle;
    }
    return bad;
}

} // namespace

GenerationFailure findGenerationFailure(const DataModel& model)
{
    const EventList none;
    const EventList& oldEvents = model.oldEdl();
    const EventList& newEvents = model.newEdl();
    const Settings& settings = model.settings();
    if (!fails(oldEvents, newEvents, settings))
        return {};

    const auto failsAsOld = [&](const EventList& beginning) { return fails(beginning, none, settings); };
    if (failsAsOld(oldEvents))
        return {nullptr, oldEvents.eventAt(shortestFailure(oldEvents, failsAsOld) - 1)};

    const auto failsAsNew = [&](const EventList& beginning) { return fails(oldEvents, beginning, settings); };
    const std::size_t newCount = shortestFailure(newEvents, failsAsNew);
    const EventList newBeginning = beginningOf(newEvents, newCount);
    const auto newEvent = newEvents.eventAt(newCount - 1);
    if (fails(none, newBeginning, settings))
        return {newEvent, nullptr};

    const auto failsTogether = [&](const EventList& beginning) { return fails(beginning, newBeginning, settings); };
    return {newEvent, oldEvents.eventAt(shortestFailure(oldEvents, failsTogether) - 1)};
}

} // namespace cadrel::app
