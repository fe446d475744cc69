#pragma once

#include "core/CutEventBase.h"

#include <memory>
#include <vector>

namespace cadrel::core {

class EventBase;

/// A change event together with what it does to each track.
class Cut {
public:
    using CutEvents = std::vector<std::shared_ptr<CutEventBase>>;

    Cut(std::shared_ptr<EventBase> event, CutEvents cutEvents);

    const std::shared_ptr<EventBase>& event() const { return event_; }
    /// One for each candidate track, in the same order of tracks in every cut of a run.
    CutEvents& cutEvents() { return cutEvents_; }
    const CutEvents& cutEvents() const { return cutEvents_; }

    /// In seconds, over all cut events. Throw Result::OutOfRange when there are none.
    double earliestDstIn() const;
    double latestDstOut() const;

private:
    std::shared_ptr<EventBase> event_;
    CutEvents cutEvents_;
};

} // namespace cadrel::core
