// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/picture/FrameRange.h"
#include "velmark/FUnknown.h"

#include <optional>

namespace cadrel::host {

class Project;

/// The end that a session has of its own, be it at the end of the last clip or after it. It comes to be as much later or
/// earlier as the end of the programme that a run makes. It stands in an attribute, and so comes and goes with the run's
/// entry of the undo list. A project without that attribute ends with what stands in it.
///
///     before    |== old cut ==|  tail  |end
///     after     |== new cut =====|  tail  |end
class SessionEnd {
public:
    /// Before the run, once the project has a preview offset. The project outlives it.
    explicit SessionEnd(Project& project);

    /// After the run, within its transaction. By how much it moves, both cuts tell and, where there is only a change list,
    /// the last clip. It stays where the programme ends outside of what the user lets change. Throws
    /// Result::HostCallFailed.
    void follow(const core::FrameRange& allowed) const;

private:
    /// Of the last clip before the preview stretch, in seconds.
    double soundEnd() const;
    /// How many seconds later the programme ends.
    double shift(const core::FrameRange& allowed) const;

    Project& m_project;
    std::optional<Velmark::int64> m_end; ///< in nanoseconds
    double m_soundEnd = 0.0;             ///< before the run
};

} // namespace cadrel::host
