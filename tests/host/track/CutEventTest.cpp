// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/CutEvent.h"

#include "host/border/HostFailure.h"
#include "host/track/TrackIndexes.h"
#include "standin/project/Envelope.h"
#include "tests/support/host/FakeProject.h"
#include "tests/support/host/TrackHost.h"
#include "velmark/Automation.h"
#include "velmark/Events.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

using namespace Velmark;

namespace cadrel::host {

using core::AutomationState;
using core::CutEventSpans;
using core::SecondsRange;
using tests::FakeNode;
using tests::FakeProject;
using tests::TrackHost;
using util::Result;

namespace {

constexpr int32 Volume = standin::Envelope::Curve::Volume;
constexpr int32 Pan = standin::Envelope::Curve::Pan;
constexpr int32 Mute = standin::Envelope::Curve::Mute;
constexpr SecondsRange None;

/// With a clock that begins at 0 and with one that begins at 01:00:00:00. Times of the project's clock are given
/// through `clock` and `span`.
class CutEventTest : public testing::TestWithParam<double> {
protected:
    double clock(double seconds) const { return seconds + GetParam(); }
    SecondsRange span(double start, double end) const { return {clock(start), clock(end)}; }

    TrackHost host{GetParam()};
    TrackIndexes indexes;
    const TrackHost::Node fxNode = host.addTrack(TypeWord::Audio, u"FX");
    CutEvent fx{host.handle(fxNode), indexes};
};

INSTANTIATE_TEST_SUITE_P(Origins, CutEventTest, testing::Values(0.0, 3600.0));

bool isSame(const AutomationState& a, const AutomationState& b)
{
    return a.leftTime == b.leftTime && a.leftValue == b.leftValue && a.rightTime == b.rightTime &&
           a.rightValue == b.rightValue;
}

bool isSame(const CutEventSpans& a, const CutEventSpans& b)
{
    return a.across == b.across && a.before == b.before && a.after == b.after &&
           std::ranges::equal(a.automation, b.automation, [](const auto& one, const auto& other) {
               return one.first == other.first && isSame(one.second, other.second);
           });
}

/// Where an event stands, in host time.
SecondsRange spanOf(IProjectNode& event)
{
    SecondsRange span{event.getStart(nullptr), event.getEnd(nullptr)};
    for (IEventNode* owner = query<IEventNode>(&event)->getOwner(); owner; owner = owner->getOwner())
        span.end = query<IProjectNode>(owner)->getEnd(nullptr);
    return span;
}

SecondsRange moved(const SecondsRange& span, double origin)
{
    return span == None ? None : SecondsRange{span.start + origin, span.end + origin};
}

/// What stands around a time of the project's clock by walks over the events and over each curve. For times of which no
/// two are closer than an instant without being equal.
CutEventSpans walk(IProjectNode& track, double time, double origin)
{
    CutEventSpans found;
    const double hostTime = time - origin;
    double lastStart = 0.0;
    double lastEnd = 0.0;
    for (const auto& child : standin::tests::childrenOf(track)) {
        if (child->getStart(nullptr) <= lastEnd) {
            if (child->getEnd(nullptr) <= lastEnd)
                continue;
            if (child->getStart(nullptr) < lastStart)
                throw Result::InvalidArgument;
        }
        const SecondsRange span = spanOf(*child);
        lastStart = span.start;
        if (hostTime > span.end) {
            if (found.before.start == found.before.end || span.end > found.before.end)
                found.before = span;
        } else if (hostTime < span.start) {
            found.after = span;
            break;
        } else {
            found.across = span;
        }
        lastEnd = span.end;
    }
    for (SecondsRange* const span : {&found.across, &found.before, &found.after})
        *span = moved(*span, origin);

    const auto curves = Counted<IObjectList>::adopt(query<ITrackNode>(&track)->getAutomation());
    for (int32 index = 0; index < curves->count(); ++index) {
        const auto curve = query<IProjectNode>(curves->at(index));
        AutomationState state;
        for (const auto& point : standin::tests::childrenOf(*curve)) {
            const double pointTime = point->getStart(nullptr) + origin;
            const double value = query<IAutomationPoint>(point)->getValue();
            if (pointTime > time) {
                state.rightTime = pointTime;
                state.rightValue = value;
                break;
            }
            state.leftTime = pointTime;
            state.leftValue = value;
        }
        const bool isOnlyLeft = state.leftTime != -1.0 && state.rightTime == -1.0;
        if (isOnlyLeft) {
            state.rightTime = time;
            state.rightValue = state.leftValue;
        }
        found.automation[query<IEnvelopeTrack>(curve)->curveNumber()] = state;
    }
    return found;
}

/// Clips, parts with clips in them and automation on a track, on eighths of a second.
TrackHost::Node randomTrack(TrackHost& host)
{
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto time = rc::gen::inRange(0, 80);
    host.edit(u"Fill the track", [&] {
        for (const auto& [start, length] :
             *rc::gen::container<std::vector<std::pair<int, int>>>(rc::gen::pair(time, rc::gen::inRange(0, 30)))) {
            if (*rc::gen::weightedElement<bool>({{3, true}, {1, false}})) {
                host.addClip(track, u"clip", start / 8.0, (start + length) / 8.0);
            } else {
                const auto part = host.addPart(track, u"part", start / 8.0, (start + length) / 8.0);
                host.addClip(part, u"inside", start / 8.0, (start + length / 2) / 8.0);
            }
        }
        for (const int32 curve : {Volume, Pan}) {
            for (const auto& [at, value] :
                 *rc::gen::container<std::vector<std::pair<int, int>>>(rc::gen::pair(time, rc::gen::inRange(0, 9))))
                host.addPoint(track, curve, at / 8.0, static_cast<float>(value) / 8.0F);
        }
    });
    return track;
}

} // namespace

TEST_P(CutEventTest, HoldsItsFourTimes)
{
    fx.setSrcIn(1.0);
    fx.setSrcOut(2.0);
    fx.setDstIn(3.0);
    fx.setDstOut(4.0);

    EXPECT_EQ(std::vector({fx.srcIn(), fx.srcOut(), fx.dstIn(), fx.dstOut()}), (std::vector{1.0, 2.0, 3.0, 4.0}));
}

TEST_P(CutEventTest, KnowsItsTrack)
{
    CutEvent memos(host.handle(host.addTrack(TypeWord::Marker, u"Memos")), indexes);

    EXPECT_EQ(fx.track(), host.handle(fxNode));
    EXPECT_EQ(fx.getTrackName(), L"FX");
    EXPECT_TRUE(fx.isAudio());
    EXPECT_EQ(memos.getTrackName(), L"Memos");
    EXPECT_FALSE(memos.isAudio());
}

TEST_P(CutEventTest, FindsTheEventsAroundATimeByTheProjectsClock)
{
    host.addClip(fxNode, u"before", 1.0, 2.0);
    host.addClip(fxNode, u"across", 3.0, 4.0);
    host.addClip(fxNode, u"after", 5.0, 6.0);

    const CutEventSpans spans = fx.update(clock(3.5));

    EXPECT_EQ(spans.before, span(1.0, 2.0));
    EXPECT_EQ(spans.across, span(3.0, 4.0));
    EXPECT_EQ(spans.after, span(5.0, 6.0));
}

TEST_P(CutEventTest, WhereNothingStandsTheSpansAreZeroWhateverTheOrigin)
{
    const CutEventSpans spans = fx.update(clock(3.5));

    EXPECT_EQ(spans.before, None);
    EXPECT_EQ(spans.across, None);
    EXPECT_EQ(spans.after, None);
}

TEST_P(CutEventTest, APartIsOneSpan)
{
    const auto part = host.addPart(fxNode, u"part", 2.0, 8.0);
    host.addClip(part, u"inside", 3.0, 4.0);

    EXPECT_EQ(fx.update(clock(6.0)).across, span(2.0, 8.0));
}

TEST_P(CutEventTest, OfTwoThatMeetTheLaterIsAcrossAlsoWhereTheTimeLosesTheOriginOnItsWay)
{
    // 3610.1 - 3600 is a hair below 10.1.
    host.addClip(fxNode, u"earlier", 5.0, 10.1);
    host.addClip(fxNode, u"later", 10.1, 12.0);

    const CutEventSpans spans = fx.update(clock(10.1));

    EXPECT_EQ(spans.across, span(10.1, 12.0));
    EXPECT_EQ(spans.before, None);
}

TEST_P(CutEventTest, FindsTheAutomationAroundATimeByCurves)
{
    host.addPoint(fxNode, Volume, 1.0, 0.25F);
    host.addPoint(fxNode, Volume, 5.0, 0.5F);
    host.addPoint(fxNode, Pan, 9.0, 1.0F);

    const auto automation = fx.update(clock(3.5)).automation;

    ASSERT_EQ(automation.size(), 3U);
    EXPECT_TRUE(isSame(automation.at(Volume), {clock(1.0), 0.25, clock(5.0), 0.5}));
    EXPECT_TRUE(isSame(automation.at(Pan), {-1.0, -1.0, clock(9.0), 1.0}));
    EXPECT_TRUE(isSame(automation.at(Mute), {-1.0, -1.0, -1.0, -1.0}));
}

TEST_P(CutEventTest, TracksWithoutAutomationHaveSpansAlone)
{
    const auto node = host.addTrack(TypeWord::Marker, u"Memos");
    host.addRangeMarker(node, u"memo", 2.0, 4.0);
    CutEvent memos(host.handle(node), indexes);

    EXPECT_EQ(memos.update(clock(3.0)).across, span(2.0, 4.0));
    EXPECT_TRUE(memos.update(clock(3.0)).automation.empty());
}

TEST_P(CutEventTest, MissesTheTrackThatHasGone)
{
    host.addClip(fxNode, u"clip", 1.0, 2.0);
    EXPECT_EQ(fx.update(clock(1.5)).across, span(1.0, 2.0));

    host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), fxNode.get())); });

    EXPECT_EQ(resultOf([&] { fx.update(clock(1.5)); }), Result::HostObjectMissing);
    EXPECT_EQ(fx.getTrackName(), L"");
    EXPECT_FALSE(fx.isAudio());
    EXPECT_EQ(resultOf([&] { CutEvent(Track(), indexes).update(clock(1.5)); }), Result::HostObjectMissing);
}

TEST_P(CutEventTest, FailsBehindEventsInNoOrder)
{
    const auto project = makeCounted<FakeProject>(GetParam());
    Project adapter(host.context(), project.get());
    const auto track = makeCounted<FakeNode>();
    track->children = {makeCounted<FakeNode>(1.0, 2.0), makeCounted<FakeNode>(4.0, 6.0),
                       makeCounted<FakeNode>(3.0, 8.0)};
    CutEvent cutEvent(Track(&adapter, track.get()), indexes);

    EXPECT_EQ(cutEvent.update(clock(1.5)).after, span(4.0, 6.0));
    EXPECT_EQ(resultOf([&] { cutEvent.update(clock(5.0)); }), Result::InvalidArgument);

    indexes.clear();
    track->children = {makeCounted<FakeNode>(1.0, 2.0), makeCounted<FakeNode>(6.0, 5.0)};
    EXPECT_EQ(cutEvent.update(clock(0.5)).after, span(1.0, 2.0));
    EXPECT_EQ(resultOf([&] { cutEvent.update(clock(1.5)); }), Result::InvalidArgument);
}

TEST_P(CutEventTest, TellsWhatStoodThereUntilTheIndexesAreCleared)
{
    EXPECT_EQ(fx.update(clock(1.5)).across, None);

    host.addClip(fxNode, u"clip", 1.0, 2.0);
    EXPECT_EQ(fx.update(clock(1.5)).across, None);
    indexes.clear();

    EXPECT_EQ(fx.update(clock(1.5)).across, span(1.0, 2.0));
}

TEST_P(CutEventTest, CutEventsOfOneTrackShareItsIndexAndThoseOfOthersDoNot)
{
    const auto foleyNode = host.addTrack(TypeWord::Audio, u"Foley");
    CutEvent second(host.handle(fxNode), indexes);
    CutEvent foley(host.handle(foleyNode), indexes);
    ASSERT_EQ(fx.update(clock(1.5)).across, None);

    host.addClip(fxNode, u"clip", 1.0, 2.0);
    host.addClip(foleyNode, u"clip", 1.0, 3.0);

    EXPECT_EQ(second.update(clock(1.5)).across, None);
    EXPECT_EQ(foley.update(clock(1.5)).across, span(1.0, 3.0));
    EXPECT_EQ(&indexes.of(fx.track()), &indexes.of(second.track()));
    EXPECT_NE(&indexes.of(fx.track()), &indexes.of(foley.track()));
}

RC_GTEST_PROP(CutEventLaw, GivesTheAnswersOfAWalkOverTheTrack, ())
{
    TrackHost host(*rc::gen::element(0.0, 3600.0));
    const auto node = randomTrack(host);
    TrackIndexes indexes;
    CutEvent cutEvent(host.handle(node), indexes);

    for (int eighth = 0; eighth <= 120; ++eighth) {
        const double time = host.origin + eighth / 8.0;
        RC_ASSERT(isSame(cutEvent.update(time), walk(*node, time, host.origin)));
    }
}

} // namespace cadrel::host
