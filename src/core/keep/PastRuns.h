// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/picture/FrameRange.h"
#include "core/settings/VfxPatternEntry.h"
#include "core/time/Framerate.h"

#include <cstddef>
#include <cstdint>
#include <limits>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace cadrel::core {

class ChangeEdlGenerator;
struct ChangeStretch;

/// The runs that a project has behind it, and so the cut that its sound stands in. A later run hides what an earlier one
/// did at the same time of the programme.
///
///     first run     |-- reel 1 --|
///     second run                       |-- reel 2 --|
///     third run     |-- reel 1 --|                       the first one counts no longer
class PastRuns {
public:
    /// How events are named when two cuts are compared, and the rate of their timecodes.
    struct Context {
        std::int32_t matchBy = 0;
        std::vector<VfxPatternEntry> vfxPatterns;
        Framerate framerate;
    };

    explicit PastRuns(Context context) : m_context(std::move(context)) {}

    /// A stretch without bounds, for a run that may change all.
    static constexpr FrameRange AllTime{std::numeric_limits<std::int32_t>::min(),
                                        std::numeric_limits<std::int32_t>::max()};

    /// A run after those before it; the lists are as the model had them. Without both cuts it is one of a change EDL that
    /// was given. A run without events is none. Outside of `allowed` it changed nothing, so that the sound stands in the
    /// old cut there. Keeps the events as a project stores them.
    void add(const EventList& oldCut, const EventList& newCut, const EventList& changes,
             const FrameRange& allowed = AllTime);

    bool isEmpty() const { return m_runs.empty(); }
    std::size_t size() const { return m_runs.size(); }

    /// The first frame at which the sound stands in another cut than the one given: at which the two differ where both
    /// have a reel, or where they end when a run began with just the cut that is given. Only frames in `asked` count.
    /// Throws Result::InvalidArgument for a VFX pattern that can't be used.
    std::optional<std::int32_t> firstDifference(const EventList& oldCut, const FrameRanges& asked = {AllTime}) const;
    /// Whether a run has carried out this change EDL in some of `allowed`; one that moves nothing counts as none. A list
    /// that was `given` is compared with all runs, and one that was made of two cuts only with those of given lists.
    bool haveCarriedOut(const EventList& changes, bool isGiven, const FrameRange& allowed = AllTime) const;

    /// For the model's properties.
    std::string toBytes() const;
    /// Reads them whatever the names are compared by. False for what isn't such bytes; there are no runs then.
    bool read(const std::string& bytes);

private:
    struct Run {
        std::shared_ptr<const EventList> oldCut;
        std::shared_ptr<const EventList> newCut;
        std::shared_ptr<const EventList> changes;
        FrameRange allowed;
        FrameRanges extent; ///< the reels of both cuts, or the hull of the change EDL, within `allowed`
        FrameRanges left;   ///< the reels that the sound stands in after the run, or the hull likewise

        bool isOfCuts() const { return !oldCut->isEmpty() || !newCut->isEmpty(); }
    };

    /// The run of lists as a project stores them.
    Run runOf(std::shared_ptr<const EventList> oldCut, std::shared_ptr<const EventList> newCut,
              std::shared_ptr<const EventList> changes, const FrameRange& allowed) const;
    void forgetWithin(const FrameRanges& extent);
    std::vector<ChangeStretch> stretchesOf(const Run& run) const;
    void configure(ChangeEdlGenerator& generator) const;

    Context m_context;
    std::vector<Run> m_runs; ///< the earliest first
};

} // namespace cadrel::core
