// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/file/ProjectFile.h"
#include "tests/standin/edit/RangeEditHost.h"
#include "tests/support/TempFolder.h"
#include "velmark/Automation.h"
#include "velmark/Events.h"

#include <gtest/gtest.h>

using namespace Velmark;

namespace standin::tests {

namespace {

/// Less than to another instant.
constexpr double Hair = 0.5 * SameInstant;

struct Film : RangeEditHost {
    Node track = addTrack(TypeWord::Audio, u"DX 1");
};

} // namespace

//   1 ..    .o                            source from 4 to 12, destination at 40, where the curve is at 0
//        .·´  |                     .o
//   0  o´     o------------------o·´ o---
//      0     16                 40  48
TEST(AutomationInRanges, TwoPointsHoldTheCurveAtEitherEdge)
{
    Film film;
    film.addVolume(film.track, {{0, 0.0f}, {16, 1.0f}, {16, 0.0f}});

    film.copyRange({film.track}, 4, 12, 40);

    EXPECT_EQ(film.volumeOf(film.track), "0=0 16=1 16=0 40=0 40=0.25 48=0.75 48=0");
}

TEST(AutomationInRanges, ThePointsOfTheRangeTravelToTheirPlaces)
{
    Film film;
    film.addVolume(film.track, {{0, 0.0f}, {10, 0.25f}, {12, 0.5f}, {12, 0.75f}, {15, 1.0f}, {30, 0.0f}});

    film.copyRange({film.track}, 9, 16, 49);

    const std::string travelled = "50=0.25 52=0.5 52=0.75 55=1";
    EXPECT_NE(film.volumeOf(film.track).find(travelled), std::string::npos) << film.volumeOf(film.track);
}

TEST(AutomationInRanges, ATrackWithoutPointsGetsNone)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);

    film.copyRange({film.track}, 0, 10, 40);

    EXPECT_EQ(film.volumeOf(film.track), "");
}

TEST(AutomationInRanges, EachCurveIsAloneWithItself)
{
    Film film;
    film.addVolume(film.track, {{0, 0.5f}, {10, 1.0f}});
    film.addPoint(film.track, Envelope::Curve::Pan, 10, 0.25f);

    film.copyRange({film.track}, 0, 10, 40);

    EXPECT_EQ(film.volumeOf(film.track), "0=0.5 10=1 40=1 40=0.5 50=1");
    EXPECT_EQ(film.curveTextOf(film.track, Envelope::Curve::Pan), "10=0.25");
    EXPECT_EQ(film.curveTextOf(film.track, Envelope::Curve::Mute), "");
}

TEST(AutomationInRanges, NoPointIsAddedWhereItWouldChangeNothing)
{
    Film film;
    film.addVolume(film.track, {{5, 0.5f}, {60, 0.5f}, {70, 0.0f}});

    film.copyRange({film.track}, 10, 20, 40);

    EXPECT_EQ(film.volumeOf(film.track), "5=0.5 60=0.5 70=0");
}

TEST(AutomationInRanges, OnePointIsEnoughWhereTheValuesMeet)
{
    Film film;
    film.addVolume(film.track, {{10, 0.5f}, {15, 1.0f}, {20, 0.5f}});

    film.copyRange({film.track}, 12.5, 20, 40);

    // From 0.5 up to 0.75 in one instant; then to 1, and down to 0.5, where the curve outside is.
    EXPECT_EQ(film.volumeOf(film.track), "10=0.5 15=1 20=0.5 40=0.5 40=0.75 42.5=1 47.5=0.5");
}

TEST(AutomationInRanges, SlopesOutsideOfTheDestinationRunOnAsTheyDid)
{
    Film film;
    film.addVolume(film.track, {{0, 0.5f}, {8, 0.5f}, {32, 0.0f}, {64, 1.0f}});

    film.copyRange({film.track}, 0, 4, 40);

    EXPECT_EQ(film.volumeOf(film.track), "0=0.5 8=0.5 32=0 40=0.25 40=0.5 44=0.5 44=0.375 64=1");
}

TEST(AutomationInRanges, BeforeTheFirstPointTheCurveIsAtItsValue)
{
    Film film;
    film.addVolume(film.track, {{20, 0.5f}, {30, 0.75f}});

    film.copyRange({film.track}, 0, 10, 40);

    EXPECT_EQ(film.volumeOf(film.track), "20=0.5 30=0.75 40=0.75 40=0.5 50=0.5 50=0.75");
}

TEST(AutomationInRanges, BehindTheLastPointTheCurveIsAtItsValue)
{
    Film film;
    film.addVolume(film.track, {{20, 0.5f}, {30, 0.75f}});

    film.copyRange({film.track}, 40, 50, 5);

    EXPECT_EQ(film.volumeOf(film.track), "5=0.5 5=0.75 15=0.75 15=0.5 20=0.5 30=0.75");
}

//  source                                destination
//       o--_                                  o--_
//       |   -o                                |   -o
//  o----o    |                           o----o    |
//            o----                                 o----
TEST(AutomationInRanges, ARangeBeginsWithTheLastAndEndsWithTheFirstOfThePointsAtItsEdges)
{
    Film film;
    film.addVolume(film.track, {{10, 0.0f}, {10, 1.0f}, {20, 0.75f}, {20, 0.0f}});

    film.copyRange({film.track}, 10, 20, 40);

    EXPECT_EQ(film.volumeOf(film.track), "10=0 10=1 20=0.75 20=0 40=0 40=1 50=0.75 50=0");
}

TEST(AutomationInRanges, OutsideTheCurveComesToTheFirstAndGoesOnFromTheLastOfThePointsAtTheEdges)
{
    Film film;
    film.addVolume(film.track, {{0, 0.25f},
                                {20, 0.25f},
                                {40, 0.5f},
                                {40, 0.75f},
                                {40, 1.0f},
                                {45, 1.0f},
                                {50, 0.0f},
                                {50, 0.125f},
                                {50, 0.75f}});

    film.copyRange({film.track}, 5, 15, 40);

    EXPECT_EQ(film.volumeOf(film.track), "0=0.25 20=0.25 40=0.5 40=0.25 50=0.25 50=0.75");
}

TEST(AutomationInRanges, APointOfTheUsersAtTheEndOfTheDestinationStaysEvenWhereItChangesNothing)
{
    Film film;
    film.addVolume(film.track, {{0, 0.5f}, {50, 0.5f}, {60, 0.5f}});

    film.copyRange({film.track}, 10, 20, 40);

    EXPECT_EQ(film.volumeOf(film.track), "0=0.5 50=0.5 60=0.5");
}

TEST(AutomationInRanges, TheSourceIsReadBeforeADestinationThatBeginsInIt)
{
    Film film;
    film.addVolume(film.track, {{10, 0.0f}, {10, 0.5f}, {20, 0.75f}, {20, 0.0f}});

    film.copyRange({film.track}, 10, 20, 15);

    EXPECT_EQ(film.volumeOf(film.track), "10=0 10=0.5 15=0.625 15=0.5 25=0.75 25=0");
}

TEST(AutomationInRanges, TheSourceIsReadBeforeADestinationThatEndsInIt)
{
    Film film;
    film.addVolume(film.track, {{10, 0.0f}, {10, 0.5f}, {20, 0.75f}, {20, 0.0f}});

    film.copyRange({film.track}, 10, 20, 5);

    EXPECT_EQ(film.volumeOf(film.track), "5=0 5=0.5 15=0.75 15=0.625 20=0.75 20=0");
}

TEST(AutomationInRanges, ACopyOntoItselfChangesNothing)
{
    Film film;
    film.addVolume(film.track, {{10, 0.0f}, {10, 0.5f}, {20, 0.75f}, {20, 0.0f}, {30, 1.0f}});
    const std::string before = film.volumeOf(film.track);

    film.copyRange({film.track}, 10, 20, 10);
    film.copyRange({film.track}, 13, 26, 13);

    EXPECT_EQ(film.volumeOf(film.track), before);
}

TEST(AutomationInRanges, ACopyOntoItselfThatEndsAtAStepOfTheUsersLeavesBothPointsOfIt)
{
    Film film;
    film.addVolume(film.track, {{0, 1.0f}, {10, 0.25f}, {10, 0.75f}, {20, 0.5f}});
    childrenOf(*film.curveOf(film.track, Envelope::Curve::Volume))[1]->setName(nullptr, text(u"door shuts").get(), 0);
    const std::string before = film.dump();

    film.copyRange({film.track}, 4, 10, 4);
    film.copyRange({film.track}, 10, 16, 10);

    EXPECT_EQ(film.dump(), before);
}

TEST(AutomationInRanges, TheEdgesBetweenNeighbouringCopiesCloseAgainInWhateverOrderTheyAreMade)
{
    Film whole;
    Film upward;
    Film downward;
    for (Film* const film : {&whole, &upward, &downward})
        film->addVolume(film->track, {{0, 0.0f}, {16, 1.0f}, {20, 0.5f}});

    whole.copyRange({whole.track}, 4, 18, 40);
    upward.copyRange({upward.track}, 4, 10, 40);
    upward.copyRange({upward.track}, 10, 18, 46);
    downward.copyRange({downward.track}, 10, 18, 46);
    downward.copyRange({downward.track}, 4, 10, 40);

    EXPECT_EQ(whole.volumeOf(whole.track), "0=0 16=1 20=0.5 40=0.5 40=0.25 52=1 54=0.75 54=0.5");
    EXPECT_EQ(upward.dump(), whole.dump());
    EXPECT_EQ(downward.dump(), whole.dump());
}

TEST(AutomationInRanges, AllThatAPointHasTravelsWithIt)
{
    Film film;
    const auto point = film.addPoint(film.track, Envelope::Curve::Volume, 5, 0.5f);
    point->setAttribute("by", FVariant::string("mixer"), true);
    point->setName(nullptr, text(u"dip").get(), 0);
    dynamic_cast<Node&>(*point).setSelected(true);
    dynamic_cast<Node&>(*point).setUnknownMembers(R"({"shape":"s"})");

    film.copyRange({film.track}, 0, 10, 40);

    const auto points = childrenOf(*film.curveOf(film.track, Envelope::Curve::Volume));
    ASSERT_EQ(points.size(), 2U);
    EXPECT_EQ(points[1]->getStart(nullptr), 45.0);
    EXPECT_EQ(points[1]->getName(), std::u16string(u"dip"));
    EXPECT_TRUE(points[1]->isSelected());
    EXPECT_EQ(dynamic_cast<Node&>(*points[1]).unknownMembers(), R"({"shape":"s"})");
    FVariant value;
    ASSERT_EQ(points[1]->getAttribute("by", value), ResultOk);
    EXPECT_STREQ(value.asString(), "mixer");
}

TEST(AutomationInRanges, WhatWouldFallBelowTheStartOfTheProjectIsDropped)
{
    Film film;
    film.addVolume(film.track, {{0, 0.0f}, {2, 0.25f}, {8, 1.0f}});

    film.copyRange({film.track}, 0, 8, -5);

    // Half way up from 0.25 to 1 at first, and from the end on where the curve was at 3 s.
    EXPECT_EQ(film.volumeOf(film.track), "0=0.625 3=1 3=0.375 8=1");
}

TEST(AutomationInRanges, NothingHasToBeHeldBeforeTheStartOfTheProject)
{
    Film film;
    film.addVolume(film.track, {{20, 0.5f}, {40, 1.0f}});

    film.copyRange({film.track}, 30, 40, 0);

    EXPECT_EQ(film.volumeOf(film.track), "0=0.75 10=1 10=0.5 20=0.5 40=1");
}

TEST(AutomationInRanges, PointsLessThanAnInstantBesideTheEdgesStandAtThem)
{
    Film film;
    film.addVolume(film.track, {{10 - Hair, 0.25f}, {10 + Hair, 1.0f}, {20 - Hair, 0.75f}, {20 + Hair, 0.0f}});

    film.copyRange({film.track}, 10, 20, 40);

    const auto points = childrenOf(*film.curveOf(film.track, Envelope::Curve::Volume));
    ASSERT_EQ(points.size(), 8U);
    EXPECT_EQ(film.volumeOf(film.track).substr(film.volumeOf(film.track).find("40=")), "40=0 40=1 50=0.75 50=0");
}

TEST(AutomationInRanges, PointsLessThanAnInstantInsideOfTheDestinationStandAtItsEdges)
{
    Film film;
    film.addVolume(film.track, {{0, 0.25f}, {40 + Hair, 1.0f}, {50 - Hair, 0.75f}});

    film.copyRange({film.track}, 0, 10, 40);

    // The source goes from 0.25 to 0.4375; the outer points are those that stood there.
    const auto points = childrenOf(*film.curveOf(film.track, Envelope::Curve::Volume));
    ASSERT_EQ(points.size(), 5U);
    const auto valueOf = [&](std::size_t index) { return query<IAutomationPoint>(points[index])->getValue(); };
    EXPECT_EQ(points[1]->getStart(nullptr), 40 + Hair);
    EXPECT_EQ(valueOf(1), 1.0f);
    EXPECT_EQ(points[2]->getStart(nullptr), 40 + Hair);
    EXPECT_EQ(valueOf(2), 0.25f);
    EXPECT_EQ(points[3]->getStart(nullptr), 50 - Hair);
    EXPECT_NEAR(valueOf(3), 0.4375f, 1e-6);
    EXPECT_EQ(points[4]->getStart(nullptr), 50 - Hair);
    EXPECT_EQ(valueOf(4), 0.75f);
}

//       o                                      .o.
//     .´ `.                                 ...´   `...
//   .´     `.     without 5 to 15        .o            o.
//  o         o                          o   5    15      o
TEST(AutomationInRanges, DeletingTakesPointsAwayAndTheCurveOutsideStays)
{
    Film film;
    film.addVolume(film.track, {{0, 0.0f}, {10, 1.0f}, {20, 0.0f}});

    film.deleteRange(5, 15);

    EXPECT_EQ(film.volumeOf(film.track), "0=0 5=0.5 15=0.5 20=0");
}

TEST(AutomationInRanges, DeletingAddsNoPointWhereTheCurveOutsideStaysWithoutIt)
{
    Film film;
    film.addVolume(film.track, {{0, 0.0f}, {8, 0.5f}, {10, 0.0f}, {12, 0.75f}, {16, 1.0f}});

    film.deleteRange(8, 12);

    EXPECT_EQ(film.volumeOf(film.track), "0=0 12=0.75 16=1");
}

TEST(AutomationInRanges, DeletingWhereThereAreNoPointsChangesNothing)
{
    Film film;
    film.addVolume(film.track, {{0, 0.0f}, {20, 1.0f}});
    const std::string before = film.dump();

    film.deleteRange(3, 17);
    film.deleteRange(30, 40);

    EXPECT_EQ(film.dump(), before);
}

TEST(AutomationInRanges, DeletingTakesAPointAtTheStartAndLeavesOneAtTheEnd)
{
    Film film;
    film.addVolume(film.track, {{0, 0.5f}, {5, 0.5f}, {10, 1.0f}, {15, 0.5f}, {20, 0.5f}});

    film.deleteRange(5, 15);

    EXPECT_EQ(film.volumeOf(film.track), "0=0.5 15=0.5 20=0.5");
}

TEST(AutomationInRanges, DeletingAllPointsOfACurveLeavesItsValuesOutside)
{
    Film film;
    film.addVolume(film.track, {{10, 0.25f}, {12, 0.75f}});

    film.deleteRange(5, 15);

    EXPECT_EQ(film.volumeOf(film.track), "5=0.25 15=0.75");
}

TEST(AutomationInRanges, DeletingLeavesTheOnlyPointOfACurveWhereItStands)
{
    constexpr double Day = 86400;
    for (const double at : {0.0, 5.0, 10.0, 15.0 - Hair, 15.0}) {
        Film film;
        film.addVolume(film.track, {{at, 0.25f}});
        const std::string before = film.dump();

        film.deleteRange(5, 15);
        film.deleteRange(0, Day);
        film.deleteRange(5, 5 + 2 * Day);

        EXPECT_EQ(film.dump(), before) << at;
    }
}

TEST(AutomationInRanges, WritingTheValueOfACurveOverItsOnlyPointLeavesThePoint)
{
    Film film;
    film.addVolume(film.track, {{50, 0.25f}});
    const std::string before = film.dump();

    film.copyRange({film.track}, 0, 20, 40);

    EXPECT_EQ(film.dump(), before);
}

TEST(AutomationInRanges, DeletingAllOfACurveThatIsOneValueOutsideLeavesTheFirstPointThatHasIt)
{
    Film film;
    film.addVolume(film.track, {{8, 0.5f}, {10, 0.25f}, {12, 0.75f}, {14, 0.25f}});

    film.deleteRange(9, 15);
    EXPECT_EQ(film.volumeOf(film.track), "8=0.5 9=0.375 15=0.25");
    film.deleteRange(0, 100);

    EXPECT_EQ(film.volumeOf(film.track), "15=0.25");
}

TEST(AutomationInRanges, WritingOverTheFirstPointOfAConstantCurveLeavesItWhereTheOtherMayBeFar)
{
    Film film;
    film.addVolume(film.track, {{5, 0.25f}, {86405, 0.25f}});

    film.copyRange({film.track}, 20, 40, 0);
    EXPECT_EQ(film.volumeOf(film.track), "5=0.25 86405=0.25");
    film.deleteRange(86400, 172800);

    EXPECT_EQ(film.volumeOf(film.track), "5=0.25");
}

TEST(AutomationInRanges, ACurveThatHasBecomeConstantIsWrittenToAsBefore)
{
    Film film;
    film.addVolume(film.track, {{10, 0.25f}});
    film.deleteRange(0, 86400);
    film.addPoint(film.track, Envelope::Curve::Volume, 20, 0.75f);

    film.copyRange({film.track}, 15, 25, 40);

    // Up from 0.25 at 10 to 0.75 at 20, and no further.
    EXPECT_EQ(film.volumeOf(film.track), "10=0.25 20=0.75 40=0.75 40=0.5 45=0.75");
}

TEST(AutomationInRanges, DeletingFromTheStartOfTheProjectHoldsNothingBeforeIt)
{
    Film film;
    film.addVolume(film.track, {{0, 0.0f}, {10, 1.0f}, {20, 0.0f}});

    film.deleteRange(0, 15);

    EXPECT_EQ(film.volumeOf(film.track), "15=0.5 20=0");
}

TEST(AutomationInRanges, DeletingACopyLeavesTheBytesOfBefore)
{
    Film film;
    film.addVolume(film.track, {{0, 0.0f}, {16, 1.0f}, {20, 0.25f}, {48, 0.25f}, {60, 0.25f}});
    const std::string before = film.dump();

    film.copyRange({film.track}, 4, 12, 40);
    EXPECT_EQ(film.volumeOf(film.track), "0=0 16=1 20=0.25 40=0.25 48=0.75 48=0.25 60=0.25");
    film.deleteRange(40, 48);

    EXPECT_EQ(film.dump(), before);
}

TEST(AutomationInRanges, APointThatHoldsACurveGoesAlsoAfterTheProjectWasOpenedAnew)
{
    const cadrel::tests::TempFolder folder;
    Film film;
    film.addVolume(film.track, {{0, 0.0f}, {16, 1.0f}, {20, 0.25f}, {60, 0.25f}});
    const std::string before = film.dump();
    film.copyRange({film.track}, 4, 12, 40);
    film.application.saveProject(film.project, folder / "film.stage");

    Project& reopened = film.application.openProject(folder / "film.stage");
    EXPECT_EQ(film.transaction()->begin(true), ResultOk);
    EXPECT_EQ(film.transaction()->deleteRange(&reopened, 0, 40, 48), ResultOk);
    EXPECT_EQ(film.transaction()->commit(&reopened, u"Delete"), ResultOk);

    EXPECT_EQ(ProjectFile::toText(reopened), before);
}

TEST(AutomationInRanges, WritingTheValueOfACurveOverTheFirstOfItsPointsLeavesThePoint)
{
    for (const double second : {30.0, 50.0, 605.0, 605.1, 86405.0}) {
        Film film;
        film.addVolume(film.track, {{5, 0.25f}, {second, 0.25f}});
        const std::string before = film.dump();

        film.copyRange({film.track}, 100000, 100010, 0);

        EXPECT_EQ(film.dump(), before) << second;
    }
}

TEST(AutomationInRanges, APointThatOnlyHoldsACurveMayBeTheOneThatIsLeftBeforeACopy)
{
    Film film;
    const auto held = film.addPoint(film.track, Envelope::Curve::Volume, 5, 0.25f);
    dynamic_cast<AutomationPoint&>(*held).setHolding(true);
    film.addVolume(film.track, {{20, 0.25f}});

    film.copyRange({film.track}, 100, 110, 15);

    EXPECT_EQ(film.volumeOf(film.track), "5=0.25");
}

TEST(AutomationInRanges, DeletingACopyOfTheOnlyPointLeavesTheBytesOfBeforeWhereverItWas)
{
    for (const double destination : {0.0, 30.0, 1000.0, 86400.0}) {
        Film film;
        film.addVolume(film.track, {{50 + destination, 0.25f}});
        const std::string before = film.dump();

        film.copyRange({film.track}, 45 + destination, 55 + destination, destination);
        film.deleteRange(destination, destination + 10);

        EXPECT_EQ(film.dump(), before) << destination;
    }
}

} // namespace standin::tests
