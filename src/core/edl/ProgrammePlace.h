// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>

namespace cadrel::core {

class EventBase;
class EventList;
struct Framerate;

/// Whether the place of an event in its programme could be read and makes sense, whatever its source.
bool hasPlace(const EventBase& event, const Framerate& framerate);

/// Whether an event fills a part of the programme with picture, black or not, whatever else is wrong with it.
bool fillsProgramme(const EventBase& event, const Framerate& framerate);

/// Whether an event is on the roll that stands for black in every edit decision list, "BL" or "BLACK" in any letters.
bool isBlack(const EventBase& event);

/// The outgoing side of a transition in two lines, which share their number: the event before that at `index`. Null when
/// there is none.
const EventBase* outgoingOf(const EventList& events, std::size_t index);

} // namespace cadrel::core
