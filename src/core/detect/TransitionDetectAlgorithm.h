// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/detect/CadrelInformationAlgorithm.h"

namespace cadrel::core {

/// Finds the dissolves and wipes of the new EDL that the old one doesn't have at that place, and that aren't inside a
/// change event. It passes over events whose place in the programme can't be told, and those whose transition doesn't last
/// from no time to less than a day. A marker is as long as the transition. Can't be cancelled.
class TransitionDetectAlgorithm : public CadrelInformationAlgorithm {
public:
    std::vector<MarkerEntry> detect(const CutList& cuts, const CadrelRunState& state,
                                    ProgressHandlerBase* progress) const override;
    std::uint64_t estimateSteps(std::uint64_t eventCount, std::uint64_t trackCount) const override;
};

} // namespace cadrel::core
