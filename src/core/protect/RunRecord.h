// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/keep/PastRuns.h"
#include "core/picture/FrameRange.h"
#include "core/protect/ProtectedRun.h"

#include <cstdint>
#include <optional>

namespace cadrel::core {

class DataModel;
class Settings;

/// What a model keeps of the runs that its project has behind it. The note of a run stands in a property of the model, so that
/// it comes and goes with the run's entry of the undo list, and is stored with the project.
namespace RunRecord {

/// The frames of the new programme that a run with these settings may change.
FrameRange allowedBy(const Settings& settings);

/// The runs that were noted, also by an older version, which knew nothing of the last one. Nothing where there is no note or
/// none that can be read.
std::optional<PastRuns> find(const DataModel& model);
/// The same, but without a note the lists of the model are taken for those of its last run, which could change `allowed`. So
/// it is as long as nobody has changed them since.
PastRuns findOrGuess(const DataModel& model, const FrameRange& allowed);

/// Puts the runs in the place of those that were noted. A note that can't be read stays as it is.
void write(const PastRuns& runs, DataModel& model);
/// Notes that a run of the model's lists has been done, which could change `allowed`. Needs a frame rate.
void addRun(DataModel& model, const FrameRange& allowed);

} // namespace RunRecord

/// Whether the run of a model's lists goes on from where the sound stands. Borrows the model.
class NextRun {
public:
    NextRun(const DataModel& model, ProtectedRun::Source source) : m_model(model), m_source(source) {}

    /// The first frame at which the sound stands in another cut than the old one of the model, as far as the run finds or
    /// leaves sound there. Nothing for a list that was given.
    std::optional<std::int32_t> firstDifference(const PastRuns& runs) const;
    /// Whether the change EDL of the model has been carried out already.
    bool hasBeenDone(const PastRuns& runs) const;

private:
    FrameRanges readFrames() const;

    const DataModel& m_model;
    ProtectedRun::Source m_source;
};

} // namespace cadrel::core
