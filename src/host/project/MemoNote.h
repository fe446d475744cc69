// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/project/MemoState.h"
#include "host/project/ShownMemos.h"

#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <set>

namespace cadrel::host {

/// A memo in the real programme that shares its id with no other one, and the copies with an edit that it hasn't followed.
struct MemoBehind {
    MemoState before; ///< with the name and the place that it had when the copies got theirs
    MemoState memo;
    std::set<MemoState> copies;

    /// What was behind at the last note, and is `now`. What memo and copy have got at one go counts as the memo's.
    static MemoBehind laterThan(const MemoBehind& last, MemoBehind now);
};

/// What is known of the copies from when they were noted last.
struct MemoNote {
    using Copies = std::set<MemoState>;

    /// By event and piece. An event without copies is known, too.
    std::map<std::shared_ptr<core::EventBase>, std::map<std::size_t, Copies>> remembered;
    std::set<std::int64_t> knownIds;           ///< of those copies
    Copies notFollowed;                        ///< the other copies
    std::set<std::int64_t> orphans;            ///< of those, where no memo is there
    std::map<std::int64_t, MemoBehind> behind; ///< by their ids

    /// The copies in a stretch as they were; null where nothing is known of its event.
    const Copies* copiesIn(const ShownStretch& shown) const;
};

} // namespace cadrel::host
