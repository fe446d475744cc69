// SPDX-License-Identifier: GPL-3.0-or-later

// What the file of a large project costs. A step that is quadratic in clips would take sixteen times as long for four times
// as many.

#include "tests/standin/file/ProjectText.h"
#include "tests/support/NotQuadratic.h"
#include "tests/support/SecondsOf.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>

namespace standin::tests {

namespace {

/// Of a project with so many clips in its pool and on a track, among them parts, and as many automation points.
std::string largeText(int clips)
{
    std::string pool;
    std::string events;
    std::string points;
    for (int index = 1; index <= clips; ++index) {
        const std::string number = std::to_string(index);
        const std::string end = index < clips ? ", " : "";
        const std::string clip = R"({"kind": "clip", "start": 0, "end": 1, "clip": )" + number + "}";
        pool +=
            R"({"number": )" + number + R"(, "kind": "audio", "path": "/fx/)" + number + R"(.wav", "length": 2})" + end;
        events += R"({"kind": "part", "start": )" + number + R"(, "end": 1000000, "events": [)" + clip + "]}" + end;
        points += R"({"time": )" + number + R"(, "value": 0.5})" + end;
    }
    return R"({"format": "stage", "version": 1, "framesPerSecond": 24, "pool": [)" + pool +
           R"(], "tracks": [{"kind": "audio", "curves": [{"number": 1, "points": [)" + points + R"(]}], "events": [)" +
           events + "]}]}";
}

/// Of the processor, so that other programs don't count.
double secondsToReadAndWrite(int clips)
{
    const std::string text = largeText(clips);
    return cadrel::tests::secondsOf([&] { ProjectTexts().textAgain(text); });
}

} // namespace

TEST(LargeProjectFile, IsReadAndWrittenWithoutAStepThatIsQuadraticInClips)
{
    cadrel::tests::expectNotQuadratic(2500, secondsToReadAndWrite);
}

} // namespace standin::tests
