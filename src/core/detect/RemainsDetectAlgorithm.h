// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/detect/CadrelInformationAlgorithm.h"

namespace cadrel::core {

/// Finds short pieces of audio clips at either edge of the ranges that were carried over.
class RemainsDetectAlgorithm : public CadrelInformationAlgorithm {
public:
    /// Pieces of up to `threshold` frames are reported.
    explicit RemainsDetectAlgorithm(std::int32_t threshold) : m_threshold(threshold) {}

    std::vector<MarkerEntry> detect(const CutList& cuts, const CadrelRunState& state,
                                    ProgressHandlerBase* progress) const override;
    std::uint64_t estimateSteps(std::uint64_t eventCount, std::uint64_t trackCount) const override;

private:
    std::int32_t m_threshold;
};

} // namespace cadrel::core
