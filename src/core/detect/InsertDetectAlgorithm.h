// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/detect/CadrelInformationAlgorithm.h"

namespace cadrel::core {

/// Finds new picture: the stretches of the events of the new EDL that no change event covers. Passes over events whose
/// place in the programme can't be told or is shorter than SameInstant, such as the cut half of a dissolve. A change event
/// that ends before it starts covers nothing. Can't be cancelled.
class InsertDetectAlgorithm : public CadrelInformationAlgorithm {
public:
    std::vector<MarkerEntry> detect(const CutList& cuts, const CadrelRunState& state,
                                    ProgressHandlerBase* progress) const override;
    std::uint64_t estimateSteps(std::uint64_t eventCount, std::uint64_t trackCount) const override;
};

} // namespace cadrel::core
