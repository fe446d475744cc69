// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace cadrel::core {
class DataModel;
} // namespace cadrel::core

namespace cadrel::gui {

/// The settings that shape a change EDL: what names are compared, how it is healed, and how VFX shots are named. A model keeps
/// those that its list was generated with, so that the user is told when others would give another list.
namespace GenerationSettings {

/// Keeps the present ones. It belongs to the undo entry of the generation.
void keep(core::DataModel& model);
/// Whether there is a change EDL that was generated with others than the present ones.
bool haveChanged(const core::DataModel& model);

} // namespace GenerationSettings

} // namespace cadrel::gui
