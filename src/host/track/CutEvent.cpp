// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/CutEvent.h"

#include "host/track/TrackIndexes.h"

namespace cadrel::host {

CutEvent::CutEvent(const Track& track, TrackIndexes& indexes) : m_track(track), m_indexes(&indexes) {}

core::CutEventSpans CutEvent::update(double time)
{
    const TrackIndex& index = m_indexes->of(m_track);
    core::CutEventSpans spans = index.spansAround(time);
    spans.automation = index.automationStateAt(time);
    return spans;
}

std::wstring CutEvent::getTrackName()
{
    return m_track.getName();
}

bool CutEvent::isAudio()
{
    return m_track.isAudio();
}

} // namespace cadrel::host
