// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/Event.h"
#include "standin/project/MediaClip.h"

namespace standin {

/// An event that plays a clip of the media pool.
class ClipEvent : public Velmark::Implements<ClipEvent, Event, Velmark::IClipEvent> {
public:
    static constexpr const char* ClassName = "ClipEvent";

    Velmark::IMediaClip* getClip() override;
    /// Refuses a clip that isn't one of this host's.
    Velmark::int32 setClip(Velmark::IMediaClip* clip, Velmark::int32 flags) override;
    double getSourceOffset(Velmark::FUnknown* container) override;

    /// Null when there is none.
    MediaClip* clip() const { return m_clip.get(); }
    void setClip(Velmark::Counted<MediaClip> clip);
    /// Seconds into the clip.
    double sourceOffset() const { return m_sourceOffset; }
    void setSourceOffset(double seconds);

protected:
    Velmark::Counted<Event> makePiece(double offset, double length) const override;
    bool sourceRunsOn(const Event& next) const override;

private:
    Velmark::Counted<MediaClip> exchangeClip(Velmark::Counted<MediaClip> clip);
    double exchangeSourceOffset(double seconds);

    Velmark::Counted<MediaClip> m_clip;
    double m_sourceOffset = 0.0;
};

} // namespace standin
