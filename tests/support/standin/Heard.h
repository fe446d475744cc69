// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/ClipEvent.h"
#include "standin/project/Marker.h"
#include "standin/project/Track.h"
#include "velmark/String.h"

#include <algorithm>
#include <cmath>
#include <map>
#include <optional>
#include <ostream>
#include <string>
#include <tuple>
#include <vector>

// What a listener hears of a project, for laws that compare it before and after an edit.

namespace standin::tests {

/// A track, an event or a part as what holds others.
inline const Container& insideOf(const Node& node)
{
    return static_cast<const Container&>(node);
}

/// All times at which something happens on a track: starts and ends at any depth, and points. In seconds of the project.
inline void collectTimes(const Container& container, std::vector<double>& times)
{
    for (const Node* child = container.firstChild(); child; child = container.childBehind(*child)) {
        times.push_back(child->absoluteStart());
        times.push_back(child->absoluteEnd());
        collectTimes(insideOf(*child), times);
    }
}

inline std::vector<double> timesOf(const std::vector<Track*>& tracks)
{
    std::vector<double> times;
    for (const Track* const track : tracks) {
        collectTimes(*track, times);
        for (const auto& [number, curve] : track->curves()) {
            for (const Node* point = curve->firstChild(); point; point = curve->childBehind(*point))
                times.push_back(point->start());
        }
    }
    return times;
}

/// Something that sounds or is shown at an instant: what it is, and how far into its media.
using Sounding = std::tuple<const MediaClip*, std::u16string, double>;

inline void collectSounding(const Container& container, double time, std::vector<Sounding>& sounding)
{
    for (const Node* child = container.firstChild(); child; child = container.childBehind(*child)) {
        if (!(child->start() < time && time < child->end()))
            continue;
        if (const auto* const clip = dynamic_cast<const ClipEvent*>(child))
            sounding.emplace_back(clip->clip(), clip->name(), clip->sourceOffset() + (time - clip->start()));
        else if (dynamic_cast<const Marker*>(child))
            sounding.emplace_back(nullptr, child->name(), 0.0);
        collectSounding(insideOf(*child), time - child->start(), sounding);
    }
}

/// All that a listener hears of a track at an instant at which no event and no point begins or ends.
struct Heard {
    std::vector<Sounding> sounding;
    std::map<Velmark::int32, double> values; ///< of the curves that have points

    static Heard at(const Track& track, double time)
    {
        Heard heard;
        collectSounding(track, time, heard.sounding);
        std::ranges::sort(heard.sounding);
        for (const auto& [number, curve] : track.curves()) {
            if (const std::optional<double> value = curve->valueBehind(time))
                heard.values[number] = *value;
        }
        return heard;
    }

    friend bool operator==(const Heard& a, const Heard& b)
    {
        const auto isNear = [](double x, double y) { return std::abs(x - y) < 1e-6; };
        return std::ranges::equal(a.sounding, b.sounding,
                                  [&](const Sounding& x, const Sounding& y) {
                                      return std::get<0>(x) == std::get<0>(y) && std::get<1>(x) == std::get<1>(y) &&
                                             isNear(std::get<2>(x), std::get<2>(y));
                                  }) &&
               std::ranges::equal(a.values, b.values, [&](const auto& x, const auto& y) {
                   return x.first == y.first && isNear(x.second, y.second);
               });
    }
};

/// For a law that is broken.
inline std::ostream& operator<<(std::ostream& out, const Heard& heard)
{
    for (const auto& [clip, name, position] : heard.sounding)
        out << Velmark::ConstString(name.c_str()).text8() << " from " << position << "; ";
    for (const auto& [curve, value] : heard.values)
        out << "curve " << curve << " at " << value << "; ";
    return out;
}

/// Instants between the given times, each well away from all of them.
inline std::vector<double> instantsBetween(std::vector<double> times)
{
    std::ranges::sort(times);
    std::vector<double> instants;
    for (std::size_t index = 1; index < times.size(); ++index) {
        if (times[index] - times[index - 1] > 1e-4)
            instants.push_back((times[index - 1] + times[index]) / 2.0);
    }
    return instants;
}

} // namespace standin::tests
