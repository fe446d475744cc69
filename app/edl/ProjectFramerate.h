// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"
#include "core/time/FramerateProvider.h"

#include <array>
#include <optional>
#include <string>
#include <string_view>

namespace cadrel::app {

/// Takes the place of a project: while it lives, all timecodes are read at its rate.
class ProjectFramerate : public core::FramerateProvider {
public:
    /// The labels of all rates that a project can have.
    static constexpr std::array<std::string_view, 13> Labels{
        "23.98 fps", "24 fps",    "24.98 fps", "25 fps", "29.97 fps", "29.97 dfps", "30 fps",
        "30 dfps",   "47.95 fps", "48 fps",    "50 fps", "59.94 fps", "60 fps"};

    explicit ProjectFramerate(const core::Framerate& framerate);
    ProjectFramerate(const ProjectFramerate&) = delete;
    ProjectFramerate& operator=(const ProjectFramerate&) = delete;
    ~ProjectFramerate();

    core::Framerate getFramerate() const override { return m_framerate; }

    /// The rate that a file shows, as a project has it: an unknown drop-frame state counts as non-drop. Nothing when
    /// the file shows no rate.
    static std::optional<core::Framerate> fromShownRate(const core::Framerate& shown);
    /// The rate of one of the labels.
    static core::Framerate fromLabel(std::string_view label);
    /// The label that a user means, who may have left out "fps"; nothing when there is none.
    static std::optional<std::string> labelMeant(std::string_view text);
    /// The label of a rate of the table.
    static std::string labelOf(const core::Framerate& framerate);

private:
    core::Framerate m_framerate;
};

} // namespace cadrel::app
