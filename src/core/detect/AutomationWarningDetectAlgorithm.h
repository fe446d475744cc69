// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/detect/CadrelInformationAlgorithm.h"

namespace cadrel::core {

/// Finds the jumps that a run has brought into the automation: those of the curves as they stand in the preview stretch,
/// after all that is written there, which the old programme hasn't got at the place from which they were carried.
class AutomationWarningDetectAlgorithm : public CadrelInformationAlgorithm {
public:
    /// What the name of a marker begins with; the names of the tracks follow.
    static constexpr const wchar_t* NameStart = L"Automation warning in ";

    std::vector<MarkerEntry> detect(const CutList& cuts, const CadrelRunState& state,
                                    ProgressHandlerBase* progress) const override;
    std::uint64_t estimateSteps(std::uint64_t eventCount, std::uint64_t trackCount) const override;
};

} // namespace cadrel::core
