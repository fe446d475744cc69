// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/picture/FrameRange.h"
#include "velmark/FUnknown.h"

#include <cstdint>
#include <optional>

namespace cadrel::host {

class Project;

/// The end that a session has of its own, be it at the end of the last clip or after it. It comes to be as much later or
/// earlier as the end of the programme that a run makes. It stands in an attribute, and so comes and goes with the run's
/// entry of the undo list. A project without that attribute ends with what stands in it.
///
///     before    |== old cut ==|  tail  |end
///     after     |== new cut =====|  tail  |end
///
/// With a reel that begins after both cuts, and with a change list alone, it follows the last clip.
class SessionEnd {
public:
    /// Before the run, once the project has a preview offset. The project outlives it.
    explicit SessionEnd(Project& project);

    /// After the run, within its transaction. The end stays where the programme ends outside of what the user lets change, and
    /// where it has come with other tracks already, to another cut than the old one. Throws Result::HostCallFailed.
    void follow(const core::FrameRange& allowed) const;

private:
    /// Of the clips before the preview stretch, in seconds of the host.
    struct Sound {
        double lastStart = 0.0;
        double end = 0.0;
    };
    /// In frames of the timecode.
    struct CutEnds {
        std::int32_t before;
        std::int32_t after;
    };

    Sound sound() const;
    /// Nothing where the last clip tells how far the end goes.
    std::optional<CutEnds> cutEnds() const;
    void set(const char* key, Velmark::int64 value, bool isStored) const;
    /// By so many seconds.
    void moveBy(double seconds) const;

    Project& m_project;
    std::optional<Velmark::int64> m_end; ///< in nanoseconds of the host
    Sound m_sound;                       ///< before the run
};

} // namespace cadrel::host
