// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/EventJson.h"

#include "app/edl/EventWords.h"
#include "core/edl/EventList.h"
#include "core/edl/HealedEvent.h"

namespace cadrel::app {

using core::EventBase;
using core::HealedEvent;
using nlohmann::ordered_json;

namespace {

constexpr int Schema = 1;

ordered_json toJson(const EventBase& event)
{
    ordered_json members = ordered_json::array();
    if (const auto* healed = dynamic_cast<const HealedEvent*>(&event)) {
        for (const auto& member : healed->healedEvents().events())
            members.push_back(toJson(*member));
    }
    return {{"number", event.eventNumber()},
            {"kind", kindWordOf(event)},
            {"roll", event.rollName()},
            {"clip", event.clipName()},
            {"transition", transitionWordOf(event)},
            {"duration", event.transitionDuration()},
            {"srcIn", event.srcIn().toString()},
            {"srcOut", event.srcOut().toString()},
            {"dstIn", event.dstIn().toString()},
            {"dstOut", event.dstOut().toString()},
            {"speed", event.signedSpeed()},
            {"vfx", event.vfx()},
            {"flaws", flawWordsOf(event)},
            {"edlFile", event.edlFileName()},
            {"members", std::move(members)}};
}

std::string textOf(const ordered_json& value)
{
    return value.dump(-1, ' ', false, ordered_json::error_handler_t::replace);
}

} // namespace

void EventJson::write(Events events, const ordered_json& furtherKeys, const Sink& sink, const KeysOf& keysOf)
{
    sink("{\n\"schema\": " + std::to_string(Schema) + ",\n\"events\": [");
    const char* separator = "\n";
    for (std::size_t index = 0; index < events.size(); ++index) {
        ordered_json event = toJson(*events[index]);
        if (keysOf)
            event.update(keysOf(index));
        sink(separator + textOf(event));
        separator = ",\n";
    }
    sink("\n]");
    for (const auto& [key, value] : furtherKeys.items())
        sink(",\n" + textOf(key) + ": " + textOf(value));
    sink("\n}\n");
}

} // namespace cadrel::app
