// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/ShellLayout.h"

#include <algorithm>

namespace desktop {

ShellLayout ShellLayout::of(int height, int wantedTracks)
{
    ShellLayout layout;
    layout.tracksTop = MenuHeight + TabHeight;
    const int room = std::max(0, height - layout.tracksTop - DividerHeight);
    const int usual = std::max(std::min(UsualTracksHeight, room / UsualTracksPart), room - WantedModuleHeight);
    const int most = std::max(LeastTracksHeight, room - LeastModuleHeight);
    const int tracks = std::clamp(wantedTracks < 0 ? usual : wantedTracks, LeastTracksHeight, most);
    layout.tracksHeight = std::min(tracks, room);
    layout.dividerTop = layout.tracksTop + layout.tracksHeight;
    layout.moduleTop = layout.dividerTop + DividerHeight;
    layout.moduleHeight = room - layout.tracksHeight;
    return layout;
}

} // namespace desktop
