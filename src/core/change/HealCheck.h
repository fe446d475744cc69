// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/CutMap.h"

#include <cstdint>

namespace cadrel::core {

class EventList;

/// Tells by which modes a selection of a change EDL can be healed. What doesn't depend on the mode is found out once. The three
/// lists have to outlive it unchanged.
class HealCheck {
public:
    /// Throws what Timecode::toSeconds throws.
    HealCheck(const EventList& list, const EventList& selection, const EventList& referenceList);

    /// As EventList::canHeal.
    bool canHeal(std::int32_t healMode) const;

private:
    const EventList& m_list;
    const EventList& m_selection;
    const EventList& m_referenceList;
    CutMap m_selected;
    bool m_isFragmented;
};

} // namespace cadrel::core
