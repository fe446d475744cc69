// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <string>

namespace cadrel::core {
class DataModel;
class EventList;
} // namespace cadrel::core

namespace cadrel::gui {

/// What the buttons of the window do to the three lists of a model. Each is one entry of the undo list. A preview has to be
/// ended before.
namespace CutCommands {

void clear(core::DataModel& model, std::int32_t listKind);
/// Makes the change EDL of the two cuts. Events that can't be matched are passed over. Returns what the user is to be told,
/// in his language; empty when all went well.
std::wstring generate(core::DataModel& model);
/// Why the VFX names of the settings can't be used, in the user's language; empty when they can.
std::wstring obstacleOfNames(const core::DataModel& model);
/// The same where a run has to compare the names of two cuts.
std::wstring obstacleOfRun(const core::DataModel& model);

} // namespace CutCommands

} // namespace cadrel::gui
