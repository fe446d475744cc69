// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notes/Programme.h"

namespace cadrel::core {

/// What an event shows, before it is known which part of it is seen.
class EventPicture {
public:
    /// For the event at `index`, which has a place in the programme. `before` is what is seen right before it, or null; it is
    /// the outgoing side of a transition in one line where it ends there.
    EventPicture(const EventList& events, std::size_t index, const EventBase* before, const PictureRules& rules,
                 TextNumbers& numbers);

    /// Where its transition ends, from its first frame; 0 without one.
    std::int32_t transitionLength() const { return m_transition ? m_transitionLength : 0; }
    /// What is seen of the transition, or of the rest, from the frame `from` of the event. `start` and `length` are left
    /// to the caller.
    ShownRun runFrom(std::int32_t from) const;

private:
    struct Material {
        std::int32_t number;
        std::int32_t version;
        double source; ///< in frame 0 of the event
        double sourceStep;
    };

    std::int32_t m_event;
    std::int32_t m_name;       ///< without its version
    std::int32_t m_length = 0; ///< of the event in frames
    Material m_body;
    std::optional<Material> m_transition;
    std::int32_t m_transitionLength = 0;
};

/// Whether the speeds of two events may be one, since the timecodes that they come from are rounded to whole frames. The
/// lengths are those of the events in frames; the longer one tells the speed more exactly.
bool canBeSameSpeed(double a, std::int32_t lengthOfA, double b, std::int32_t lengthOfB);

/// Whether an event shows a single frame of its source in all of its frames.
bool isFreeze(const EventBase& event, const Framerate& framerate);

/// Whether a name tells nothing of the material.
bool tellsNothing(const std::string& name);

} // namespace cadrel::core
