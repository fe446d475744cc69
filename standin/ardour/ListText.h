// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>
#include <vector>

namespace pugi {
class xml_node;
} // namespace pugi

namespace standin {

class SessionClock;

/// A point of an automation list: seconds from where the list begins, and the value as Ardour has it.
struct ListPoint {
    double seconds;
    double value;
    bool isMusical = false; ///< its time was told in beats
};

/// The points of an AutomationList. Throws FileFault for a list whose points can't be read or don't follow one another.
std::vector<ListPoint> readPoints(const pugi::xml_node& list, const SessionClock& clock);

/// Puts points in the place of those of the list, at whole samples. Of points at one sample the first stays, a hair before
/// it, and the last, which is the value from that sample on.
void writePoints(pugi::xml_node& list, const std::vector<ListPoint>& points, const SessionClock& clock);

} // namespace standin
