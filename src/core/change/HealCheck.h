// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/CutMap.h"
#include "core/edl/EventList.h"

#include <cstddef>
#include <cstdint>

namespace cadrel::core {

/// Tells by which modes a selection of a change EDL can be healed. What doesn't depend on the mode is found out once. The
/// reference list has to outlive it; changes of the others are not followed.
class HealCheck {
public:
    /// Throws what Timecode::toSeconds throws.
    HealCheck(const EventList& list, const EventList& selection, const EventList& referenceList);

    /// As EventList::canHeal.
    bool canHeal(std::int32_t healMode) const;

private:
    const EventList& m_referenceList;
    std::size_t m_selectedCount;
    CutMap m_selected;
    bool m_isFragmented;
    EventList m_collected; ///< the selected events with usable timecodes, without healing
    std::size_t m_untimed; ///< how many others are selected
};

} // namespace cadrel::core
