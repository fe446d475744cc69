// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/Result.h"

#include <cstdint>
#include <string>

namespace cadrel::core {
class ActionChangeContext;
} // namespace cadrel::core

namespace cadrel::gui {

/// What the answers of the engine tell the user, in his language. An empty text tells nothing.
namespace EngineAnswers {

/// Why the engine isn't ready for the action, a core::ActionChangeContext::Action.
std::wstring ofReadiness(util::Result::Type answer, std::int32_t action);
/// Why the action, or the way to its events, has been refused.
std::wstring ofRequest(util::Result::Type answer, std::int32_t action);
/// How a run or a preview has ended. One that the user has cancelled tells nothing.
std::wstring ofEnd(const core::ActionChangeContext& end);

} // namespace EngineAnswers

} // namespace cadrel::gui
