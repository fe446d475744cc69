// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace cadrel::core {
class DataModel;
} // namespace cadrel::core

namespace cadrel::gui {

/// What the user is asked before a run that doesn't go on from where the runs before it have left the sound.
namespace RepeatQuestion {

/// In the user's language; empty where nothing is to be asked. Of a project in which no run was noted nothing is known.
std::wstring text(const core::DataModel& model);

} // namespace RepeatQuestion

} // namespace cadrel::gui
