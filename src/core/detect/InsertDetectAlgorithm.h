// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/detect/CadrelInformationAlgorithm.h"

namespace cadrel::core {

/// Finds new picture: the stretches of the events of the new EDL that no change event covers. Throws
/// Result::InvalidArgument for an event of the new EDL that ends before it starts. Can't be cancelled.
class InsertDetectAlgorithm : public CadrelInformationAlgorithm {
public:
    std::vector<MarkerEntry> detect(const CutList& cuts, const CadrelRunState& state,
                                    ProgressHandlerBase* progress) const override;
    std::uint64_t estimateSteps(std::uint64_t eventCount, std::uint64_t trackCount) const override;
};

} // namespace cadrel::core
