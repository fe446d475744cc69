// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/settings/VfxNameMatcher.h"

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::tests {

/// The pairing of two EDLs in its plainest form: each new event with each old one of its name, and the overlapping
/// candidates weeded out one by one. Far too slow for a reel and easy to check by eye, so that it can say what the
/// real generator has to find.
class PairwiseGenerator {
public:
    PairwiseGenerator(std::int32_t matchBy, const std::vector<core::VfxPatternEntry>& vfxEntries);

    /// Fills an empty `changeEvents`; throws what the real generator throws.
    void generate(const core::EventList& oldEvents, const core::EventList& newEvents,
                  core::EventList& changeEvents) const;

private:
    using NameIndex = std::multimap<std::string, std::shared_ptr<core::EventBase>>;

    const std::string& matchedName(const core::EventBase& event) const;
    std::string nameVfxShot(core::EventBase& event) const;
    NameIndex indexByName(const core::EventList& oldWork) const;
    void mergeTransitionPieces(core::EventList& changeEvents) const;

    std::int32_t m_matchBy;
    core::VfxNameMatcher m_versionPatterns;
};

} // namespace cadrel::tests
