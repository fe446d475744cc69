// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/ArdourSession.h"

#include "standin/project/Project.h"
#include "standin/project/Track.h"

#include <algorithm>

namespace standin {

double contentEnd(const Project& project)
{
    double latest = 0.0;
    for (const Track* const track : project.allTracks()) {
        if (track->kind() == Track::Kind::Audio)
            latest = std::max(latest, track->contentEnd());
    }
    return latest;
}

SessionId attributeId(const Node& node, const char* key)
{
    const auto found = node.attributes().find(key);
    if (found == node.attributes().end())
        return 0;
    const auto* const id = std::get_if<Velmark::int64>(&found->second.value);
    return id ? *id : 0;
}

} // namespace standin
