// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace cadrel::tests {

/// A project file with that rate and time origin, in seconds, without tracks.
inline std::string projectAt(double framesPerSecond, bool dropFrame, bool pulledDown, double origin)
{
    const auto word = [](bool value) { return std::string(value ? "true" : "false"); };
    return R"({"format": "stage", "version": 1, "framesPerSecond": )" + std::to_string(framesPerSecond) +
           R"(, "dropFrame": )" + word(dropFrame) + R"(, "pulledDown": )" + word(pulledDown) + R"(, "timeOrigin": )" +
           std::to_string(origin) + R"(, "end": 0, "position": 0, "leftLocator": 0, "rightLocator": 0,
           "cycleStart": 0, "cycleEnd": 0, "pool": [], "tracks": []})";
}

/// A project file of 24 frames a second that begins at midnight, with those tracks and further members of the project.
inline std::string projectWith(const std::string& tracks, const std::string& members = {})
{
    return R"({"format": "stage", "version": 1, "framesPerSecond": 24, "dropFrame": false, "pulledDown": false,
        "timeOrigin": 0, "end": 60, "position": 0, "leftLocator": 0, "rightLocator": 0, "cycleStart": 0, "cycleEnd": 0,
        )" +
           members + R"("pool": [], "tracks": [)" + tracks + "]}";
}

/// The project of a scene at 24 frames a second that begins at 01:00:00:00:
///
///     01:00:00:00 :01    :02          :06:12         :10           :14
///     DIA 1               |-- line 1 --|              |-[a]--[-b-]--|        (a and b in a part)
///     FX                     |step|                                          from a quarter of a frame behind :03:00
///     Memos       ^          |----|
inline std::string soundProject()
{
    return R"({
  "format": "stage", "version": 1, "framesPerSecond": 24, "dropFrame": false, "pulledDown": false,
  "timeOrigin": 3600, "end": 60, "position": 2, "leftLocator": 2, "rightLocator": 6.5, "cycleStart": 10, "cycleEnd": 12,
  "pool": [
    {"number": 3, "kind": "audio", "name": "42A", "path": "Audio/42A.wav", "length": 30},
    {"number": 7, "kind": "audio", "name": "feet", "path": "Audio/feet take 1.wav", "length": 10}
  ],
  "tracks": [
    {"kind": "folder", "name": "Dialogue", "tracks": [
      {"kind": "audio", "name": "DIA 1", "selected": true,
        "curves": [
          {"number": 1, "automates": "volume", "points": [{"time": 2, "value": 0.75}, {"time": 6.5, "value": 0.5}]},
          {"number": 40, "points": [{"time": 3, "value": 1}]}
        ],
        "events": [
          {"kind": "clip", "start": 2, "end": 6.5, "clip": 3, "offset": 1.25, "name": "line 1"},
          {"kind": "part", "start": 10, "end": 14, "name": "pair", "events": [
            {"kind": "clip", "start": 0.5, "end": 1, "clip": 3, "name": "a", "selected": true},
            {"kind": "clip", "start": 2, "end": 3, "clip": 3, "offset": 8, "name": "b"}
          ]}
        ]}
    ]},
    {"kind": "audio", "name": "FX", "locked": true, "events": [
      {"kind": "clip", "start": 3.0104166666666665, "end": 4, "clip": 7, "name": "step"}
    ]},
    {"kind": "marker", "name": "Memos", "attributes": {"Cadrel:MarkerType": 7}, "events": [
      {"kind": "point", "start": 1, "name": "too loud",
        "attributes": {"CadrEventUserId": 3, "User:STR_MAReel": "A012C004"}},
      {"kind": "range", "start": 3, "end": 4, "name": "listen to this one again with the director present"}
    ]}
  ]
}
)";
}

} // namespace cadrel::tests
