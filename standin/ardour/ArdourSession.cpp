// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/ArdourSession.h"

#include "standin/project/Project.h"
#include "standin/project/Track.h"

#include <algorithm>
#include <string_view>

namespace standin {

bool hasKind(std::u16string_view location, std::u16string_view track)
{
    const auto small = [](char16_t letter) {
        return letter >= u'A' && letter <= u'Z' ? static_cast<char16_t>(letter - u'A' + u'a') : letter;
    };
    return std::ranges::equal(location.substr(0, track.size()), track, {}, small, small);
}

std::u16string ownLocationName(const std::u16string& track, const std::u16string& marker)
{
    const std::u16string name = marker.substr(0, marker.find_last_not_of(u' ') + 1);
    if (name.empty())
        return track;
    return hasKind(name, track) ? name : track + u": " + name;
}

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
