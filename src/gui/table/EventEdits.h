// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/table/EventRows.h"

namespace cadrel::core {
class CadrelerBase;
class DataModel;
class EventList;
} // namespace cadrel::core

namespace cadrel::gui {

/// The edits that an event table offers, by their ids in EventMenu. Each is made in three steps, and the first two call the
/// host: whoever makes it looks after each of them whether list and events are still there.
namespace EventEdits {

/// Ends a preview that is on, because it shows events of the list. The engine may be null. Throws what the engine throws.
void stopPreview(const core::DataModel& model, core::CadrelerBase* engine);
/// Makes the edit's entry of the undo list. What is changed from then on is undone with it.
void makeUndoEntry(int id);
/// Changes the list, which tells of it. `newList` is the new EDL, against which healing finds inserts. Throws what the list
/// throws; what was done until then stays.
void apply(int id, core::EventList& list, const core::EventList& newList, const EventRows::Events& events);

} // namespace EventEdits

} // namespace cadrel::gui
