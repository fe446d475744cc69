// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/ClipEvent.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "velmark/Counted.h"

#include <string>

namespace standin::tests {

/// Adds audio tracks with so many clips on each, one a second, with names.
inline void addManyClips(Project& project, int tracks, int clips)
{
    for (int number = 0; number < tracks; ++number) {
        const auto track = Track::create(Track::Kind::Audio);
        const std::string trackName = "DIA " + std::to_string(number + 1);
        track->setName(std::u16string(trackName.begin(), trackName.end()));
        for (int at = 0; at < clips; ++at) {
            const auto clip = Velmark::makeCounted<ClipEvent>();
            const std::string name = "clip " + std::to_string(at);
            clip->setName(std::u16string(name.begin(), name.end()));
            clip->setSpan(at, at + 1.0);
            clip->insertInto(*track);
        }
        track->insertInto(project);
    }
}

} // namespace standin::tests
