// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/detect/CadrelInformationAlgorithm.h"

namespace cadrel::core {

/// Finds jumps of an automation curve from one range to the next: where the two meet and, unless the curve is led over
/// gaps, at the end of a gap between them.
class AutomationWarningDetectAlgorithm : public CadrelInformationAlgorithm {
public:
    std::vector<MarkerEntry> detect(const CutList& cuts, const CadrelRunState& state,
                                    ProgressHandlerBase* progress) const override;
    std::uint64_t estimateSteps(std::uint64_t eventCount, std::uint64_t trackCount) const override;
};

} // namespace cadrel::core
