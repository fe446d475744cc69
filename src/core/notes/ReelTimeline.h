// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

namespace cadrel::core {

/// Where a reel begins, and how long it is while the steps are carried out. Timecodes as frame counts.
struct ReelCourse {
    std::optional<std::int32_t> oldStart; ///< none of a reel that is new
    std::optional<std::int32_t> newStart; ///< none of a reel that is gone in the end
    std::int32_t mostBefore = 0;          ///< frames that it has at most before its own steps
    std::int32_t mostEver = 0;            ///< frames that it has at most at any time
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
/// that, it goes earlier; where its new place isn't free by then, it waits at a free one.
///
///     old cut        |-- 1 --|   |-- 2 --|
///     2 goes first   |-- 1 --|           |-- 2 --|
///     1 grows        |------ 1 -----|    |-- 2 --|
class ReelTimeline {
public:
    /// The reels in the order in which their steps are carried out, in which new starts ascend.
    ReelTimeline(std::vector<ReelCourse> courses, const Framerate& framerate);

    /// The shifts that come right before the steps of a reel. Each reel has its turn once, in order.
    std::vector<ReelShift> makeRoomFor(std::size_t reel);
    /// Where a reel begins by now. A new one may begin at a free place, where it gets picture before its turn.
    std::int32_t startOf(std::size_t reel) const { return m_starts.at(reel); }

private:
    struct Span {
        std::int32_t start;
        std::int32_t length;

        bool meets(const Span& other) const
        {
            return length > 0 && other.length > 0 && start < other.start + other.length && other.start < start + length;
        }
    };

    Span spanNow(std::size_t reel) const { return {m_starts[reel], m_courses[reel].mostBefore}; }
    Span spanAtWork(std::size_t reel) const;
    void placeNewReels();
    void partThoseThatGrow();
    void clear(const Span& span, std::size_t forReel);
    void makeWay(std::size_t reel);
    bool canSettle(std::size_t reel) const;
    void settle(std::size_t reel);
    void waitElsewhere(std::size_t reel);
    std::optional<std::int32_t> freeStart(std::int32_t length) const;
    void shift(std::size_t reel, std::int32_t to, bool isOutOfTheWay);

    const std::vector<ReelCourse> m_courses;
    const Framerate m_framerate;
    std::vector<std::int32_t> m_starts;
    std::size_t m_turn = 0;             ///< reels before it are as they will be
    std::vector<std::size_t> m_waiting; ///< reels that go as soon as others have made way
    std::vector<ReelShift> m_shifts;    ///< of this turn
};

} // namespace cadrel::core
