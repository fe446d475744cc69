// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"
#include "core/time/Timecode.h"

#include <array>
#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace cadrel::gui {

/// The edit of one event's four timecodes. Each of them has a tick box: only a ticked timecode can change, and two that
/// are ticked keep their distance. All of it happens on a copy, and the event stays as it is until apply().
class EventEdit {
public:
    enum Place : std::size_t { SrcIn = 0, SrcOut = 1, DstIn = 2, DstOut = 3 };
    static constexpr std::size_t PlaceCount = 4;
    /// No more boxes can be ticked than these.
    static constexpr std::size_t MostTicks = 2;

    /// SRC IN and SRC OUT are ticked at first. With `isSingle`, one box may remain ticked alone, otherwise there are
    /// always two. The event must not be null.
    EventEdit(std::shared_ptr<core::EventBase> event, bool isSingle);

    const std::shared_ptr<core::EventBase>& event() const { return m_event; }
    /// The clip name, a blank and the roll name, in the bytes of the EDL.
    std::string name() const;
    /// The timecode as it has become.
    const core::Timecode& timecode(std::size_t place) const;
    /// The motion speed as it has become, with two decimals: "1.00x".
    std::string speedText() const;
    /// Why the timecodes can't be used, an EventFlaw: first of all an IN that lies after its OUT.
    std::optional<std::int32_t> flaw() const;

    bool isTicked(std::size_t place) const;
    /// Ticks a box, or takes its tick away unless too few would remain. The oldest tick makes room for a third one.
    void click(std::size_t place);
    /// Changes a timecode and moves the other ticked one by as much. False, with nothing changed, when its box isn't
    /// ticked or the other one would leave the day. Where one of the two had no usable value, there is no distance to
    /// keep, and the timecode changes alone.
    bool change(std::size_t place, const core::Timecode& timecode);

    /// Whether the timecodes differ from those of the event.
    bool isChanged() const { return !m_event->hasSameTimecodes(m_workingCopy); }
    /// False as long as an IN lies after its OUT.
    bool canApply() const { return !isInAfterOut(); }
    /// Gives the event its new timecodes, as one entry in the undo list; without a change it does nothing. Throws what
    /// the host's undo list throws, with the event as it was.
    void apply();

private:
    using Timecodes = std::array<core::Timecode, PlaceCount>;

    Timecodes timecodes() const;
    bool isInAfterOut() const;
    /// The other ticked place, to which there is a distance to keep.
    std::optional<std::size_t> partnerOf(std::size_t place) const;

    std::shared_ptr<core::EventBase> m_event;
    core::EventBase m_workingCopy;
    std::array<bool, PlaceCount> m_isUsable; ///< whether the timecode was ever set to what exists at the project's rate
    std::size_t m_fewestTicks;
    std::vector<std::size_t> m_tickOrder; ///< the ticked boxes, oldest first
};

} // namespace cadrel::gui
