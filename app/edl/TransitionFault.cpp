// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/TransitionFault.h"

#include "core/edl/EventBase.h"
#include "core/edl/ProgrammePlace.h"
#include "core/time/Timecode.h"

namespace cadrel::app {

using core::EventBase;
using core::Framerate;
using core::Timecode;
using core::TransitionType;

std::string transitionNameOf(const EventBase& event)
{
    return event.transitionType() == TransitionType::Wipe ? "wipe" : "dissolve";
}

std::string transitionFaultOf(const EventBase& event)
{
    const Framerate framerate = Timecode::framerate();
    if (!event.isTransition() || !fillsProgramme(event, framerate))
        return {};
    const std::int32_t length = event.dstOut().toFrameCount(framerate) - event.dstIn().toFrameCount(framerate);
    if (event.transitionDuration() <= length)
        return {};
    return "the " + transitionNameOf(event) + " lasts " + std::to_string(event.transitionDuration()) +
           " frames, and the event only " + std::to_string(length);
}

} // namespace cadrel::app
