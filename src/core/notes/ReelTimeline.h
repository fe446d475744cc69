// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

namespace cadrel::core {

/// How long a reel is from a moment on. Each step has a moment of its own, and so has the start of each turn.
struct ReelLength {
    std::size_t moment;
    std::int32_t frames;
};

/// Where a reel begins, and how long it is while the steps are carried out. Timecodes as frame counts.
struct ReelCourse {
    std::optional<std::int32_t> oldStart; ///< none of a reel that is new
    std::optional<std::int32_t> newStart; ///< none of a reel that is gone in the end
    std::vector<ReelLength> lengths;      ///< in the order of their moments, the first of moment 0
};

/// All of a reel goes from one timecode to another.
struct ReelShift {
    std::size_t reel;
    std::int32_t from;
    std::int32_t to;
    bool isOutOfTheWay; ///< `to` is a free place, and the reel goes on from there when its own steps come

    bool operator==(const ReelShift&) const = default;
};

/// Lays the reels of a film along one timeline so that none lies on another at any moment, also while one of them is longer
/// than it was and than it will be. A reel goes to its new place right before its own steps. If it is in the way before
/// that, it goes earlier; where its new place isn't free by then, it waits at a free one. A reel that has no picture isn't
/// moved: it begins where its first picture is put.
///
///     old cut        |-- 1 --|   |-- 2 --|
///     2 goes first   |-- 1 --|           |-- 2 --|
///     1 grows        |------ 1 -----|    |-- 2 --|
class ReelTimeline {
public:
    /// The reels in the order in which their steps are carried out, in which new starts ascend. `turns` are the moments at
    /// which their turns begin.
    ReelTimeline(std::vector<ReelCourse> courses, std::vector<std::size_t> turns, const Framerate& framerate);

    /// The shifts that come right before the steps of a reel. Each reel has its turn once, in order.
    std::vector<ReelShift> makeRoomFor(std::size_t reel);
    /// Where a reel begins in the turn in hand, if need be as soon as it has picture.
    std::int32_t startOf(std::size_t reel) const { return m_starts.at(reel); }
    /// Whether it stands at a free place until its own turn.
    bool isAside(std::size_t reel) const { return m_isAside.at(reel); }
    /// Whether a reel has lain on another so far, since the day had no free place for it.
    bool hasNoRoom() const { return m_hasNoRoom; }

private:
    struct Span {
        std::int32_t start;
        std::int32_t length;

        bool meets(const Span& other) const
        {
            return length > 0 && other.length > 0 && start < other.start + other.length && other.start < start + length;
        }
    };
    /// The moments from `begin` until before `end`.
    struct Moments {
        std::size_t begin;
        std::size_t end;
    };
    struct PlacedReel {
        std::size_t reel;
        std::int32_t start;
    };

    Moments thisTurn() const { return {m_turns[m_turn], endOf(m_turn)}; }
    std::size_t endOf(std::size_t turn) const;
    std::int32_t lengthAt(std::size_t reel, std::size_t moment) const;
    std::int32_t mostBeforeItsTurn(std::size_t reel) const;
    bool growsIn(std::size_t reel, const Moments& moments) const;
    bool meet(const PlacedReel& one, const PlacedReel& other, const Moments& moments) const;
    PlacedReel now(std::size_t reel) const { return {reel, m_starts[reel]}; }
    PlacedReel atWork(std::size_t reel) const { return {reel, m_courses[reel].newStart.value_or(m_starts[reel])}; }

    void forgetEmptyReels();
    void placeThoseThatGrow();
    bool canBegin(std::size_t reel) const;
    void clear(const PlacedReel& target);
    void makeWay(std::size_t reel);
    bool canSettle(std::size_t reel) const;
    bool isFreeUntilItsTurn(const PlacedReel& target) const;
    void settle(std::size_t reel);
    void waitElsewhere(std::size_t reel);
    std::optional<std::int32_t> freeStart(std::int32_t length) const;
    void shift(std::size_t reel, std::int32_t to, bool isOutOfTheWay);

    const std::vector<ReelCourse> m_courses;
    const std::vector<std::size_t> m_turns;
    const Framerate m_framerate;
    std::vector<std::int32_t> m_mostEver; ///< frames that each reel has at most at any moment
    std::vector<std::int32_t> m_starts;
    std::vector<bool> m_isAside;
    bool m_hasNoRoom = false;
    std::size_t m_turn = 0;            ///< reels before it are as they will be
    std::vector<PlacedReel> m_waiting; ///< reels that go there as soon as others have made way
    std::vector<ReelShift> m_shifts;   ///< of this turn
};

} // namespace cadrel::core
