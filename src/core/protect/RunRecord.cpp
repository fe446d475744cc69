// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/protect/RunRecord.h"

#include "core/keep/ChangeStretch.h"
#include "core/keep/Material.h"
#include "core/model/DataModel.h"
#include "core/settings/Settings.h"
#include "core/settings/Variant.h"
#include "core/time/Timecode.h"
#include "util/Result.h"

#include <utility>

namespace cadrel::core {

using util::Result;

namespace {

PastRuns noRuns(const Settings& settings)
{
    return PastRuns({settings.matchBy(), settings.vfxPatterns(), Timecode::framerate()});
}

/// What a property holds. Nothing where it can't be read.
std::optional<PastRuns> readProperty(const DataModel& model, PropertyKey::Type key)
{
    PastRuns runs = noRuns(model.settings());
    Variant stored;
    if (model.getProperty(key, stored) == Result::Ok && !runs.read(stored.toText()))
        return std::nullopt;
    return runs;
}

/// What was noted, by this version or an older one.
std::optional<PastRuns> notedIn(const DataModel& model)
{
    return readProperty(model,
                        model.hasProperty(PropertyKey::DoneRuns) ? PropertyKey::DoneRuns : PropertyKey::EarlierRuns);
}

/// What can't be read may be the note of a later version.
void removeReadable(DataModel& model, PropertyKey::Type key)
{
    if (readProperty(model, key))
        model.removeProperty(key);
}

} // namespace

FrameRange RunRecord::allowedBy(const Settings& settings)
{
    // A stored range that makes no sense is the next run's to refuse, if it still has it then.
    if (!settings.restrictRange() || !(settings.preserveMaterialBefore() <= settings.preserveMaterialAfter()))
        return PastRuns::AllTime;
    const FrameRanges frames = framesOfMaterial({{settings.preserveMaterialBefore(), settings.preserveMaterialAfter()}},
                                                Timecode::framerate());
    return frames.empty() ? FrameRange() : frames.front();
}

std::optional<PastRuns> RunRecord::find(const DataModel& model)
{
    std::optional<PastRuns> runs = notedIn(model);
    return runs && !runs->isEmpty() ? std::move(runs) : std::nullopt;
}

PastRuns RunRecord::findOrGuess(const DataModel& model, const FrameRange& allowed)
{
    PastRuns runs = find(model).value_or(noRuns(model.settings()));
    // An older version has noted only the runs before the last one.
    if (runs.isEmpty() || !model.hasProperty(PropertyKey::DoneRuns))
        runs.add(model.oldEdl(), model.newEdl(), model.changeEdl(), allowed);
    return runs;
}

void RunRecord::write(const PastRuns& runs, DataModel& model)
{
    removeReadable(model, PropertyKey::EarlierRuns);
    removeReadable(model, PropertyKey::DoneRuns);
    if (!runs.isEmpty() && !model.hasProperty(PropertyKey::DoneRuns))
        model.setProperty(PropertyKey::DoneRuns, Variant(runs.toBytes()));
}

void RunRecord::addRun(DataModel& model, const FrameRange& allowed)
{
    PastRuns runs = notedIn(model).value_or(noRuns(model.settings()));
    const bool isGiven = ProtectedRun::sourceOf(model) == ProtectedRun::Source::Given;
    const EventList none;
    runs.add(isGiven ? none : model.oldEdl(), isGiven ? none : model.newEdl(), model.changeEdl(), allowed);
    write(runs, model);
}

std::optional<std::int32_t> NextRun::firstDifference(const PastRuns& runs) const
{
    if (m_source == ProtectedRun::Source::Given)
        return std::nullopt;
    return runs.firstDifference(m_model.oldEdl(), readFrames());
}

bool NextRun::hasBeenDone(const PastRuns& runs) const
{
    return runs.haveCarriedOut(m_model.changeEdl(), m_source == ProtectedRun::Source::Given,
                               RunRecord::allowedBy(m_model.settings()));
}

/// What the run may change, and where that comes from.
FrameRanges NextRun::readFrames() const
{
    const FrameRange allowed = RunRecord::allowedBy(m_model.settings());
    FrameRanges frames{allowed};
    if (allowed == PastRuns::AllTime)
        return frames;
    for (const auto& event : m_model.changeEdl().events()) {
        if (const auto stretch = changeStretchOf(*event, Timecode::framerate()))
            frames.push_back(intersect(stretch->destination, allowed).shiftedBy(-stretch->shift));
    }
    return united(std::move(frames));
}

} // namespace cadrel::core
