// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/CutEventBase.h"

#include <memory>
#include <vector>

namespace cadrel::core {

class EventBase;

/// A change event together with what it does to each track.
class Cut {
public:
    using CutEvents = std::vector<std::shared_ptr<CutEventBase>>;

    Cut(std::shared_ptr<EventBase> event, CutEvents cutEvents);

    const std::shared_ptr<EventBase>& event() const { return m_event; }
    /// One for each candidate track, in the same order of tracks in every cut of a run.
    CutEvents& cutEvents() { return m_cutEvents; }
    const CutEvents& cutEvents() const { return m_cutEvents; }

    /// In seconds, over all cut events. Throw Result::OutOfRange when there are none.
    double earliestDstIn() const;
    double latestDstOut() const;

private:
    std::shared_ptr<EventBase> m_event;
    CutEvents m_cutEvents;
};

} // namespace cadrel::core
