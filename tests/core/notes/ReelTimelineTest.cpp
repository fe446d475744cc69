// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/ReelTimeline.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using namespace core;

constexpr int Minute = 1500; // frames at 25 frames a second
constexpr int Day = 24 * 60;

constexpr std::size_t Turn = 10; // moments from one turn to the next

/// In minutes; a start of -1 is none. A reel has its length at work by the first step of its own turn, unless changes of its
/// length tell otherwise.
struct Course {
    int oldStart;
    int newStart;
    int length;
    int lengthAtWork;
    std::vector<std::pair<std::size_t, int>> changes = {}; ///< the moment, and the length from then on
};

using Texts = std::vector<std::string>;

ReelTimeline timelineOf(std::vector<Course> courses, const Framerate& framerate = Framerate(25, 0))
{
    const auto frames = [](int minutes) { return minutes < 0 ? std::nullopt : std::optional(minutes * Minute); };
    std::vector<ReelCourse> inFrames;
    std::vector<std::size_t> turns;
    for (Course& course : courses) {
        turns.push_back(turns.size() * Turn);
        if (course.changes.empty())
            course.changes = {{turns.back() + 1, course.lengthAtWork}};
        ReelCourse reel{frames(course.oldStart), frames(course.newStart), {{0, course.length * Minute}}};
        for (const auto& [moment, minutes] : course.changes)
            reel.lengths.push_back({moment, minutes * Minute});
        inFrames.push_back(reel);
    }
    return {inFrames, turns, framerate};
}

/// "1: 2 to 80" is a shift of the second reel to 80 minutes right before the steps of the first one; "~" is out of the way.
Texts shiftsOf(const std::vector<Course>& courses)
{
    ReelTimeline timeline = timelineOf(courses);
    Texts texts;
    for (std::size_t reel = 0; reel < courses.size(); ++reel) {
        for (const ReelShift& shift : timeline.makeRoomFor(reel)) {
            texts.push_back(std::to_string(reel + 1) + ": " + std::to_string(shift.reel + 1) + " to " +
                            std::to_string(shift.to / Minute) + (shift.isOutOfTheWay ? "~" : ""));
            EXPECT_EQ(timeline.startOf(shift.reel), shift.to);
            EXPECT_EQ(timeline.isAside(shift.reel), shift.isOutOfTheWay);
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
    const Course second{-1, 70, 0, 0, {{1, 2}, {11, 5}}};

    EXPECT_EQ(shiftsOf({{60, 60, 5, 11}, second}), (Texts{"2: 2 to 70"}));
    EXPECT_EQ(shiftsOf({{60, 60, 5, 10}, second}), Texts{});
    ReelTimeline timeline = timelineOf({{60, 60, 5, 11}, second});
    EXPECT_EQ(timeline.makeRoomFor(0), std::vector<ReelShift>{});
    // Reel 2 ends at 75 minutes.
    EXPECT_EQ(timeline.startOf(1), 80 * Minute);
    EXPECT_TRUE(timeline.isAside(1));
    EXPECT_EQ(timeline.makeRoomFor(1), (std::vector<ReelShift>{{1, 80 * Minute, 70 * Minute, false}}));
    EXPECT_FALSE(timeline.isAside(1));
}

TEST_F(ReelTimelineTest, AReelThatGetsTooMuchPictureBeforeItsTurnGivesWayAtOnce)
{
    EXPECT_EQ(shiftsOf({{60, 60, 5, 5}, {70, 70, 5, 12, {{1, 11}}}, {80, 90, 5, 5}}), (Texts{"1: 3 to 90"}));
    EXPECT_EQ(shiftsOf({{60, 60, 5, 5}, {70, 70, 5, 12, {{1, 10}}}, {80, 90, 5, 5}}), (Texts{"3: 3 to 90"}));
}

TEST_F(ReelTimelineTest, AReelThatGrowsOntoOneThatHasHadItsTurnGoesAway)
{
    // Reel 1 stands at 70 to 75 minutes by then.
    EXPECT_EQ(shiftsOf({{100, 70, 5, 5}, {200, 80, 5, 5}, {60, 90, 5, 5, {{11, 11}}}}),
              (Texts{"1: 1 to 70", "2: 2 to 80", "2: 3 to 90"}));
    EXPECT_EQ(shiftsOf({{100, 70, 5, 5}, {200, 80, 5, 5}, {60, 90, 5, 5, {{11, 10}}}}),
              (Texts{"1: 1 to 70", "2: 2 to 80", "3: 3 to 90"}));
}

TEST_F(ReelTimelineTest, AReelThatHasLostItsPictureByThenIsNotInTheWay)
{
    EXPECT_EQ(shiftsOf({{60, 60, 9, 0, {{1, 20}, {2, 25}}}, {80, -1, 9, 0, {{2, 0}}}}), Texts{});
    EXPECT_EQ(shiftsOf({{60, 60, 9, 0, {{1, 21}, {2, 25}}}, {80, -1, 9, 0, {{2, 0}}}}), (Texts{"1: 2 to 90~"}));
}

TEST_F(ReelTimelineTest, AReelWithoutPictureBeginsElsewhereWithoutAShift)
{
    ReelTimeline timeline = timelineOf({{60, 60, 9, 9}, {120, 130, 9, 0, {{1, 0}, {11, 5}}}});

    EXPECT_EQ(timeline.makeRoomFor(0), std::vector<ReelShift>{});
    EXPECT_EQ(timeline.startOf(1), 120 * Minute);
    EXPECT_EQ(timeline.makeRoomFor(1), std::vector<ReelShift>{});
    EXPECT_EQ(timeline.startOf(1), 130 * Minute);
    EXPECT_EQ(shiftsOf({{60, 60, 9, 9}, {120, 130, 9, 0, {{1, 1}, {11, 5}}}}), (Texts{"2: 2 to 130"}));
}

TEST_F(ReelTimelineTest, PictureThatGoesToAnotherReelIsInOneOfThemAtATime)
{
    EXPECT_EQ(shiftsOf({{60, 60, 36, 0, {{1, 18}}}, {-1, 80, 0, 0, {{1, 18}}}}), Texts{});
    // Here it is in both for a moment.
    EXPECT_EQ(shiftsOf({{60, 60, 36, 0, {{2, 18}}}, {-1, 80, 0, 0, {{1, 18}}}}), (Texts{"2: 2 to 80"}));
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
    const std::vector<Course> swap{{720, 0, 700, 700}, {0, 720, 700, 700}};
    EXPECT_EQ(shiftsOf(swap), (Texts{"1: 1 to 0", "2: 2 to 720"}));
    ReelTimeline timeline = timelineOf(swap);
    EXPECT_FALSE(timeline.hasNoRoom());
    timeline.makeRoomFor(0);
    EXPECT_TRUE(timeline.hasNoRoom());
}

} // namespace
} // namespace cadrel::tests
