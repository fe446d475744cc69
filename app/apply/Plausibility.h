// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/console/Failure.h"
#include "core/picture/FrameRange.h"
#include "core/time/Framerate.h"

#include <optional>
#include <string>

namespace cadrel::core {
class DataModel;
class NextRun;
class PastRuns;
} // namespace cadrel::core

namespace standin {
class Project;
} // namespace standin

namespace cadrel::app {

/// Looks for what shows that the files of a run don't belong together. Nothing is an error by itself, so that the user can
/// go on.
class Plausibility {
public:
    /// The model holds both cuts; all outlive this. `inputs` names the EDLs.
    Plausibility(const core::DataModel& model, const std::string& projectFile, const std::string& inputs);

    /// Whether the sound stands in another cut than the old one given.
    std::optional<Failure> doubtOfLastCut(const core::NextRun& next, const core::PastRuns& runs) const;
    /// Whether the change EDL has been carried out already.
    std::optional<Failure> doubtOfChanges(const core::NextRun& next, const core::PastRuns& runs) const;
    /// Whether the two cuts have no name in common.
    std::optional<Failure> doubtOfNames() const;
    /// Whether less than half of the old cut has any sound.
    std::optional<Failure> doubtOfSound(const standin::Project& project) const;
    /// Whether less than half of the old cut survives; `sources` is what does.
    std::optional<Failure> doubtOfSurvival(const core::FrameRanges& sources) const;

    /// Names that say nothing of the material.
    struct DullNames {
        Failure warning;
        std::string summary; ///< what the match rests on
    };
    std::optional<DullNames> dullNames() const;

private:
    std::string length(std::int32_t frames) const;

    const core::DataModel& m_model;
    const std::string& m_projectFile;
    const std::string& m_inputs;
    core::Framerate m_framerate;
    core::FrameRanges m_oldPicture;
};

} // namespace cadrel::app
