// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notes/Programme.h"

#include <cstddef>
#include <cstdint>
#include <unordered_map>
#include <vector>

namespace cadrel::core {

/// The frames that a run of the old and a run of the new programme have in common.
struct SharedPicture {
    std::int32_t oldStart;
    std::int32_t newStart;
    std::int32_t length;
    std::size_t oldRun;
    std::size_t newRun;

    std::int32_t oldEnd() const { return oldStart + length; }
    std::int32_t newEnd() const { return newStart + length; }
};

/// Finds what runs of a new programme share with those of the old one.
class SharedPictureSearch {
public:
    explicit SharedPictureSearch(const Programme& oldCut);

    /// What a run shares with old runs, at most a few dozen, in the order of the new programme.
    std::vector<SharedPicture> sharedWith(const ShownRun& newRun, std::size_t newIndex) const;

private:
    struct Material {
        std::vector<std::size_t> byTime;   ///< places of runs
        std::vector<std::size_t> bySource; ///< the same in the order of their first source frame
        double longestSource = 0.0;        ///< the most source that one of them takes
    };

    const Programme& m_oldCut;
    std::unordered_map<std::int32_t, Material> m_materials;
};

/// A set of frames of a programme.
class FrameSet {
public:
    /// Of a programme of so many frames; empty at first.
    explicit FrameSet(std::int32_t length);

    void add(std::int32_t start, std::int32_t end);
    /// The first frame from `frame` on that is in the set, or isn't; `limit` where there is none before it.
    std::int32_t nextIn(std::int32_t frame, std::int32_t limit) const { return next(frame, limit, 0); }
    std::int32_t nextOut(std::int32_t frame, std::int32_t limit) const { return next(frame, limit, ~std::uint64_t{0}); }

private:
    std::int32_t next(std::int32_t frame, std::int32_t limit, std::uint64_t passedOver) const;

    std::vector<std::uint64_t> m_words; ///< 64 frames each
};

} // namespace cadrel::core
