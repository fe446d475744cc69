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

/// What is to become of a generation after a failure: it throws, or goes on without what failed.
enum class FailureAnswer { Stop, PassOver };

/// Is told the events of a failure, and says how to go on. An event that fails alone takes no part then. Of two that can't
/// be brought together, each is still matched with other events.
using GenerationFailureListener = std::function<FailureAnswer(const GenerationFailure&)>;

} // namespace cadrel::core
