// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <array>
#include <cmath>
#include <span>
#include <string_view>

namespace standin {

/// The version of the form of project files.
inline constexpr int ProjectFileVersion = 1;

/// The keys of a project file. docs/project-file.md tells what they mean.
namespace Key {

// Of every node.
inline constexpr std::string_view Name = "name";
inline constexpr std::string_view Selected = "selected";
inline constexpr std::string_view Attributes = "attributes";

// Of the project.
inline constexpr std::string_view Format = "format";
inline constexpr std::string_view Version = "version";
inline constexpr std::string_view FramesPerSecond = "framesPerSecond";
inline constexpr std::string_view DropFrame = "dropFrame";
inline constexpr std::string_view PulledDown = "pulledDown";
inline constexpr std::string_view TimeOrigin = "timeOrigin";
inline constexpr std::string_view Position = "position";
inline constexpr std::string_view LeftLocator = "leftLocator";
inline constexpr std::string_view RightLocator = "rightLocator";
inline constexpr std::string_view CycleStart = "cycleStart";
inline constexpr std::string_view CycleEnd = "cycleEnd";
inline constexpr std::string_view Pool = "pool";
inline constexpr std::string_view Tracks = "tracks";

// Of clips of the pool, tracks, curves, points and events.
inline constexpr std::string_view Number = "number";
inline constexpr std::string_view Kind = "kind";
inline constexpr std::string_view Path = "path";
inline constexpr std::string_view Length = "length";
inline constexpr std::string_view Locked = "locked";
inline constexpr std::string_view Curves = "curves";
inline constexpr std::string_view Events = "events";
inline constexpr std::string_view Automates = "automates";
inline constexpr std::string_view Points = "points";
inline constexpr std::string_view Holding = "holding";
inline constexpr std::string_view Time = "time";
inline constexpr std::string_view Value = "value";
inline constexpr std::string_view Start = "start";
inline constexpr std::string_view End = "end";
inline constexpr std::string_view Clip = "clip";
inline constexpr std::string_view Offset = "offset";

} // namespace Key

/// The keys that an object may have and that have a meaning; a member under any other is kept as it is.
using KnownKeys = std::span<const std::string_view>;

inline constexpr std::array ProjectKeys{Key::Format,    Key::Version,     Key::Name,         Key::FramesPerSecond,
                                        Key::DropFrame, Key::PulledDown,  Key::TimeOrigin,   Key::End,
                                        Key::Position,  Key::LeftLocator, Key::RightLocator, Key::CycleStart,
                                        Key::CycleEnd,  Key::Selected,    Key::Attributes,   Key::Pool,
                                        Key::Tracks};
inline constexpr std::array PoolClipKeys{Key::Number,          Key::Kind,     Key::Name,      Key::Path, Key::Length,
                                         Key::FramesPerSecond, Key::Selected, Key::Attributes};
inline constexpr std::array TrackKeys{Key::Kind,       Key::Name,   Key::Locked, Key::Selected,
                                      Key::Attributes, Key::Curves, Key::Events, Key::Tracks};
/// What a curve automates can only be told when its number has a name.
inline constexpr std::array NamelessCurveKeys{Key::Number, Key::Name, Key::Selected, Key::Attributes, Key::Points};
inline constexpr std::array CurveKeys{Key::Number,   Key::Automates,  Key::Name,
                                      Key::Selected, Key::Attributes, Key::Points};
inline constexpr std::array PointKeys{Key::Time, Key::Value, Key::Name, Key::Holding, Key::Selected, Key::Attributes};
inline constexpr std::array EventKeys{Key::Kind, Key::Start,    Key::End,        Key::Clip,  Key::Offset,
                                      Key::Name, Key::Selected, Key::Attributes, Key::Events};

/// The kinds of an event.
namespace EventKind {

inline constexpr std::string_view Clip = "clip";
inline constexpr std::string_view Part = "part";
inline constexpr std::string_view Point = "point";
inline constexpr std::string_view Range = "range";

} // namespace EventKind

/// What `format` holds.
inline constexpr std::string_view FormatName = "stage";

/// What is numbered counts from 1 up to this.
inline constexpr int LargestNumber = 1'000'000'000;
inline constexpr double LowestFrameRate = 1.0;
inline constexpr double HighestFrameRate = 1000.0;

/// Whether timecode of that rate can be drop-frame: at 30 frames per second, exactly or rounded (SMPTE ST 12-1).
inline bool hasDropFrame(double framesPerSecond)
{
    return std::round(framesPerSecond) == 30.0;
}

} // namespace standin
