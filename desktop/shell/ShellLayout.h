// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace desktop {

/// How the height of the window is shared, from top to bottom: menu bar, tabs, tracks, divider, module's window. The user moves the
/// divider; until then the module's window has the height that it wants, as long as some tracks are seen.
struct ShellLayout {
    static constexpr int MenuHeight = 26;
    static constexpr int TabHeight = 28;
    static constexpr int DividerHeight = 7;
    static constexpr int WantedModuleHeight = 750;
    static constexpr int LeastModuleHeight = 200;
    static constexpr int LeastTracksHeight = 120;
    /// What the tracks have at least where the user hasn't moved the divider, but on a small screen no more than the given part.
    static constexpr int UsualTracksHeight = 260;
    static constexpr int UsualTracksPart = 4;

    int tracksTop = 0;
    int tracksHeight = 0;
    int dividerTop = 0;
    int moduleTop = 0;
    int moduleHeight = 0;

    /// `wantedTracks` is the height to which the user has dragged the tracks; below 0 for none. None is ever negative.
    static ShellLayout of(int height, int wantedTracks);
};

} // namespace desktop
