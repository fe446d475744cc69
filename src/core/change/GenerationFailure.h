// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <functional>
#include <memory>

namespace cadrel::core {

class EventBase;

/// The events on which a generation fails: one of the old list, one of the new list, or one of each that can't be
/// brought together. They are the very events of the lists that were given.
struct GenerationFailure {
    std::shared_ptr<EventBase> oldEvent; ///< null when the new event alone fails
    std::shared_ptr<EventBase> newEvent; ///< null when the old event alone fails
};

/// Is told the events of a failure before the failure itself is thrown.
using GenerationFailureListener = std::function<void(const GenerationFailure&)>;

} // namespace cadrel::core
