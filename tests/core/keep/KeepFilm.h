// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/keep/KeepPlanner.h"
#include "core/time/Framerate.h"
#include "core/time/SecondsRange.h"
#include "tests/core/picture/Film.h"

#include <cstdint>
#include <string>
#include <vector>

namespace cadrel::tests {

/// What the generator and the healing make of two cuts; nothing where they fail.
core::EventList generatedChanges(const core::EventList& oldEvents, const core::EventList& newEvents,
                                 std::int32_t matchBy, std::int32_t healMode, const core::Framerate& framerate);

/// The plan for two films, with the change EDL that is generated of them.
core::KeepPlan planFor(const Film& oldFilm, const Film& newFilm, const std::vector<core::SecondsRange>& material = {});

/// An event as "100..150 to 110..160: cut black", with the origins of its parts.
std::string lineOf(const core::KeptEvent& event);
std::vector<std::string> linesOf(const std::vector<core::KeptEvent>& events);
/// "100..110"; "none" for no run.
std::string hullOf(const core::KeepPlan& plan);

} // namespace cadrel::tests
