// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/CadrelPreviewState.h"
#include "core/cut/CadrelRunState.h"
#include "core/cut/CutList.h"
#include "core/detect/CadrelInformationAlgorithm.h"
#include "core/edl/EventBase.h"
#include "tests/support/core/ConformFilm.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/MemoryTrack.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <memory>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::core {

/// Shows an entry where a test fails.
inline void PrintTo(const MarkerEntry& entry, std::ostream* out)
{
    *out << entry.start << " to " << entry.end << " \"" << entry.name << "\" of kind " << entry.kind;
}

} // namespace cadrel::core

namespace cadrel::tests {

/// A film whose cuts are handed to one algorithm at a time, without a run of the engine.
struct CutFilm : ConformFilm {
    using ConformFilm::ConformFilm;

    /// Adds a cut whose change event has a place in the new programme; where it comes from doesn't matter to anyone.
    core::EventBase& carryOver(const char* dstIn, const char* dstOut, core::Cut::CutEvents cutEvents = {})
    {
        const auto event = makeEvent("CHANGE", dstIn, dstOut, dstIn, dstOut);
        cuts.add(std::make_shared<core::Cut>(event, std::move(cutEvents)));
        return *event;
    }
    /// Adds a cut of which the cut events alone matter.
    void addCut(core::Cut::CutEvents cutEvents) { carryOver("01:00:00:00", "01:00:10:00", std::move(cutEvents)); }

    core::CadrelRunState runState() const
    {
        return {&model.oldEdl(), &model.newEdl(), project.framerate, &model.settings(), previewOffset, 0.0};
    }
    core::CadrelPreviewState previewState() const { return {project.framerate, &model.settings()}; }

    std::vector<core::MarkerEntry> detectBy(const core::CadrelInformationAlgorithm& algorithm,
                                            core::ProgressHandlerBase* progress = nullptr) const
    {
        return algorithm.detect(cuts, runState(), progress);
    }

    core::CutList cuts;
    double previewOffset = 0.0; ///< seconds
};

inline std::shared_ptr<core::CutEventBase> cutEvent(MemoryTrack& track, core::SecondsRange source,
                                                    core::SecondsRange destination)
{
    return std::make_shared<MemoryCutEvent>(track, source.start, source.end, destination.start, destination.end);
}

inline void addClip(MemoryTrack& track, double start, double end)
{
    track.addClip({"take", start, end, 0.0});
}

/// A plain event of roll "ROLL" and clip "CLIP" at a place of the programme, in frames of the project's rate.
inline std::shared_ptr<core::EventBase> eventAtFrames(std::int32_t dstIn, std::int32_t dstOut)
{
    auto event = std::make_shared<core::EventBase>();
    event->setRollName("ROLL");
    event->setClipName("CLIP");
    const core::Timecode in(dstIn);
    const core::Timecode out(dstOut);
    event->setTimecodes(in, out, in, out);
    return event;
}

/// The same entries, with times as close as floats allow that were reckoned by different roads.
inline void expectEntries(const std::vector<core::MarkerEntry>& found, const std::vector<core::MarkerEntry>& expected)
{
    ASSERT_EQ(found.size(), expected.size()) << testing::PrintToString(found);
    for (std::size_t i = 0; i < found.size(); ++i) {
        EXPECT_NEAR(found[i].start, expected[i].start, 1e-9) << "entry " << i;
        EXPECT_NEAR(found[i].end, expected[i].end, 1e-9) << "entry " << i;
        EXPECT_EQ(found[i].name, expected[i].name) << "entry " << i;
        EXPECT_EQ(found[i].kind, expected[i].kind) << "entry " << i;
    }
}

} // namespace cadrel::tests
