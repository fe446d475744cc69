// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace cadrel::host {

/// What has become of the new video in a run or preview. Where nothing is written, the track of the new video keeps what
/// stands on it. Unless the user has locked it, the run or preview carries that over by the change list, as on any track.
enum class VideoWriting {
    Done,             ///< or there is nothing to write
    WithoutBeginning, ///< some of it would stand before the project begins, and is left out
    TrackLocked,      ///< by the user; nothing is written
    BeforeProject,    ///< all of it would stand before the project begins; nothing is written
    NoMediaPool,      ///< nothing is written
};

} // namespace cadrel::host
