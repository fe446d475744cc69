// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/ArdourSession.h"

#include "standin/base/Times.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "velmark/Attributes.h"

#include <algorithm>
#include <cmath>
#include <string_view>

namespace standin {

using Velmark::AttributeKey;

namespace {

constexpr double NanosecondsPerSecond = 1e9;

} // namespace

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

std::optional<double> sessionEnd(const Project& project)
{
    const auto found = project.attributes().find(AttributeKey::SessionEnd);
    if (found == project.attributes().end())
        return std::nullopt;
    const auto* const nanoseconds = std::get_if<Velmark::int64>(&found->second.value);
    const double end = nanoseconds ? static_cast<double>(*nanoseconds) / NanosecondsPerSecond : -1.0;
    return end >= 0.0 && end <= FurthestTime ? std::optional(end) : std::nullopt;
}

void setSessionEnd(Project& project, double seconds)
{
    const auto nanoseconds = static_cast<Velmark::int64>(std::round(seconds * NanosecondsPerSecond));
    project.setAttribute(AttributeKey::SessionEnd, Attribute{nanoseconds, false});
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
