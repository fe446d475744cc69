// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"

#include <string_view>
#include <vector>

namespace cadrel::app {

/// How files for other programs name what an event is.

/// "plain" or "healed".
std::string_view kindWordOf(const core::EventBase& event);
/// "cut", "dissolve" or "wipe".
std::string_view transitionWordOf(const core::EventBase& event);
/// Such as "not-video-event", in the order of EventFlaw.
std::vector<std::string_view> flawWordsOf(const core::EventBase& event);

} // namespace cadrel::app
