// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/track/TrackRole.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/MediaClip.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/host/TrackHost.h"
#include "velmark/Attributes.h"
#include "velmark/Events.h"

#include <cstdint>

namespace cadrel::host::tests {

/// A host whose project has tracks of picture.
class VideoHost : public TrackHost {
public:
    using TrackHost::TrackHost;

    Node addVideoTrack(const char16_t* name) { return addTrack(Velmark::TypeWord::Video, name); }
    Node addVideoTrack(const char16_t* name, std::int32_t role)
    {
        const Node node = addVideoTrack(name);
        handle(node).setRole(role);
        return node;
    }
    /// An event that plays a video; in seconds of the project, but for the offset into the video.
    Node addVideoEvent(const Node& track, standin::MediaClip& video, double start, double end, double offset = 0.0)
    {
        const Node node = addClip(track, u"picture", start, end);
        auto& event = dynamic_cast<standin::ClipEvent&>(*node);
        event.setClip(Velmark::Counted<standin::MediaClip>::share(&video));
        event.setSourceOffset(offset);
        return node;
    }
    /// A time of the project by its clock.
    double clock(double seconds) const { return seconds + origin; }

    cadrel::tests::TestProject timecodes;
};

} // namespace cadrel::host::tests
