// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/Event.h"

#include <cmath>
#include <cstdint>
#include <map>

namespace standin {

/// Events by one of their seams, so that what fits to another seam is found without a look at all that stand at that time.
/// The events have to outlive it.
class Seams {
public:
    void add(const Event::Seam& seam, Event& event) { m_cells[cellOf(seam)].emplace(m_count++, &event); }

    /// Takes out the first added event whose seam may be the same as this one and for which `fits` is true; null when there
    /// is none.
    template <class Fits>
    Event* take(const Event::Seam& seam, const Fits& fits)
    {
        Cell* cell = nullptr;
        Cell::iterator first;
        visitCellsAround(seam, [&](Cell& candidates) {
            for (auto next = candidates.begin(); next != candidates.end(); ++next) {
                if (cell && first->first < next->first)
                    return;
                if (fits(*next->second)) {
                    cell = &candidates;
                    first = next;
                    return;
                }
            }
        });
        if (!cell)
            return nullptr;
        Event* const event = first->second;
        cell->erase(first);
        return event;
    }

private:
    /// Events in the order in which they were added.
    using Cell = std::map<std::uint64_t, Event*>;
    struct Key {
        std::uint64_t origin;
        std::int64_t time;
        std::int64_t offset;

        auto operator<=>(const Key&) const = default;
    };

    /// What is one instant lies in one cell or in two neighbours.
    static std::int64_t cellOf(double seconds)
    {
        return static_cast<std::int64_t>(std::floor(seconds / (2.0 * SameInstant)));
    }
    static Key cellOf(const Event::Seam& seam) { return {seam.origin, cellOf(seam.time), cellOf(seam.offset)}; }

    template <class Visit>
    void visitCellsAround(const Event::Seam& seam, const Visit& visit)
    {
        const Key middle = cellOf(seam);
        for (std::int64_t time = middle.time - 1; time <= middle.time + 1; ++time) {
            const auto last = m_cells.upper_bound({middle.origin, time, middle.offset + 1});
            for (auto cell = m_cells.lower_bound({middle.origin, time, middle.offset - 1}); cell != last; ++cell)
                visit(cell->second);
        }
    }

    std::map<Key, Cell> m_cells;
    std::uint64_t m_count = 0;
};

} // namespace standin
