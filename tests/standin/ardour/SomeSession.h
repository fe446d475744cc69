// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/standin/ardour/SessionText.h"

#include <rapidcheck.h>

#include <string>

namespace standin::tests {

/// Fades that a user may have drawn, or none, which don't overlap.
inline std::string someFades(int firstId, long length)
{
    if (length < 2 || *rc::gen::arbitrary<bool>())
        return std::string();
    const auto fade = [&firstId](const std::string& name, long samples, const std::string& from,
                                 const std::string& to) {
        return "<" + name + "><AutomationList id=\"" + std::to_string(firstId++) +
               "\" interpolation-style=\"Curved\"><events>a0 " + from + "\na" + std::to_string(samples * 5880) + " " +
               to + "</events></AutomationList></" + name + ">";
    };
    const long in = *rc::gen::inRange(1L, length);
    return fade("FadeIn", in, "0", "1") + fade("FadeOut", length - in, "1", "0");
}

/// A session of 29.97 frames a second with regions that may overlap, with automation, marks and ranges, none of them at a frame.
inline SessionText someSession()
{
    SessionText text{.timecode = "timecode_2997"};
    const int count = *rc::gen::inRange(0, 6);
    for (int id = 0; id < count; ++id) {
        const long length = *rc::gen::inRange(1, 200000);
        text.regions += region(100 + id, *rc::gen::inRange(0, 400000), length, *rc::gen::inRange(0, 5000),
                               someFades(300 + 4 * id, length));
    }
    long time = *rc::gen::inRange(0, 1000);
    std::string points;
    std::string steps;
    for (int point = *rc::gen::inRange(0, 6); point > 0; --point) {
        const std::string at = std::string("a").append(std::to_string(time * 5880)).append(" ");
        points.append(at).append(std::to_string(*rc::gen::inRange(0, 8) * 0.25)).append("\n");
        steps.append(at).append(std::to_string(*rc::gen::inRange(0, 3))).append("\n");
        time += *rc::gen::inRange(2000, 100000);
    }
    if (!points.empty())
        text.route = gain(points) + list("mute", "Discrete", steps);
    for (int id = *rc::gen::inRange(0, 4); id > 0; --id) {
        const long start = *rc::gen::inRange(0, 400000);
        const bool isRange = *rc::gen::arbitrary<bool>();
        text.locations +=
            location(200 + id, std::string("m").append(std::to_string(id)), start,
                     isRange ? start + *rc::gen::inRange(1, 100000) : start, isRange ? "IsRangeMarker" : "IsMark");
    }
    return text;
}

} // namespace standin::tests
