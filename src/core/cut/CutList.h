// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/Cut.h"
#include "core/edl/EventList.h"

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

    std::size_t size() const { return m_cuts.size(); }
    bool isEmpty() const { return m_cuts.empty(); }
    /// No bounds check.
    const std::shared_ptr<Cut>& cutAt(std::size_t index) const { return m_cuts[index]; }
    /// The change event of each cut, in the same order.
    const EventList& events() const { return m_events; }

    /// In seconds, over all cuts. Throw Result::OutOfRange for an empty list and for a cut without cut events.
    double earliestDstIn() const;
    double latestDstOut() const;
    /// The cuts by their earliestDstIn. Of several with the same time, the result has only the last one of the list.
    /// Throws Result::OutOfRange for a cut without cut events.
    std::map<double, std::weak_ptr<Cut>> orderedByStart() const;

private:
    std::vector<std::shared_ptr<Cut>> m_cuts;
    EventList m_events{ListKind::Change};
};

} // namespace cadrel::core
