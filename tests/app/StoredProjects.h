// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"
#include "tests/support/standin/RandomProject.h"

#include <cstdint>
#include <filesystem>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

namespace cadrel::tests {

/// The tracks of a project file, at the top level.
nlohmann::json tracksIn(const std::filesystem::path& project);
/// The track of that name there; null without one.
nlohmann::json trackIn(const std::filesystem::path& project, const std::string& name);

/// A random project at that rate, as it is stored.
std::string randomProjectText(std::uint64_t seed, const core::Framerate& framerate,
                              const standin::tests::ProjectScale& scale = {});

/// The value of a curve at a time, straight between its points.
double valueAt(const nlohmann::json& points, double time);

/// The tracks of a project whose content a run may change, those in folders too; without those that runs write on.
std::vector<nlohmann::json> changeableTracks(const nlohmann::json& tracks);

double endOf(const nlohmann::json& event);
/// Whether a list holds the event, as much later as `shift`; 0 means to the last bit.
bool holds(const nlohmann::json& events, const nlohmann::json& event, double shift);

} // namespace cadrel::tests
