// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/CutEventBase.h"
#include "host/track/Track.h"

#include <string>

namespace cadrel::host {

class TrackIndexes;

/// What a change event does to one track of the host. The times are those of the project's clock.
class CutEvent : public core::CutEventBase {
public:
    /// The indexes, which have to outlive this, are those of the run.
    CutEvent(const Track& track, TrackIndexes& indexes);

    const Track& track() const { return m_track; }

    /// Answers what lies across an instant of the project's clock, and before and after it; it changes nothing. Throws
    /// Result::HostObjectMissing when the track has gone, Result::InvalidArgument where its events stand in no
    /// order.
    core::CutEventSpans update(double time) override;
    std::wstring getTrackName() override;
    bool isAudio() override;

private:
    Track m_track;
    TrackIndexes* m_indexes;
};

} // namespace cadrel::host
