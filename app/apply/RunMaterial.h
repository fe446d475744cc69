// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/project/ProjectContent.h"
#include "core/time/SecondsRange.h"

#include <cstdint>
#include <optional>
#include <vector>

namespace cadrel::core {
class Settings;
} // namespace cadrel::core

namespace cadrel::app {

/// What stands in a project and can be changed by a run, or tells which picture the project belongs to.
class RunMaterial {
public:
    /// Both outlive this.
    RunMaterial(const standin::Project& project, const core::Settings& settings)
        : m_project(project), m_settings(settings)
    {
    }

    /// The clips, markers and automation points on the tracks that a run changes, in seconds of the project's clock; an
    /// instant begins where it ends. What runs have marked themselves is left out, since each run marks anew.
    std::vector<core::SecondsRange> stretches() const;
    /// The clips on all audio tracks, locked ones too, in the same seconds.
    std::vector<core::SecondsRange> sound() const;
    /// Whether there is a track that a run can change at all.
    bool hasTracks() const;

private:
    const standin::Project& m_project;
    const core::Settings& m_settings;
};

/// For which markers the track is, as TrackRole numbers them; nothing for a track of the user's own.
std::optional<std::int64_t> markerRoleOf(const standin::Track& track);

/// Whether runs write markers on the track: true for all of Cadrel's marker tracks except the one for the user's memos.
bool isMarkedByRuns(const standin::Track& track);

} // namespace cadrel::app
