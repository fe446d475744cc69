// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notes/Programme.h"

#include <cstddef>
#include <cstdint>
#include <map>
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
    std::vector<SharedPicture> sharedWith(const PictureRun& newRun, std::size_t newIndex) const;

private:
    struct Material {
        std::vector<std::size_t> byTime;   ///< places of runs
        std::vector<std::size_t> bySource; ///< the same in the order of their first source frame
        double longestSource = 0.0;        ///< the most source that one of them takes
    };

    const Programme& m_oldCut;
    std::unordered_map<std::int32_t, Material> m_materials;
};

/// Stretches of frames that are taken, none twice.
class TakenFrames {
public:
    /// No frame from `start` to before `end` is taken yet.
    void take(std::int32_t start, std::int32_t end);
    /// Where the first taken frame stands from `frame` on, or `limit` where that is before it.
    std::int32_t nextTaken(std::int32_t frame, std::int32_t limit) const;
    /// The first frame from `frame` on that isn't taken.
    std::int32_t nextFree(std::int32_t frame) const;

private:
    std::map<std::int32_t, std::int32_t> m_endByStart;
};

} // namespace cadrel::core
