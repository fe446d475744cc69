// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/ShownFrames.h"

#include "core/edl/EventBase.h"

namespace cadrel::gui {

std::optional<ShownFrames> ShownFrames::of(const std::vector<std::shared_ptr<core::EventBase>>& selected, bool isAtOut)
{
    if (selected.size() != 1 || selected.front()->hasFlaw(core::EventFlaw::TimecodeInvalid))
        return std::nullopt;
    const core::EventBase& event = *selected.front();
    return isAtOut ? ShownFrames{event.srcOut(), event.dstOut(), true}
                   : ShownFrames{event.srcIn(), event.dstIn(), false};
}

} // namespace cadrel::gui
