// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/RulerTicks.h"

#include <algorithm>
#include <array>
#include <cstddef>

namespace desktop {

namespace {

constexpr double LeastGap = 7.0; ///< between small lines, in pixels

/// Which numbers have a line: the multiples of each. Each second and longer is a multiple of all shorter ones but a few.
std::vector<std::int64_t> stepsOf(const ProjectClock& clock)
{
    static constexpr std::array<std::int64_t, 16> Seconds = {1,   2,   5,   10,   15,   30,    60,       2 * 60,
                                                             300, 600, 900, 1800, 3600, 10800, 6 * 3600, 12 * 3600};
    static constexpr std::array<std::int64_t, 8> Days = {1, 2, 5, 10, 50, 100, 500, 1000};
    const std::int64_t rate = clock.nominalRate();
    std::vector<std::int64_t> steps;
    for (std::int64_t frames = 1; frames < rate; ++frames) {
        if (rate % frames == 0)
            steps.push_back(frames);
    }
    for (const std::int64_t seconds : Seconds)
        steps.push_back(seconds * rate);
    for (const std::int64_t days : Days)
        steps.push_back(days * 24 * 3600 * rate);
    return steps;
}

/// The fewest frames from one line to the next. Where drop-frame leaves out two numbers, they are two fewer than elsewhere.
std::int64_t leastFrames(std::int64_t step, const ProjectClock& clock)
{
    return clock.isDropFrame() && step > 2 ? step - 2 : step;
}

} // namespace

std::vector<RulerTick> rulerTicks(const ProjectClock& clock, const TimeScale& scale, double width, double labelWidth)
{
    const double pixelsPerFrame = 1.0 / (clock.framerate().rate * scale.secondsPerPixel());
    const std::vector<std::int64_t> steps = stepsOf(clock);
    const auto firstWith = [&](double gap) {
        return std::ranges::find_if(steps, [&](std::int64_t step) {
            return static_cast<double>(leastFrames(step, clock)) * pixelsPerFrame >= gap;
        });
    };
    const auto labelled = firstWith(labelWidth);
    if (labelled == steps.end())
        return {};
    // The small lines divide the stretch between two labels.
    const auto small =
        std::find_if(firstWith(LeastGap), labelled, [&](std::int64_t step) { return *labelled % step == 0; });

    std::vector<RulerTick> ticks;
    const double before = scale.secondsAt(-labelWidth);
    const std::int64_t first = clock.numberOf(clock.frameAt(before)) / *small * *small - *small;
    for (std::int64_t number = first;; number += *small) {
        const std::int64_t frame = clock.frameWith(number);
        const double pixel = scale.pixelAt(clock.secondsOf(frame));
        if (pixel >= width)
            break;
        if (pixel < -labelWidth || (!ticks.empty() && ticks.back().frame == frame))
            continue;
        ticks.push_back({pixel, frame, number % *labelled == 0 ? clock.textOf(frame) : std::string()});
    }
    return ticks;
}

} // namespace desktop
