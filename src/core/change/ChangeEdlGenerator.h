// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/change/GenerationFailure.h"
#include "core/settings/VfxNameMatcher.h"
#include "util/Result.h"

#include <cstdint>
#include <string>
#include <vector>

namespace cadrel::core {

class EventBase;
class EventList;

/// Finds what of the old programme survives in the new one. It compares the events of the two EDLs that use the same
/// material, which have the same roll name or clip name without VFX versions. Where their source ranges overlap, both
/// use the same stretch of material, and this stretch becomes an event of the change EDL. Its SRC is the place of the
/// stretch in the old programme, its DST the place in the new one.
///
///     old programme   |---- A ----|------ B ------|
///     source of A     10         20
///
///     new programme   |------ X ------|-- A --|
///     source of A                     14     18
///
///     change EDL      SRC = old DST IN + 4 .. + 8      DST = new DST IN .. + 4
///
/// Transitions are first cut out as events of their own, because material inside one can only be carried over when both
/// sides have the same transition. Afterwards they are joined with their events again.
class ChangeEdlGenerator {
public:
    /// `matchBy` 1 compares clip names, any other value roll names. Throws Result::InvalidArgument for an enabled VFX
    /// row that doesn't compile.
    void configure(std::int32_t matchBy, const std::vector<VfxPatternEntry>& vfxEntries);

    /// Replaces the content of `changeEvents`; the inputs stay as they are. Returns Ok. Throws what the timecode
    /// arithmetic throws for a valid event, and Result::OutOfRange for a stretch that leaves the day.
    util::Result::Type generate(const EventList& oldEvents, const EventList& newEvents, EventList& changeEvents) const;
    /// Likewise, but tells `onFailure` of the events before it throws on their account, and throws only where that wants it.
    util::Result::Type generate(const EventList& oldEvents, const EventList& newEvents, EventList& changeEvents,
                                const GenerationFailureListener& onFailure) const;

private:
    struct ComparisonName {
        std::string key; ///< the name without its version
        bool isVfx;      ///< whether it had one
    };

    ComparisonName comparisonName(const EventBase& event) const;

    std::int32_t m_matchBy = 0;
    VfxNameMatcher m_versionPatterns;
};

} // namespace cadrel::core
