// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/edl/ProgrammeOrder.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <unordered_set>
#include <vector>

namespace cadrel::core {

/// Tells by which modes a selection of a change EDL can be healed. What doesn't depend on the mode is found out once. The
/// reference list has to outlive it; changes of the others are not followed.
class HealCheck {
public:
    /// Throws what Timecode::toFrameCount throws.
    HealCheck(const EventList& list, const std::vector<std::shared_ptr<EventBase>>& selection,
              const EventList& referenceList);

    /// As EventList::canHeal.
    bool canHeal(std::int32_t healMode) const;

private:
    bool collectRun(const EventList& list, const std::unordered_set<const EventBase*>& selected);
    void collectWithoutHealing(const EventList& list, const std::unordered_set<const EventBase*>& selected);

    const EventList& m_referenceList;
    std::size_t m_selectedCount;
    bool m_isFragmented = false;
    std::vector<PlacedEvent> m_collected; ///< without healing, in programme order; none with unusable timecodes
    std::size_t m_untimed = 0;            ///< how many others are selected
};

} // namespace cadrel::core
