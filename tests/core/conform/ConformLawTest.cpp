// SPDX-License-Identifier: GPL-3.0-or-later

// The law of conforming, for random films: every instant of the new programme that a change event covers holds the
// very material that stood at its source instant, under the automation that it had there, and every other instant holds
// nothing.

#include "core/time/Timecode.h"
#include "tests/support/core/ConformFilm.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <optional>
#include <ostream>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::Framerate;
using core::Timecode;
using util::Result;

/// Frames are counted from here, so that drop-frame numbers are left out within a film.
constexpr std::int32_t FirstFrame = 1700;
constexpr std::int32_t FilmLength = 400;
constexpr std::int32_t Volume = 7;
constexpr std::int32_t LongestRange = 120;
constexpr std::int32_t LastFrame = FilmLength + LongestRange; ///< no range reaches further

/// A piece of sound, in frames from the start of the film. Sounds don't start and end with frames.
struct Sound {
    double start;
    double end;
    double offset; ///< seconds into its material
};

/// A change event at normal speed, in frames from the start of the film.
struct Range {
    std::int32_t source;
    std::int32_t destination;
    std::int32_t length;
};

struct Film {
    std::vector<std::vector<Sound>> tracks;
    std::vector<MemoryPoint> points; ///< of a curve on each track, in frames from the start of the film
    std::vector<Range> ranges;
};

std::ostream& operator<<(std::ostream& out, const Film& film)
{
    for (const auto& track : film.tracks) {
        out << "track";
        for (const Sound& sound : track)
            out << " [" << sound.start << ", " << sound.end << ") from " << sound.offset;
        out << '\n';
    }
    for (const MemoryPoint& point : film.points)
        out << "point " << point.value << " at " << point.time << '\n';
    for (const Range& range : film.ranges)
        out << range.source << " -> " << range.destination << " x " << range.length << '\n';
    return out;
}

rc::Gen<Sound> sounds()
{
    // Eighths of a frame are exact; of two at an odd eighth no edge ever meets the middle of a frame.
    return rc::gen::map(
        rc::gen::tuple(rc::gen::inRange(0, FilmLength * 4), rc::gen::inRange(1, 300), rc::gen::inRange(0, 1000)),
        [](const std::tuple<int, int, int>& numbers) {
            const auto [quarters, length, offset] = numbers;
            const double start = quarters / 4.0 + 0.125;
            return Sound{start, start + length / 4.0, offset / 8.0};
        });
}

rc::Gen<MemoryPoint> points()
{
    return rc::gen::map(rc::gen::pair(rc::gen::inRange(0, FilmLength), rc::gen::inRange(0, 9)),
                        [](const std::pair<int, int>& numbers) {
                            return MemoryPoint{numbers.first + 0.125, numbers.second / 8.0};
                        });
}

rc::Gen<Range> ranges()
{
    return rc::gen::build<Range>(rc::gen::set(&Range::source, rc::gen::inRange(0, FilmLength)),
                                 rc::gen::set(&Range::destination, rc::gen::inRange(0, FilmLength)),
                                 rc::gen::set(&Range::length, rc::gen::inRange(0, LongestRange + 1)));
}

/// Ranges anywhere, which overlap and leave gaps, or the scenes of a film that change places.
rc::Gen<std::vector<Range>> changeLists()
{
    const auto anywhere = rc::gen::resize(12, rc::gen::container<std::vector<Range>>(ranges()));
    const auto swapped =
        rc::gen::map(rc::gen::pair(rc::gen::inRange(1, FilmLength), rc::gen::arbitrary<bool>()),
                     [](const std::pair<std::int32_t, bool>& choice) {
                         const auto [cut, forward] = choice;
                         const Range first{0, FilmLength - cut, cut};
                         const Range second{cut, 0, FilmLength - cut};
                         return forward ? std::vector<Range>{first, second} : std::vector<Range>{second, first};
                     });
    return rc::gen::weightedOneOf<std::vector<Range>>({{3, anywhere}, {1, swapped}});
}

rc::Gen<Film> films()
{
    return rc::gen::build<Film>(
        rc::gen::set(&Film::tracks,
                     rc::gen::resize(3, rc::gen::nonEmpty(rc::gen::container<std::vector<std::vector<Sound>>>(
                                            rc::gen::resize(20, rc::gen::container<std::vector<Sound>>(sounds())))))),
        rc::gen::set(&Film::points, rc::gen::resize(8, rc::gen::container<std::vector<MemoryPoint>>(points()))),
        rc::gen::set(&Film::ranges, rc::gen::nonEmpty(changeLists())));
}

/// What sounds at one instant.
struct Heard {
    std::string material;
    double position; ///< seconds into the material
};

/// Each sound has its own name, by which the expectation and the track tell it.
std::string materialOf(std::size_t track, std::size_t sound)
{
    return std::to_string(track) + "/" + std::to_string(sound);
}

/// What the film holds at the middle of a frame before the run. Of sounds that overlap the last wins.
std::optional<Heard> heardInOldProgramme(const Film& film, std::size_t track, std::int32_t frame, double rate)
{
    const double middle = frame + 0.5;
    const std::vector<Sound>& sounding = film.tracks[track];
    for (std::size_t i = sounding.size(); i-- > 0;) {
        const Sound& sound = sounding[i];
        if (sound.start < middle && middle < sound.end)
            return Heard{materialOf(track, i), sound.offset + (middle - sound.start) / rate};
    }
    return std::nullopt;
}

/// The value of the curve at the middle of a frame before the run: on the line between two points, and held before
/// the first and behind the last.
double valueInOldProgramme(const Film& film, std::int32_t frame)
{
    const double middle = frame + 0.5;
    std::vector<MemoryPoint> points = film.points;
    std::stable_sort(points.begin(), points.end(),
                     [](const MemoryPoint& a, const MemoryPoint& b) { return a.time < b.time; });
    for (std::size_t i = 0; i < points.size(); ++i) {
        if (points[i].time > middle) {
            const MemoryPoint& left = points[i == 0 ? 0 : i - 1];
            const double way = i == 0 ? 0.0 : (middle - left.time) / (points[i].time - left.time);
            return left.value + way * (points[i].value - left.value);
        }
    }
    return points.back().value;
}

/// The frame of the old programme that the law wants at a frame of the new one. Of ranges that overlap the last wins.
std::optional<std::int32_t> sourceOf(const Film& film, std::int32_t frame)
{
    for (std::size_t i = film.ranges.size(); i-- > 0;) {
        const Range& range = film.ranges[i];
        if (range.destination <= frame && frame < range.destination + range.length)
            return frame - range.destination + range.source;
    }
    return std::nullopt;
}

double secondsOfFrame(double frame, double rate)
{
    return (FirstFrame + frame) / rate;
}

void bringIn(const Film& film, ConformFilm& conformed)
{
    const double rate = conformed.project.framerate.rate;
    for (std::size_t track = 0; track < film.tracks.size(); ++track) {
        MemoryTrack& memoryTrack = conformed.engine.addTrack(L"Track");
        for (std::size_t i = 0; i < film.tracks[track].size(); ++i) {
            const Sound& sound = film.tracks[track][i];
            memoryTrack.addClip({materialOf(track, i), secondsOfFrame(sound.start, rate),
                                 secondsOfFrame(sound.end, rate), sound.offset});
        }
        for (const MemoryPoint& point : film.points)
            memoryTrack.addPoint(Volume, secondsOfFrame(point.time, rate), point.value);
    }
    for (const Range& range : film.ranges) {
        const auto timecodeOf = [](std::int32_t frame) { return Timecode(FirstFrame + frame); };
        const auto event = std::make_shared<core::EventBase>();
        event->setTimecodes(timecodeOf(range.source), timecodeOf(range.source + range.length),
                            timecodeOf(range.destination), timecodeOf(range.destination + range.length));
        conformed.model.changeEdl().add(event);
    }
}

double valueAt(const MemoryTrack& track, double time)
{
    const core::AutomationState around = track.spansAround(time).automation.at(Volume);
    if (around.leftTime == -1.0)
        return around.rightValue;
    if (around.rightTime == time)
        return around.leftValue;
    const double way = (time - around.leftTime) / (around.rightTime - around.leftTime);
    return around.leftValue + way * (around.rightValue - around.leftValue);
}

void checkTheLaw(const Film& film, const Framerate& framerate)
{
    ConformFilm conformed(framerate);
    bringIn(film, conformed);

    RC_ASSERT(conformed.conform() == Result::Ok);

    for (std::size_t track = 0; track < film.tracks.size(); ++track) {
        const MemoryTrack& memoryTrack = conformed.engine.tracks()[track];
        for (std::int32_t frame = -10; frame < LastFrame + 10; ++frame) {
            const double time = secondsOfFrame(frame + 0.5, framerate.rate);
            const std::optional<std::int32_t> source = sourceOf(film, frame);
            const std::optional<Heard> expected =
                source ? heardInOldProgramme(film, track, *source, framerate.rate) : std::nullopt;
            const std::optional<MemoryClip> found = memoryTrack.clipAt(time);
            RC_ASSERT(found.has_value() == expected.has_value());
            if (found) {
                RC_ASSERT(found->material == expected->material);
                RC_ASSERT(std::abs(found->offset + (time - found->start) - expected->position) < 1e-6);
            }
            if (source && !film.points.empty())
                RC_ASSERT(std::abs(valueAt(memoryTrack, time) - valueInOldProgramme(film, *source)) < 1e-6);
        }
        RC_ASSERT(memoryTrack.end() < secondsOfFrame(LastFrame + 0.5, framerate.rate));
    }
}

RC_GTEST_PROP(ConformLaw, HoldsAt24Frames, ())
{
    checkTheLaw(*films(), Framerate(24, 0));
}

RC_GTEST_PROP(ConformLaw, HoldsAt25Frames, ())
{
    checkTheLaw(*films(), Framerate(25, 0));
}

RC_GTEST_PROP(ConformLaw, HoldsAt2997FramesDropFrame, ())
{
    checkTheLaw(*films(), Framerate(30, true, 1));
}

} // namespace
} // namespace cadrel::tests
