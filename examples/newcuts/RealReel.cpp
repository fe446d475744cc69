// SPDX-License-Identifier: GPL-3.0-or-later

#include "examples/newcuts/RealReel.h"

#include "examples/newcuts/CutText.h"

#include <array>
#include <stdexcept>
#include <string>

namespace cadrel::examples {

namespace {

/// Frames that an event loses at its head and at its tail.
struct Trim {
    std::size_t event;
    int head;
    int tail;
};

constexpr std::array Trims{Trim{5, 0, 4},     Trim{11, 0, 14}, Trim{24, 6, 0},   Trim{33, 0, 9},   Trim{46, 12, 0},
                           Trim{53, 0, 30},   Trim{75, 0, 8},  Trim{111, 0, 23}, Trim{128, 5, 0},  Trim{130, 0, 7},
                           Trim{131, -7, 0},  Trim{152, 3, 0}, Trim{161, 0, 11}, Trim{175, 0, 10}, Trim{214, 8, 0},
                           Trim{225, 0, 5},   Trim{241, 4, 0}, Trim{340, 0, 6},  Trim{352, 9, 0},  Trim{371, 0, 12},
                           Trim{389, 0, -10}, Trim{440, 0, 5}, Trim{455, 7, 0},  Trim{505, 0, 18}, Trim{520, 24, 0},
                           Trim{533, 0, 3}};

/// Events whose layouts are drawn anew: "(LAY6)" becomes "(LAY8)".
constexpr std::array<std::size_t, 8> NewVersions{180, 188, 189, 191, 194, 201, 206, 207};

std::size_t at(std::size_t event)
{
    return event - 1;
}

void raiseVersion(Shot& shot)
{
    for (std::string& note : shot.notes) {
        const std::size_t start = note.find("(LAY");
        const std::size_t end = note.find(')', start);
        if (start != std::string::npos && end != std::string::npos) {
            const std::size_t digits = start + 4;
            note.replace(digits, end - digits, std::to_string(std::stoi(note.substr(digits, end - digits)) + 2));
            return;
        }
    }
    throw std::runtime_error(shot.roll + " has no version");
}

/// Plays the whole source of a shot at another speed.
void retime(Shot& shot, const std::string& clipName, int sourceFramesPerSecond)
{
    shot.length = shot.sourceLength * FramesPerSecond / sourceFramesPerSecond;
    shot.notes = {"M2   " + shot.roll + "       0" + std::to_string(sourceFramesPerSecond) + ".0                " +
                      timecodeOf(shot.srcIn),
                  "* FROM CLIP NAME:  " + clipName};
}

} // namespace

void makeRealReel(const std::filesystem::path& oldCut, const std::filesystem::path& newCut)
{
    CutText cut = CutText::read(oldCut);
    std::vector<Shot>& shots = cut.shots();
    for (const Trim& trim : Trims) {
        cut.trimHead(at(trim.event), trim.head);
        cut.trimTail(at(trim.event), trim.tail);
    }
    for (const std::size_t event : NewVersions)
        raiseVersion(shots.at(at(event)));
    Shot& other = shots.at(at(208));
    other = shotOf("Z682_210", "Z682_210B (LAY1)", framesOf("01:00:04:07"), other.length);
    retime(shots.at(at(491)), "Z694_202 (LAY7)", 30);

    // From the end to the start, so that the numbers are still those of the old cut.
    cut.dissolveTo(at(417), 24);
    Shot again = shots.at(at(302));
    again.srcIn += FramesPerSecond;
    again.length = again.sourceLength = 2 * FramesPerSecond;
    cut.insert(at(331), {again});
    cut.lift(at(327), 1);
    cut.lift(at(310), 1);
    cut.move(at(284), 9, at(267));
    cut.insert(at(251), {shotOf("Z688_802", "Z688_802A (LAY1)", framesOf("01:00:04:05"), 45)});
    cut.lift(at(196), 3);
    cut.insert(at(87), {shotOf("Z678_22D", "Z678_22D (LAY1)", framesOf("01:00:23:22"), 61),
                        shotOf("Z678_22E", "Z678_22E (LAY1)", framesOf("01:00:26:11"), 38)});
    cut.lift(at(60), 9);
    cut.write(newCut);
}

} // namespace cadrel::examples
