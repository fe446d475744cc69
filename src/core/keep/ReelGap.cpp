// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/ReelGap.h"

#include <algorithm>

namespace cadrel::core {

ReelGap::ReelGap(const FrameRange& frames, bool hasReelBefore, bool hasReelAfter, std::int32_t partingGap)
    : m_frames(frames), m_hasReelBefore(hasReelBefore), m_hasReelAfter(hasReelAfter), m_partingGap(partingGap),
      m_reachFromBefore(frames.start), m_reachFromAfter(frames.end), m_startOfWhole(frames.end)
{
}

void ReelGap::add(const FrameRange& piece)
{
    const FrameRange part = intersect(piece, m_frames);
    if (part.isEmpty())
        return;
    if (spans(piece, part))
        addSpanning(part);
    else if (m_joining.empty() || m_joining.back() != part)
        m_joining.push_back(part);
}

ReelGap::Parts ReelGap::parts(bool keepsLength) const
{
    Parts parts;
    parts.withEnd = {m_frames.start, m_frames.start};
    parts.withStart = {m_frames.end, m_frames.end};
    bool isJoined = m_startOfWhole != m_frames.end;
    for (const FrameRange& block : joinedWithin(m_partingGap, m_joining)) {
        isJoined = isJoined || (touchesEnd(block) && touchesStart(block));
        if (touchesEnd(block))
            parts.withEnd.end = block.end;
        else if (touchesStart(block))
            parts.withStart.start = block.start;
        else
            parts.staying.push_back(block);
    }
    if (isJoined && keepsLength && parts.staying.empty())
        parts.withEnd = m_frames;
    placeSpanning(parts);
    return parts;
}

// The blocks have their place. The clips that span go with the reel that they touch up to the first block that stays, and
// stay from there on. One that touches both goes with the reel after again behind the last block that stays.
void ReelGap::placeSpanning(Parts& parts) const
{
    const bool isParted = !parts.staying.empty();
    const std::int32_t firstStop = isParted ? parts.staying.front().start : parts.withStart.start;
    const std::int32_t lastStop = isParted ? parts.staying.back().end : parts.withEnd.end;
    const std::int32_t fromAfter = isParted ? std::min(m_reachFromAfter, m_startOfWhole) : m_reachFromAfter;
    parts.spanningWithEnd = {parts.withEnd.end, std::min(m_reachFromBefore, firstStop)};
    parts.spanningWithStart = {std::max({fromAfter, lastStop, parts.spanningWithEnd.end}), parts.withStart.start};
    FrameRanges elsewhere = parts.staying;
    elsewhere.insert(elsewhere.end(), {parts.withEnd, parts.withStart, parts.spanningWithEnd, parts.spanningWithStart});
    parts.spanningStaying =
        without(united({{firstStop, m_reachFromBefore}, {fromAfter, lastStop}}), united(std::move(elsewhere)));
}

bool ReelGap::touchesEnd(const FrameRange& part) const
{
    return m_hasReelBefore && part.start - m_frames.start < m_partingGap;
}

bool ReelGap::touchesStart(const FrameRange& part) const
{
    return m_hasReelAfter && m_frames.end - part.end < m_partingGap;
}

/// Whether a clip joins two reels, or runs out of the picture of one so far that it may reach something else.
bool ReelGap::spans(const FrameRange& piece, const FrameRange& part) const
{
    const bool isLong = part.length() >= m_partingGap;
    const bool runsOut = m_hasReelBefore && piece.start < m_frames.start && isLong;
    const bool runsIn = m_hasReelAfter && piece.end > m_frames.end && isLong;
    return runsOut || runsIn || (touchesEnd(part) && touchesStart(part));
}

void ReelGap::addSpanning(const FrameRange& part)
{
    if (touchesEnd(part))
        m_reachFromBefore = std::max(m_reachFromBefore, part.end);
    else
        m_reachFromAfter = std::min(m_reachFromAfter, part.start);
    if (touchesEnd(part) && touchesStart(part))
        m_startOfWhole = std::min(m_startOfWhole, part.start);
}

} // namespace cadrel::core
