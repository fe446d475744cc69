// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/AutomationCurve.h"

#include "host/border/HostFailure.h"
#include "host/track/TrackIndex.h"
#include "tests/support/NotQuadratic.h"
#include "tests/support/SecondsOf.h"
#include "tests/support/host/AlteredContext.h"
#include "tests/support/host/FakeProject.h"
#include "tests/support/host/TrackHost.h"
#include "tests/support/host/UnmarkedPoint.h"
#include "velmark/Automation.h"
#include "velmark/ClassId.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>
#include <memory>
#include <utility>
#include <vector>

using namespace Velmark;

namespace cadrel::host {

using cadrel::tests::expectNotQuadratic;
using cadrel::tests::secondsOf;
using core::AutomationState;
using tests::AlteredContext;
using tests::FakeNode;
using tests::FakeProject;
using tests::TrackHost;
using tests::UnmarkedPoint;
using util::Result;

namespace {

constexpr int32 Volume = standin::Envelope::Curve::Volume;
constexpr int32 Pan = standin::Envelope::Curve::Pan;
using Points = std::vector<std::pair<double, float>>;

/// One track of sound with curves for volume, pan and mute. Times are the host's, unless `clock` moves them to the
/// project's clock.
class OneTrack : public TrackHost {
public:
    using TrackHost::TrackHost;

    double clock(double seconds) const { return seconds + origin; }

    /// Gives a curve its points.
    void set(int32 curve, const Points& points)
    {
        for (const auto& [time, value] : points)
            addPoint(node, curve, time, value);
    }
    AutomationCurve curve(int32 number) { return {curveOf(node, number).get(), origin}; }
    standin::Envelope& envelope(int32 number) { return dynamic_cast<standin::Envelope&>(*curveOf(node, number)); }
    Points points(int32 number)
    {
        Points points;
        for (const auto& point : standin::tests::childrenOf(*curveOf(node, number)))
            points.emplace_back(point->getStart(nullptr), query<IAutomationPoint>(point)->getValue());
        return points;
    }
    /// Fills a gap of all curves as they stand, by times of the host.
    void fill(double start, double end)
    {
        edit(u"Fill", [&] {
            auto curves = track.prepareVirginRange();
            track.fillAutomationGap(*transaction(), curves, clock(start), clock(end));
        });
    }

    /// Does something to a curve as it stands, in a transaction.
    template <typename Change>
    void change(int32 number, Change change)
    {
        edit(u"Change", [&] {
            AutomationCurve changed = curve(number);
            change(changed);
        });
    }
    /// Hold a stretch of the volume, by times of the host.
    void hold(double start, double end)
    {
        change(Volume,
               [&](AutomationCurve& curve) { curve.hold(context(), *transaction(), clock(start), clock(end)); });
    }
    void holdBackwards(double start, double end)
    {
        change(Volume, [&](AutomationCurve& curve) {
            curve.holdBackwards(context(), *transaction(), clock(start), clock(end));
        });
    }
    void holdLast(double start, double end)
    {
        change(Volume,
               [&](AutomationCurve& curve) { curve.holdLast(context(), *transaction(), clock(start), clock(end)); });
    }

    const Node node = addTrack(TypeWord::Audio, u"FX");
    const Track track = handle(node);
};

class AutomationCurveTest : public testing::TestWithParam<double> {
protected:
    double clock(double seconds) const { return host.clock(seconds); }

    OneTrack host{GetParam()};
};

INSTANTIATE_TEST_SUITE_P(Origins, AutomationCurveTest, testing::Values(0.0, 3600.0));

void expectState(const AutomationState& state, const AutomationState& expected)
{
    EXPECT_EQ(state.leftTime, expected.leftTime);
    EXPECT_EQ(state.leftValue, expected.leftValue);
    EXPECT_EQ(state.rightTime, expected.rightTime);
    EXPECT_EQ(state.rightValue, expected.rightValue);
}

} // namespace

TEST_P(AutomationCurveTest, KnowsWhatItAutomates)
{
    EXPECT_EQ(host.curve(Volume).number(), Volume);
    EXPECT_EQ(host.curve(Pan).number(), Pan);
}

TEST_P(AutomationCurveTest, ACurveWithoutPointsHasNoneOnEitherSide)
{
    expectState(host.curve(Volume).stateAt(clock(5.0)), {-1.0, -1.0, -1.0, -1.0});
}

TEST_P(AutomationCurveTest, FindsTheLastPointAtOrBeforeATimeAndTheFirstAfterIt)
{
    host.set(Volume, {{10.0, 0.25F}, {20.0, 0.5F}, {30.0, 0.75F}});
    const AutomationCurve curve = host.curve(Volume);

    expectState(curve.stateAt(clock(15.0)), {clock(10.0), 0.25, clock(20.0), 0.5});
    expectState(curve.stateAt(clock(20.0)), {clock(20.0), 0.5, clock(30.0), 0.75});
    expectState(curve.stateAt(clock(29.0)), {clock(20.0), 0.5, clock(30.0), 0.75});
}

TEST_P(AutomationCurveTest, HasNoLeftPointBeforeTheFirst)
{
    host.set(Volume, {{10.0, 0.25F}, {20.0, 0.5F}});

    expectState(host.curve(Volume).stateAt(clock(9.0)), {-1.0, -1.0, clock(10.0), 0.25});
}

TEST_P(AutomationCurveTest, HoldsTheLastValueOnItsRight)
{
    host.set(Volume, {{10.0, 0.25F}, {20.0, 0.5F}});

    expectState(host.curve(Volume).stateAt(clock(25.0)), {clock(20.0), 0.5, clock(25.0), 0.5});
    expectState(host.curve(Volume).stateAt(clock(20.0)), {clock(20.0), 0.5, clock(20.0), 0.5});
}

TEST_P(AutomationCurveTest, OfPointsAtOneTimeTheLastIsOnTheLeft)
{
    host.set(Volume, {{10.0, 0.25F}, {10.0, 1.0F}, {20.0, 0.5F}});

    expectState(host.curve(Volume).stateAt(clock(10.0)), {clock(10.0), 1.0, clock(20.0), 0.5});
    expectState(host.curve(Volume).stateAt(clock(9.0)), {-1.0, -1.0, clock(10.0), 0.25});
}

TEST_P(AutomationCurveTest, APointWithinAnInstantBehindATimeIsAtIt)
{
    host.set(Volume, {{10.0, 0.25F}, {20.0, 0.5F}});

    expectState(host.curve(Volume).stateAt(clock(20.0 - core::SameInstant / 2)),
                {clock(20.0), 0.5, clock(20.0 - core::SameInstant / 2), 0.5});
}

TEST_P(AutomationCurveTest, RefusesWhatIsNoCurve)
{
    const auto node = makeCounted<FakeNode>();

    EXPECT_EQ(resultOf([&] { AutomationCurve(static_cast<IProjectNode*>(node.get()), 0.0); }),
              Result::HostObjectMissing);
    EXPECT_EQ(resultOf([&] { AutomationCurve(nullptr, 0.0); }), Result::HostObjectMissing);
}

TEST_P(AutomationCurveTest, RefusesATrackWhoseAutomationIsNone)
{
    const auto project = makeCounted<FakeProject>(GetParam());
    Project adapter(host.context(), project.get());
    const auto node = makeCounted<FakeNode>();
    node->automation = create<IObjectList>(host.context());
    const Track track(&adapter, node.get());
    EXPECT_TRUE(track.prepareVirginRange().empty());

    ASSERT_EQ(node->automation->add(static_cast<IProjectNode*>(node.get()), 0), ResultOk);

    EXPECT_EQ(resultOf([&] { track.prepareVirginRange(); }), Result::HostObjectMissing);
    EXPECT_EQ(resultOf([&] { track.readIndex(); }), Result::HostObjectMissing);
    node->automation.reset();
}

//     value  1 |        /\            the points inside go, and the curve runs straight from its
//              |   ____/  \____       value at the start of the gap to that at its end
//            0 +---10------20---
TEST_P(AutomationCurveTest, AGapRunsStraightFromItsStartToItsEnd)
{
    host.set(Volume, {{0.0, 0.0F}, {20.0, 1.0F}, {22.0, 0.5F}, {30.0, 0.25F}, {40.0, 0.75F}});

    host.fill(10.0, 35.0);

    EXPECT_EQ(host.points(Volume), (Points{{0.0, 0.0F}, {10.0, 0.5F}, {35.0, 0.5F}, {40.0, 0.75F}}));
}

TEST_P(AutomationCurveTest, PointsAtTheBoundsOfAGapAreReplacedByOneEach)
{
    host.set(Volume, {{5.0, 0.25F}, {10.0, 0.5F}, {15.0, 1.0F}, {20.0, 0.75F}, {25.0, 0.0F}});

    host.fill(10.0, 20.0);

    EXPECT_EQ(host.points(Volume), (Points{{5.0, 0.25F}, {10.0, 0.5F}, {20.0, 0.75F}, {25.0, 0.0F}}));
}

//     carried over ..--|          |--.. carried over     where the curve jumps to what was there before, the gap
//                      |__________|                      goes from what was carried over to what was carried over
//                    start       end
TEST_P(AutomationCurveTest, AGapGoesOnFromWhatTheCurveComesToAndEndsWithWhatItGoesOnWith)
{
    host.set(Volume, {{5.0, 1.0F}, {10.0, 1.0F}, {10.0, 0.0F}, {20.0, 0.0F}, {20.0, 0.5F}, {25.0, 0.5F}});

    host.fill(10.0, 20.0);

    EXPECT_EQ(host.points(Volume), (Points{{5.0, 1.0F}, {10.0, 1.0F}, {20.0, 0.5F}, {25.0, 0.5F}}));
}

TEST_P(AutomationCurveTest, AGapBesideAllPointsIsHeldAtTheNearest)
{
    host.set(Volume, {{10.0, 0.25F}, {20.0, 0.75F}});

    host.fill(1.0, 2.0);
    host.fill(30.0, 40.0);

    EXPECT_EQ(host.points(Volume),
              (Points{{1.0, 0.25F}, {2.0, 0.25F}, {10.0, 0.25F}, {20.0, 0.75F}, {30.0, 0.75F}, {40.0, 0.75F}}));
}

TEST_P(AutomationCurveTest, AGapFillsEachCurveOfTheTrackByItself)
{
    host.set(Volume, {{0.0, 0.0F}, {40.0, 1.0F}});
    host.set(Pan, {{15.0, 0.5F}});

    host.fill(10.0, 20.0);

    EXPECT_EQ(host.points(Volume), (Points{{0.0, 0.0F}, {10.0, 0.25F}, {20.0, 0.5F}, {40.0, 1.0F}}));
    EXPECT_EQ(host.points(Pan), (Points{{10.0, 0.5F}, {20.0, 0.5F}}));
    EXPECT_EQ(host.points(standin::Envelope::Curve::Mute), Points());
}

TEST_P(AutomationCurveTest, GapsOneAfterTheOtherSeeWhatThoseBeforeThemWrote)
{
    host.set(Volume, {{0.0, 0.0F}, {10.0, 1.0F}, {20.0, 0.0F}, {30.0, 1.0F}, {40.0, 0.0F}});

    host.edit(u"Fill", [&] {
        auto curves = host.track.prepareVirginRange();
        // From 0.5 to 0.5; then from 0.5, the half of which is at 20, to 1.0; then again over the first bound.
        host.track.fillAutomationGap(*host.transaction(), curves, clock(5.0), clock(25.0));
        host.track.fillAutomationGap(*host.transaction(), curves, clock(15.0), clock(30.0));
        host.track.fillAutomationGap(*host.transaction(), curves, clock(2.5), clock(5.0));
    });

    EXPECT_EQ(host.points(Volume),
              (Points{{0.0, 0.0F}, {2.5, 0.25F}, {5.0, 0.5F}, {15.0, 0.5F}, {30.0, 1.0F}, {40.0, 0.0F}}));
}

TEST_P(AutomationCurveTest, AReversedGapIsLeftAlone)
{
    host.set(Volume, {{10.0, 0.25F}, {20.0, 0.75F}});

    host.fill(20.0, 10.0);

    EXPECT_EQ(host.points(Volume), (Points{{10.0, 0.25F}, {20.0, 0.75F}}));
}

TEST_P(AutomationCurveTest, PointsOfTheUsersAtTheBoundsOfAHeldStretchStayWhatTheyAre)
{
    host.set(Volume, {{10.0, 0.5F}, {15.0, 1.0F}, {20.0, 0.75F}});
    const auto before = standin::tests::childrenOf(*host.curveOf(host.node, Volume));
    const auto expectKept = [&] {
        const auto after = standin::tests::childrenOf(*host.curveOf(host.node, Volume));
        ASSERT_GE(after.size(), 2U);
        EXPECT_EQ(after.front(), before.front());
        EXPECT_EQ(after.back(), before.back());
    };

    host.hold(10.0, 20.0);
    expectKept();
    EXPECT_EQ(host.points(Volume), (Points{{10.0, 0.5F}, {20.0, 0.5F}, {20.0, 0.75F}}));
    ASSERT_TRUE(host.undo());
    host.holdBackwards(10.0, 20.0);
    expectKept();
    EXPECT_EQ(host.points(Volume), (Points{{10.0, 0.5F}, {10.0, 0.75F}, {20.0, 0.75F}}));
}

TEST_P(AutomationCurveTest, WhatIsHeldGoesWhereTheCurveRunsTheSameWithoutIt)
{
    host.set(Volume, {{0.0, 0.5F}, {11.0, 0.5F}, {11.0, 1.0F}, {19.0, 1.0F}, {19.0, 0.5F}, {40.0, 0.5F}});
    host.hold(10.0, 20.0);
    ASSERT_EQ(host.points(Volume), (Points{{0.0, 0.5F}, {10.0, 0.5F}, {20.0, 0.5F}, {40.0, 0.5F}}));
    const auto drop = [&](double start, double end) {
        host.change(Volume,
                    [&](AutomationCurve& curve) { curve.dropNeedless(*host.transaction(), clock(start), clock(end)); });
    };

    drop(21.0, 40.0);
    EXPECT_EQ(host.points(Volume).size(), 4U) << "Those that go stand elsewhere.";
    drop(20.0, 40.0);
    EXPECT_EQ(host.points(Volume), (Points{{0.0, 0.5F}, {10.0, 0.5F}, {40.0, 0.5F}}));
    drop(0.0, 40.0);
    EXPECT_EQ(host.points(Volume), (Points{{0.0, 0.5F}, {40.0, 0.5F}}));
    host.fill(10.0, 20.0);
    drop(0.0, 40.0);
    EXPECT_EQ(host.points(Volume).size(), 4U) << "What fills a gap stays.";
}

TEST_P(AutomationCurveTest, WhatIsHeldStaysWhereTheCurveNeedsIt)
{
    host.set(Volume, {{0.0, 0.0F}, {40.0, 1.0F}});
    host.hold(10.0, 20.0);

    host.change(Volume,
                [&](AutomationCurve& curve) { curve.dropNeedless(*host.transaction(), clock(0.0), clock(40.0)); });

    EXPECT_EQ(host.points(Volume), (Points{{0.0, 0.0F}, {10.0, 0.25F}, {20.0, 0.25F}, {20.0, 0.5F}, {40.0, 1.0F}}));
}

TEST_P(AutomationCurveTest, WhatTheUserHasSetStaysAlsoWhereTheCurveRunsTheSameWithoutIt)
{
    host.set(Volume, {{0.0, 0.5F}, {5.0, 0.5F}, {11.0, 0.5F}, {11.0, 1.0F}, {19.0, 1.0F}, {19.0, 0.5F}});
    host.hold(10.0, 20.0);
    ASSERT_EQ(host.points(Volume), (Points{{0.0, 0.5F}, {5.0, 0.5F}, {10.0, 0.5F}, {20.0, 0.5F}}));
    const auto points = standin::tests::childrenOf(*host.curveOf(host.node, Volume));
    const auto setAll = [&](float value) {
        host.edit(u"Set", [&] {
            for (const auto& point : points)
                query<IAutomationPoint>(point)->setValue(value);
        });
    };
    const auto drop = [&] {
        host.change(Volume,
                    [&](AutomationCurve& curve) { curve.dropNeedless(*host.transaction(), clock(0.0), clock(40.0)); });
    };

    setAll(0.75F);
    drop();
    EXPECT_EQ(host.points(Volume).size(), 4U) << "He has given them all another value.";
    setAll(0.5F);
    drop();
    EXPECT_EQ(host.points(Volume), (Points{{0.0, 0.5F}, {5.0, 0.5F}}));
}

TEST_P(AutomationCurveTest, RunsTheSameWhereTheHostsPointsTakeNoMarks)
{
    host.set(Volume, {{0.0, 0.0F}, {40.0, 1.0F}});
    AlteredContext context(host.context());
    context.makeInstead(ClassId::AutomationPoint, [] { return makeCounted<UnmarkedPoint>(); });

    host.change(Volume, [&](AutomationCurve& curve) {
        curve.hold(&context, *host.transaction(), clock(10.0), clock(20.0));
        curve.fill(&context, *host.transaction(), clock(30.0), clock(35.0));
        curve.dropNeedless(*host.transaction(), clock(0.0), clock(40.0));
    });

    EXPECT_EQ(
        host.points(Volume),
        (Points{{0.0, 0.0F}, {10.0, 0.25F}, {20.0, 0.25F}, {20.0, 0.5F}, {30.0, 0.75F}, {35.0, 0.875F}, {40.0, 1.0F}}));
}

TEST_P(AutomationCurveTest, FilledGapsAreUndoneWithTheirTransaction)
{
    host.set(Volume, {{0.0, 0.0F}, {15.0, 1.0F}, {30.0, 0.25F}});
    const std::string before = host.dump();

    host.fill(10.0, 20.0);
    ASSERT_NE(host.dump(), before);
    ASSERT_TRUE(host.undo());

    EXPECT_EQ(host.dump(), before);
}

//     before   1.0 --|          |-- 0.5         after   1.0 -------------|
//                    |___0.0____|                                        |-- 0.5
TEST_P(AutomationCurveTest, AHeldStretchKeepsWhatTheCurveComesToAndStepsAtItsEnd)
{
    host.set(Volume,
             {{5.0, 1.0F}, {10.0, 1.0F}, {10.0, 0.0F}, {15.0, 0.25F}, {20.0, 0.0F}, {20.0, 0.5F}, {25.0, 0.5F}});

    host.hold(10.0, 20.0);

    EXPECT_EQ(host.points(Volume), (Points{{5.0, 1.0F}, {10.0, 1.0F}, {20.0, 1.0F}, {20.0, 0.5F}, {25.0, 0.5F}}));
}

TEST_P(AutomationCurveTest, AStretchThatIsHeldBackwardsHasWhatTheCurveGoesOnWithAndStepsAtItsStart)
{
    host.set(Volume,
             {{5.0, 1.0F}, {10.0, 1.0F}, {10.0, 0.0F}, {15.0, 0.25F}, {20.0, 0.0F}, {20.0, 0.5F}, {25.0, 0.75F}});

    host.holdBackwards(10.0, 20.0);

    EXPECT_EQ(host.points(Volume), (Points{{5.0, 1.0F}, {10.0, 1.0F}, {10.0, 0.5F}, {20.0, 0.5F}, {25.0, 0.75F}}));
}

TEST_P(AutomationCurveTest, AHeldStretchOnASlopeLeavesTheSlopeOutsideOfIt)
{
    host.set(Volume, {{0.0, 0.0F}, {40.0, 1.0F}});

    host.hold(10.0, 20.0);
    EXPECT_EQ(host.points(Volume), (Points{{0.0, 0.0F}, {10.0, 0.25F}, {20.0, 0.25F}, {20.0, 0.5F}, {40.0, 1.0F}}));

    host.holdBackwards(24.0, 32.0);
    EXPECT_EQ(host.points(Volume), (Points{{0.0, 0.0F},
                                           {10.0, 0.25F},
                                           {20.0, 0.25F},
                                           {20.0, 0.5F},
                                           {24.0, 0.6F},
                                           {24.0, 0.8F},
                                           {32.0, 0.8F},
                                           {40.0, 1.0F}}));
}

TEST_P(AutomationCurveTest, AStretchThatIsLevelAlreadyGetsNoPoints)
{
    const Points level{{5.0, 1.0F}, {10.0, 0.5F}, {15.0, 0.5F}, {20.0, 0.5F}, {20.0, 1.0F}, {25.0, 0.0F}};
    host.set(Volume, level);

    host.hold(10.0, 20.0);
    host.hold(12.0, 18.0);
    host.holdBackwards(10.0, 18.0);
    host.hold(30.0, 40.0);
    host.holdBackwards(1.0, 5.0);

    EXPECT_EQ(host.points(Volume), level);
    // The slope before it ends with it.
    host.hold(9.0, 20.0);
    EXPECT_NE(host.points(Volume), level);
}

TEST_P(AutomationCurveTest, AnOutlierInAStretchIsHeldOver)
{
    host.set(Volume, {{10.0, 0.5F}, {14.0, 0.5F}, {15.0, 1.0F}, {16.0, 0.5F}, {20.0, 0.5F}});

    host.hold(12.0, 18.0);

    EXPECT_EQ(host.points(Volume), (Points{{10.0, 0.5F}, {12.0, 0.5F}, {18.0, 0.5F}, {20.0, 0.5F}}));
}

TEST_P(AutomationCurveTest, AStretchShorterThanAnInstantOrReversedIsNotHeld)
{
    const Points slope{{0.0, 0.0F}, {40.0, 1.0F}};
    host.set(Volume, slope);

    host.hold(20.0, 10.0);
    host.hold(10.0, 10.0);
    host.hold(10.0, 10.0 + 0.9 / 384000);
    host.holdBackwards(10.0, 10.0 + 0.9 / 384000);
    EXPECT_EQ(host.points(Volume), slope);

    host.hold(10.0, 10.0 + 1.1 / 384000);
    EXPECT_EQ(host.points(Volume).size(), 5U);
}

TEST_P(AutomationCurveTest, ACurveWithoutPointsIsNotHeld)
{
    host.hold(10.0, 20.0);
    host.holdBackwards(10.0, 20.0);
    host.holdLast(10.0, 20.0);

    EXPECT_EQ(host.points(Volume), Points());
}

TEST_P(AutomationCurveTest, WhatACurveComesToLastIsHeldForGood)
{
    host.set(Volume, {{5.0, 1.0F}, {10.0, 0.5F}, {10.0, 0.0F}, {15.0, 0.25F}, {20.0, 0.75F}});

    host.holdLast(10.0, 20.0);
    EXPECT_EQ(host.points(Volume), (Points{{5.0, 1.0F}, {10.0, 0.5F}}));

    host.holdLast(10.0, 20.0);
    host.holdLast(30.0, 40.0);
    EXPECT_EQ(host.points(Volume), (Points{{5.0, 1.0F}, {10.0, 0.5F}}));
}

TEST_P(AutomationCurveTest, WhatACurveComesToLastIsHeldUpToTheEndWherePointsStandAfterIt)
{
    host.set(Volume, {{10.0, 0.5F}, {10.0, 0.0F}, {21.0, 0.0F}, {30.0, 1.0F}});

    host.holdLast(10.0, 20.0);

    EXPECT_EQ(host.points(Volume), (Points{{10.0, 0.5F}, {20.0, 0.5F}, {20.0, 0.0F}, {21.0, 0.0F}, {30.0, 1.0F}}));
}

TEST_P(AutomationCurveTest, HeldStretchesAreUndoneWithTheirTransaction)
{
    host.set(Volume, {{0.0, 0.0F}, {15.0, 1.0F}, {30.0, 0.25F}});
    const std::string before = host.dump();

    host.hold(10.0, 20.0);
    ASSERT_NE(host.dump(), before);
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.dump(), before);

    host.holdLast(10.0, 40.0);
    ASSERT_NE(host.dump(), before);
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.dump(), before);
}

TEST_P(AutomationCurveTest, TracksWithoutAutomationHaveNoCurves)
{
    EXPECT_TRUE(host.handle(host.addTrack(TypeWord::Marker, u"Memos")).prepareVirginRange().empty());
    EXPECT_TRUE(host.handle(host.addTrack(TypeWord::Folder, u"Sound")).prepareVirginRange().empty());
    EXPECT_EQ(host.track.prepareVirginRange().size(), 3U);
}

TEST_P(AutomationCurveTest, ReportsWhatTheHostRefuses)
{
    host.set(Volume, {{10.0, 0.25F}, {20.0, 0.75F}});
    auto curves = host.track.prepareVirginRange();

    // No transaction is open.
    EXPECT_EQ(resultOf([&] { host.track.fillAutomationGap(*host.transaction(), curves, clock(11.0), clock(12.0)); }),
              Result::HostCallFailed);
}

TEST_P(AutomationCurveTest, ReportsAPointBeforeTheBeginningOfTheProject)
{
    host.set(Volume, {{10.0, 0.25F}});
    auto curves = host.track.prepareVirginRange();

    host.edit(u"Fill", [&] {
        EXPECT_EQ(
            resultOf([&] { host.track.fillAutomationGap(*host.transaction(), curves, clock(-1.0), clock(12.0)); }),
            Result::HostCallFailed);
    });
}

TEST_P(AutomationCurveTest, MissesPointsWhereTheHostMakesNone)
{
    host.set(Volume, {{10.0, 0.25F}});
    AlteredContext context(host.context());
    context.hide(ClassId::AutomationPoint);
    Project adapter(&context, host.document());
    const Track track(&adapter, query<ITrackNode>(host.node).get());
    auto curves = track.prepareVirginRange();

    EXPECT_EQ(resultOf([&] { track.fillAutomationGap(*host.transaction(), curves, clock(1.0), clock(2.0)); }),
              Result::HostObjectMissing);
}

/// A curve with random points, and what it came to and went on with at each quarter of a second up to 40 s.
class RandomVolume : public OneTrack {
public:
    RandomVolume() : OneTrack(*rc::gen::element(0.0, 3600.0))
    {
        const auto drawn = *rc::gen::nonEmpty(rc::gen::container<std::vector<std::pair<int, int>>>(
            rc::gen::pair(rc::gen::inRange(0, 32), rc::gen::inRange(0, 17))));
        for (const auto& [time, value] : drawn)
            addPoint(node, Volume, time, static_cast<float>(value) / 16.0F);
        for (int time = 0; time <= Quarters; ++time)
            m_before.emplace_back(*envelope(Volume).valueBefore(time / 4.0), *envelope(Volume).valueBehind(time / 4.0));
    }

    double cameTo(double time) const { return m_before[static_cast<std::size_t>(time * 4.0)].first; }
    double wentOnWith(double time) const { return m_before[static_cast<std::size_t>(time * 4.0)].second; }

    /// Asserts that the curve is as it was but for the stretch, in which it has the values that are given.
    template <typename Value>
    void expectChanged(double from, double to, Value valueInside)
    {
        const auto isSame = [](double a, double b) { return std::abs(a - b) < 1e-6; };
        for (int quarter = 0; quarter <= Quarters; ++quarter) {
            const double time = quarter / 4.0;
            const double before = time > from && time <= to ? valueInside(time) : cameTo(time);
            const double behind = time >= from && time < to ? valueInside(time) : wentOnWith(time);
            RC_ASSERT(isSame(*envelope(Volume).valueBefore(time), before));
            RC_ASSERT(isSame(*envelope(Volume).valueBehind(time), behind));
        }
    }

    const double start = *rc::gen::inRange(0, 60) / 2.0;
    const double end = start + *rc::gen::inRange(1, 20) / 2.0;

private:
    static constexpr int Quarters = 160;

    std::vector<std::pair<double, double>> m_before;
};

TEST(AutomationCurve, HoldingManyStretchesOneAfterTheOtherIsNotQuadratic)
{
    const auto secondsToHold = [](int count) {
        OneTrack host(0.0);
        host.edit(u"Points", [&] {
            for (int index = 0; index < count; ++index)
                host.addPoint(host.node, Volume, index, index % 2 == 0 ? 0.25F : 0.75F);
        });
        double seconds = 0.0;
        host.change(Volume, [&](AutomationCurve& curve) {
            seconds = secondsOf([&] {
                for (int index = 0; index + 1 < count; ++index)
                    curve.hold(host.context(), *host.transaction(), index + 0.25, index + 0.75);
            });
        });
        return seconds;
    };

    expectNotQuadratic(5000, secondsToHold);
}

RC_GTEST_PROP(AutomationCurveLaw, FillingAGapChangesNothingOutsideOfItAndIsStraightInside, ())
{
    RandomVolume host;

    host.fill(host.start, host.end);

    host.expectChanged(host.start, host.end, [&](double time) {
        return std::lerp(host.cameTo(host.start), host.wentOnWith(host.end),
                         (time - host.start) / (host.end - host.start));
    });
}

RC_GTEST_PROP(AutomationCurveLaw, HoldingAStretchChangesNothingOutsideOfItAndIsLevelInside, ())
{
    RandomVolume host;

    if (*rc::gen::arbitrary<bool>()) {
        host.hold(host.start, host.end);
        host.expectChanged(host.start, host.end, [&](double) { return host.cameTo(host.start); });
    } else {
        host.holdBackwards(host.start, host.end);
        host.expectChanged(host.start, host.end, [&](double) { return host.wentOnWith(host.end); });
    }
}

} // namespace cadrel::host
