// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace cadrel::core {
class EventBase;
} // namespace cadrel::core

namespace cadrel::app {

/// "dissolve" or "wipe".
std::string transitionNameOf(const core::EventBase& event);

/// What is wrong with the duration of an event's transition, which isn't a flaw of the event: "the dissolve lasts 300 frames,
/// and the event only 240". Empty when nothing is. Under the provider's rate.
std::string transitionFaultOf(const core::EventBase& event);

} // namespace cadrel::app
