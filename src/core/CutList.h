#pragma once

#include "core/Cut.h"
#include "core/EventList.h"

#include <cstddef>
#include <map>
#include <memory>
#include <vector>

namespace cadrel::core {

/// The cuts of one run or preview, in the order of the change list.
class CutList {
public:
    /// Throws Result::InvalidArgument for a null cut and for one without a change event; no cut of a list is ever null.
    void add(std::shared_ptr<Cut> cut);
    void clear();

    std::size_t size() const { return cuts_.size(); }
    bool isEmpty() const { return cuts_.empty(); }
    /// No bounds check.
    const std::shared_ptr<Cut>& cutAt(std::size_t index) const { return cuts_[index]; }
    /// The change event of each cut, in the same order.
    const EventList& events() const { return events_; }

    /// In seconds, over all cuts. Throw Result::OutOfRange for an empty list and for a cut without cut events.
    double earliestDstIn() const;
    double latestDstOut() const;
    /// The cuts by their earliestDstIn; of two at the same time the later one of the list. Throws Result::OutOfRange
    /// for a cut without cut events.
    std::map<double, std::weak_ptr<Cut>> orderedByStart() const;

private:
    std::vector<std::shared_ptr<Cut>> cuts_;
    EventList events_{ListKind::Change};
};

} // namespace cadrel::core
