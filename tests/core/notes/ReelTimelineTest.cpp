// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/ReelTimeline.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using namespace core;

constexpr int Minute = 1500; // frames at 25 frames a second
constexpr int Day = 24 * 60;

/// In minutes; a start of -1 is none.
struct Course {
    int oldStart;
    int newStart;
    int mostBefore;
    int mostEver;
};

using Texts = std::vector<std::string>;

/// "1: 2 to 80" is a shift of the second reel to 80 minutes right before the steps of the first one; "~" is out of the way.
Texts shiftsOf(const std::vector<Course>& courses, const Framerate& framerate = Framerate(25, 0))
{
    const auto frames = [](int minutes) { return minutes < 0 ? std::nullopt : std::optional(minutes * Minute); };
    std::vector<ReelCourse> inFrames;
    for (const Course& course : courses)
        inFrames.push_back(
            {frames(course.oldStart), frames(course.newStart), course.mostBefore * Minute, course.mostEver * Minute});
    ReelTimeline timeline(inFrames, framerate);
    Texts texts;
    for (std::size_t reel = 0; reel < courses.size(); ++reel) {
        for (const ReelShift& shift : timeline.makeRoomFor(reel)) {
            texts.push_back(std::to_string(reel + 1) + ": " + std::to_string(shift.reel + 1) + " to " +
                            std::to_string(shift.to / Minute) + (shift.isOutOfTheWay ? "~" : ""));
            EXPECT_EQ(timeline.startOf(shift.reel), shift.to);
        }
    }
    return texts;
}

class ReelTimelineTest : public testing::Test {
    const TestProject m_project;
};

TEST_F(ReelTimelineTest, ReelsThatStayAreNotMoved)
{
    EXPECT_EQ(shiftsOf({}), Texts{});
    EXPECT_EQ(shiftsOf({{60, 60, 18, 19}, {80, 80, 18, 18}}), Texts{});
}

TEST_F(ReelTimelineTest, AReelThatIsInNobodysWayGoesRightBeforeItsOwnSteps)
{
    EXPECT_EQ(shiftsOf({{60, 58, 18, 20}, {120, 121, 18, 18}, {180, 170, 18, 18}}),
              (Texts{"1: 1 to 58", "2: 2 to 121", "3: 3 to 170"}));
}

TEST_F(ReelTimelineTest, AReelMayEndWhereTheNextOneBegins)
{
    EXPECT_EQ(shiftsOf({{60, 60, 18, 20}, {80, 81, 18, 18}}), (Texts{"2: 2 to 81"}));
    EXPECT_EQ(shiftsOf({{60, 60, 18, 21}, {80, 81, 18, 18}}), (Texts{"1: 2 to 81"}));
}

TEST_F(ReelTimelineTest, ReelsInTheWayOfEachOtherGoFromTheLast)
{
    EXPECT_EQ(shiftsOf({{60, 60, 18, 21}, {80, 85, 18, 18}, {100, 105, 18, 18}}), (Texts{"1: 3 to 105", "1: 2 to 85"}));
}

TEST_F(ReelTimelineTest, ThreeReelsInACircleNeedOneFreePlace)
{
    // 1 goes to 80, 2 to 100 and 3 to 60, so that 3 has its turn first.
    EXPECT_EQ(shiftsOf({{100, 60, 10, 10}, {60, 80, 10, 10}, {80, 100, 10, 10}}),
              (Texts{"1: 3 to 120~", "1: 2 to 80", "1: 1 to 60", "3: 3 to 100"}));
}

TEST_F(ReelTimelineTest, AReelThatGoesAwayInTheEndIsMovedOutOfTheWayOfAnEarlierOne)
{
    EXPECT_EQ(shiftsOf({{60, 70, 5, 5}, {70, -1, 5, 5}}), (Texts{"1: 2 to 80~", "1: 1 to 70"}));
}

TEST_F(ReelTimelineTest, ANewReelThatHasNothingYetIsInNobodysWay)
{
    EXPECT_EQ(shiftsOf({{60, 60, 5, 20}, {-1, 70, 0, 5}}), Texts{});
}

TEST_F(ReelTimelineTest, ANewReelThatGetsPictureBeforeItsTurnBeginsElsewhereWhereItsPlaceIsTaken)
{
    EXPECT_EQ(shiftsOf({{60, 60, 5, 20}, {-1, 70, 2, 5}}), (Texts{"2: 2 to 70"}));
    EXPECT_EQ(shiftsOf({{60, 60, 5, 10}, {-1, 70, 2, 5}}), Texts{});
}

TEST_F(ReelTimelineTest, AReelThatGetsTooMuchPictureBeforeItsTurnGivesWayAtOnce)
{
    EXPECT_EQ(shiftsOf({{60, 60, 5, 5}, {70, 70, 12, 12}, {80, 90, 5, 5}}), (Texts{"1: 3 to 90"}));
}

TEST_F(ReelTimelineTest, TheFreePlaceIsAMinuteAfterTheEndOrLater)
{
    EXPECT_EQ(shiftsOf({{70, 60, 9, 9}, {60, 70, 9, 9}}), (Texts{"1: 2 to 80~", "1: 1 to 60", "2: 2 to 70"}));
    EXPECT_EQ(shiftsOf({{70, 60, 10, 10}, {60, 70, 10, 10}}), (Texts{"1: 2 to 90~", "1: 1 to 60", "2: 2 to 70"}));
}

TEST_F(ReelTimelineTest, AtTheEndOfTheDayTheFreePlaceIsBeforeTheReels)
{
    EXPECT_EQ(shiftsOf({{Day - 10, Day - 20, 9, 9}, {Day - 20, Day - 10, 9, 9}}),
              (Texts{"1: 2 to 0~", "1: 1 to 1420", "2: 2 to 1430"}));
}

TEST_F(ReelTimelineTest, InADayWithoutAFreePlaceTheReelStays)
{
    EXPECT_EQ(shiftsOf({{720, 0, 700, 700}, {0, 720, 700, 700}}), (Texts{"1: 1 to 0", "2: 2 to 720"}));
}

} // namespace
} // namespace cadrel::tests
