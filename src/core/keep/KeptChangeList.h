// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/keep/KeepPlan.h"

#include <cstdint>

namespace cadrel::core {

class EventList;
struct Framerate;

/// The events of a plan as a change EDL, numbered from 1. An event of several parts is a healed one with the parts as its
/// members; a part bears the names of the new event that it shows, and "Black" where it shows none. Throws
/// Result::NotAvailable without a string converter or a provider of the frame rate.
EventList keptChangeList(const KeepPlan& plan, const EventList& newEvents, std::int32_t matchBy,
                         const Framerate& framerate);

/// The hull in seconds, as Settings::setPreserveMaterial takes it. The plan needs a run.
SecondsRange hullSeconds(const KeepPlan& plan, const Framerate& framerate);

} // namespace cadrel::core
