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

void readProperty(const DataModel& model, PropertyKey::Type key, PastRuns& runs)
{
    Variant stored;
    if (model.getProperty(key, stored) == Result::Ok)
        runs.read(stored.toText());
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
    PastRuns runs = noRuns(model.settings());
    readProperty(model, PropertyKey::DoneRuns, runs);
    return runs.isEmpty() ? std::nullopt : std::optional(std::move(runs));
}

PastRuns RunRecord::findOrGuess(const DataModel& model, const FrameRange& allowed)
{
    if (std::optional<PastRuns> noted = find(model))
        return *std::move(noted);
    PastRuns runs = noRuns(model.settings());
    readProperty(model, PropertyKey::EarlierRuns, runs);
    runs.add(model.oldEdl(), model.newEdl(), model.changeEdl(), allowed);
    return runs;
}

void RunRecord::write(const PastRuns& runs, DataModel& model)
{
    model.removeProperty(PropertyKey::EarlierRuns);
    if (runs.isEmpty())
        model.removeProperty(PropertyKey::DoneRuns);
    else
        model.setProperty(PropertyKey::DoneRuns, Variant(runs.toBytes()));
}

void RunRecord::addRun(DataModel& model, const FrameRange& allowed)
{
    try {
        PastRuns runs = find(model).value_or(noRuns(model.settings()));
        const bool isGiven = ProtectedRun::sourceOf(model) == ProtectedRun::Source::Given;
        const EventList none;
        runs.add(isGiven ? none : model.oldEdl(), isGiven ? none : model.newEdl(), model.changeEdl(), allowed);
        write(runs, model);
    } catch (Result::Type) {
        model.removeProperty(PropertyKey::DoneRuns);
    }
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
