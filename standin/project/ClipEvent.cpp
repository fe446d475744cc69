// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/ClipEvent.h"

#include <cmath>

using namespace Velmark;

namespace standin {

IMediaClip* ClipEvent::getClip()
{
    return m_clip.get();
}

int32 ClipEvent::setClip(IMediaClip* clip, int32 /*flags*/)
{
    auto* const ours = dynamic_cast<MediaClip*>(clip);
    if (clip && (!ours || !ours->project() || !canBelongTo(*ours->project())))
        return ResultFalse;
    setClip(Counted<MediaClip>::share(ours));
    return ResultOk;
}

double ClipEvent::getSourceOffset(FUnknown* /*container*/)
{
    return m_sourceOffset;
}

void ClipEvent::setClip(Counted<MediaClip> clip)
{
    if (clip != m_clip)
        change(*this, &ClipEvent::exchangeClip, std::move(clip));
}

void ClipEvent::setSourceOffset(double seconds)
{
    if (seconds != m_sourceOffset)
        change(*this, &ClipEvent::exchangeSourceOffset, seconds);
}

Counted<Event> ClipEvent::makePiece(double offset, double /*length*/) const
{
    auto piece = makeCounted<ClipEvent>();
    piece->m_clip = m_clip;
    piece->m_sourceOffset = m_sourceOffset + offset;
    return piece;
}

bool ClipEvent::sourceRunsOn(const Event& next) const
{
    const auto& clipEvent = static_cast<const ClipEvent&>(next);
    return m_clip == clipEvent.m_clip && std::abs(m_sourceOffset + length() - clipEvent.m_sourceOffset) < SameInstant;
}

Counted<MediaClip> ClipEvent::exchangeClip(Counted<MediaClip> clip)
{
    std::swap(m_clip, clip);
    markContentChanged();
    return clip;
}

double ClipEvent::exchangeSourceOffset(double seconds)
{
    std::swap(m_sourceOffset, seconds);
    markContentChanged();
    return seconds;
}

} // namespace standin
