// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"

#include <memory>

namespace cadrel::core {
class DataModel;
} // namespace cadrel::core

namespace cadrel::app {

/// The events that a generation fails on: one of the new list, one of the old list, or one of each that can't be
/// brought together.
struct GenerationFailure {
    std::shared_ptr<core::EventBase> newEvent; ///< null when the old event alone fails
    std::shared_ptr<core::EventBase> oldEvent; ///< null when the new event alone fails
};

/// Finds the events by generating from ever shorter beginnings of the two lists, with the settings of the model, which
/// stays as it is. Both are null when the generation doesn't fail at all.
GenerationFailure findGenerationFailure(const core::DataModel& model);

} // namespace cadrel::app
