// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/MatchedName.h"
#include "core/settings/Settings.h"
#include "core/settings/VfxNameMatcher.h"

namespace cadrel::core {

namespace {

/// Gives each event the flag that `isVfx` has for it. Returns whether any event changed.
template <class Predicate>
bool setVfxFlags(const std::vector<std::shared_ptr<EventBase>>& events, Predicate isVfx)
{
    bool changed = false;
    for (const std::shared_ptr<EventBase>& event : events) {
        const bool flag = isVfx(*event);
        if (flag == event->vfx())
            continue;
        event->setVfx(flag);
        changed = true;
    }
    return changed;
}

} // namespace

void EventList::markVfx(const VfxNameMatcher& patterns, std::int32_t matchBy)
{
    stopListening();
    const bool changed =
        setVfxFlags(m_events, [&](const EventBase& event) { return patterns.hasVersion(nameBy(matchBy, event)); });
    listen();
    if (changed)
        notifyListeners();
}

void EventList::clearVfx()
{
    stopListening();
    const bool changed = setVfxFlags(m_events, [](const EventBase&) { return false; });
    listen();
    if (changed)
        notifyListeners();
}

} // namespace cadrel::core
