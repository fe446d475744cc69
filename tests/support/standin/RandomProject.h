// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/changes/ChangeLog.h"
#include "standin/project/Project.h"
#include "velmark/Counted.h"

#include <cstddef>
#include <cstdint>
#include <random>

namespace standin::tests {

/// Where something random takes its decisions from.
class Chance {
public:
    Chance() = default;
    Chance(const Chance&) = delete;
    Chance& operator=(const Chance&) = delete;
    virtual ~Chance() = default;

    /// From 0 up to, and without, `limit`, which is above 0.
    virtual std::uint64_t below(std::uint64_t limit) = 0;

    bool oneIn(std::uint64_t count) { return below(count) == 0; }
    template <class Array>
    const auto& oneOf(const Array& choices)
    {
        return choices[below(std::size(choices))];
    }
};

/// The choices of RapidCheck, which come down to simpler ones when a law is broken. Only within a property.
class CheckedChance : public Chance {
public:
    std::uint64_t below(std::uint64_t limit) override;
};

/// The same decisions for the same seed, and many of them in little time.
class SeededChance : public Chance {
public:
    explicit SeededChance(std::uint64_t seed) : m_engine(seed) {}

    std::uint64_t below(std::uint64_t limit) override { return m_engine() % limit; }

private:
    std::mt19937_64 m_engine;
};

/// The most that a random project has of each.
struct ProjectScale {
    std::size_t clips = 4;  ///< in the media pool
    std::size_t tracks = 6; ///< folders are counted
    std::size_t events = 6; ///< on a track; a third as many in a part
    std::size_t points = 5; ///< of a curve
    double seconds = 100.0; ///< where the last event begins
};

/// A project with all that one can have: a pool, folders in folders, tracks of every kind, clips, point and range markers,
/// parts in parts, curves, attributes of each kind whether persistent or not, a selection, locks, locators and a clock.
/// Events overlap, touch and begin together, and stand on frames as well as between them.
///
/// Nothing in it counts as changed. The log outlives the project.
Velmark::Counted<Project> randomProject(Chance& chance, ChangeLog& log, const ProjectScale& scale = {});

} // namespace standin::tests
