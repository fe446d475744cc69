// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/Track.h"

#include "host/border/HostFailure.h"
#include "tests/support/host/FakeProject.h"
#include "tests/support/host/TrackHost.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <string>
#include <vector>

using namespace Velmark;

namespace cadrel::host {

using core::SecondsRange;
using tests::FakeNode;
using tests::FakeProject;
using tests::TrackHost;
using util::Result;

namespace {

constexpr auto Forward = Track::Direction::Forward;
constexpr auto Backward = Track::Direction::Backward;
using Names = std::vector<std::u16string>;

/// With a clock that begins at 0 and with one that begins at 01:00:00:00. Times of the host are given as such; those of
/// the project's clock through `clock`.
class TrackEventsTest : public testing::TestWithParam<double> {
protected:
    double clock(double seconds) const { return seconds + GetParam(); }

    static Names namesOf(const std::vector<HostEvent>& events)
    {
        Names names;
        for (const HostEvent& event : events)
            names.emplace_back(event.node()->getName());
        return names;
    }

    /// On a track with one clip from `start` to `end`.
    bool isInRange(double start, double end, double rangeStart, double rangeEnd)
    {
        const auto node = host.addTrack(TypeWord::Audio, u"FX");
        host.addClip(node, u"clip", start, end);
        return !host.handle(node).eventsInRange(rangeStart, rangeEnd).empty();
    }

    /// The name of what stands at a time of the host; empty for nothing.
    std::u16string nameAt(const Track& track, double time, Track::Direction direction) const
    {
        const HostEvent event = track.eventAt(clock(time), direction);
        return event ? event.node()->getName() : u"";
    }

    std::int64_t idOf(const TrackHost::Node& node) { return HostEvent(memos, node).getUserId(); }

    TrackHost host{GetParam()};
    const TrackHost::Node memoNode = host.addTrack(TypeWord::Marker, u"Memos");
    Track memos = host.handle(memoNode);
    const TrackHost::Node fxNode = host.addTrack(TypeWord::Audio, u"FX");
    Track fx = host.handle(fxNode);
};

INSTANTIATE_TEST_SUITE_P(Origins, TrackEventsTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(TrackEventsTest, AnEventInsideARangeIsInItBoundsIncluded)
{
    EXPECT_TRUE(isInRange(12.0, 18.0, 10.0, 20.0));
    EXPECT_TRUE(isInRange(10.0, 20.0, 10.0, 20.0));
    EXPECT_FALSE(isInRange(1.0, 9.0, 10.0, 20.0));
    EXPECT_FALSE(isInRange(21.0, 29.0, 10.0, 20.0));
}

TEST_P(TrackEventsTest, AnEventThatHangsOverTheStartCountsWithMoreThanHalfOfItInside)
{
    EXPECT_TRUE(isInRange(6.0, 14.5, 10.0, 20.0));
    EXPECT_FALSE(isInRange(6.0, 14.0, 10.0, 20.0));
    EXPECT_FALSE(isInRange(6.0, 13.5, 10.0, 20.0));
    EXPECT_FALSE(isInRange(6.0, 10.0, 10.0, 20.0));
}

TEST_P(TrackEventsTest, AnEventThatHangsOverTheEndCountsWithMoreThanHalfOfItInside)
{
    EXPECT_TRUE(isInRange(15.5, 24.0, 10.0, 20.0));
    EXPECT_FALSE(isInRange(16.0, 24.0, 10.0, 20.0));
    EXPECT_FALSE(isInRange(16.5, 24.0, 10.0, 20.0));
    EXPECT_FALSE(isInRange(20.0, 24.0, 10.0, 20.0));
}

TEST_P(TrackEventsTest, AnEventWiderThanTheRangeCountsOnlyWhenTheRangeEndsPastItsMiddle)
{
    EXPECT_TRUE(isInRange(0.0, 100.0, 50.0, 51.0));
    EXPECT_FALSE(isInRange(0.0, 100.0, 10.0, 50.0));
    EXPECT_FALSE(isInRange(0.0, 100.0, 10.0, 49.0));
    EXPECT_TRUE(isInRange(0.0, 100.0, 90.0, 91.0));
}

TEST_P(TrackEventsTest, HalfOfAnEventIsNotMoreThanHalfAlsoWhereTheRangeLostTheOriginOnItsWay)
{
    // 3610.1 - 3600 is a hair below 10.1.
    const double bound = clock(10.1) - GetParam();

    EXPECT_FALSE(isInRange(5.1, 15.1, bound, 30.0));
    EXPECT_FALSE(isInRange(5.1, 15.1, 0.0, bound));
}

TEST_P(TrackEventsTest, TheBoundsOfARangeAreInItAlsoWhenItLostTheOriginOnItsWay)
{
    host.addPointMarker(memoNode, u"in", 10.1);
    host.addPointMarker(memoNode, u"out", 20.3);
    host.addPointMarker(memoNode, u"behind", 20.30001);

    EXPECT_EQ(namesOf(memos.eventsInRange(clock(10.1) - GetParam(), clock(20.3) - GetParam())), (Names{u"in", u"out"}));
}

TEST_P(TrackEventsTest, PointsAreInTheRangeThatHoldsThem)
{
    host.addPointMarker(memoNode, u"before", 9.0);
    host.addPointMarker(memoNode, u"start", 10.0);
    host.addPointMarker(memoNode, u"middle", 15.0);
    host.addPointMarker(memoNode, u"end", 20.0);
    host.addPointMarker(memoNode, u"behind", 21.0);

    EXPECT_EQ(namesOf(memos.eventsInRange(10.0, 20.0)), (Names{u"start", u"middle", u"end"}));
    EXPECT_EQ(namesOf(memos.eventsInRange(15.0, 15.0)), (Names{u"middle"}));
}

TEST_P(TrackEventsTest, EventsOfARangeComeInTheOrderOfTheTrackAndAPartIsOne)
{
    const auto part = host.addPart(fxNode, u"part", 4.0, 9.0);
    host.addClip(part, u"inside", 5.0, 6.0);
    host.addClip(fxNode, u"last", 10.0, 12.0);
    host.addClip(fxNode, u"first", 1.0, 3.0);

    EXPECT_EQ(namesOf(fx.eventsInRange(0.0, 20.0)), (Names{u"first", u"part", u"last"}));
}

TEST_P(TrackEventsTest, AReversedRangeIsRefused)
{
    EXPECT_EQ(resultOf([&] { fx.eventsInRange(2.0, 1.0); }), Result::InvalidArgument);
    EXPECT_EQ(resultOf([&] { fx.assignIds(2.0, 1.0); }), Result::InvalidArgument);
    EXPECT_EQ(resultOf([&] { fx.assignOwnIds(2.0, 1.0); }), Result::InvalidArgument);
    EXPECT_EQ(resultOf([&] { fx.removeRange(*host.transaction(), clock(2.0), clock(1.0)); }), Result::InvalidArgument);
}

TEST_P(TrackEventsTest, FindsTheOneEventAtATime)
{
    host.addClip(fxNode, u"clip", 10.0, 20.0);

    EXPECT_EQ(nameAt(fx, 15.0, Forward), u"clip");
    EXPECT_EQ(nameAt(fx, 15.0, Backward), u"clip");
    EXPECT_EQ(nameAt(fx, 9.0, Forward), u"");
    EXPECT_EQ(nameAt(fx, 21.0, Backward), u"");
}

TEST_P(TrackEventsTest, LooksAFiftiethOfASecondAhead)
{
    host.addClip(fxNode, u"clip", 10.02, 20.0);

    EXPECT_EQ(nameAt(fx, 10.0, Forward), u"clip");
    EXPECT_EQ(nameAt(fx, 9.9999, Forward), u"");
}

TEST_P(TrackEventsTest, LooksAFiftiethOfASecondBack)
{
    host.addClip(fxNode, u"clip", 10.0, 20.0);

    EXPECT_EQ(nameAt(fx, 20.02, Backward), u"clip");
    EXPECT_EQ(nameAt(fx, 20.0201, Backward), u"");
}

TEST_P(TrackEventsTest, ASingleEventThatEndsAtTheTimeIsFoundBackwardAlone)
{
    host.addClip(fxNode, u"clip", 10.0, 20.0);

    EXPECT_EQ(nameAt(fx, 20.0, Forward), u"");
    EXPECT_EQ(nameAt(fx, 19.98, Forward), u"");
    EXPECT_EQ(nameAt(fx, 19.979, Forward), u"clip");
    EXPECT_EQ(nameAt(fx, 20.0, Backward), u"clip");
}

TEST_P(TrackEventsTest, ASingleEventThatStartsAtTheTimeIsFoundForwardAlone)
{
    host.addClip(fxNode, u"clip", 10.0, 20.0);

    EXPECT_EQ(nameAt(fx, 10.0, Backward), u"");
    EXPECT_EQ(nameAt(fx, 10.02, Backward), u"");
    EXPECT_EQ(nameAt(fx, 10.021, Backward), u"clip");
    EXPECT_EQ(nameAt(fx, 10.0, Forward), u"clip");
}

TEST_P(TrackEventsTest, OfTwoEventsThatMeetTheLaterIsFoundForwardAndTheEarlierBackward)
{
    host.addClip(fxNode, u"earlier", 10.0, 20.0);
    host.addClip(fxNode, u"later", 20.0, 30.0);

    EXPECT_EQ(nameAt(fx, 20.0, Forward), u"later");
    EXPECT_EQ(nameAt(fx, 20.0, Backward), u"earlier");
}

TEST_P(TrackEventsTest, OfThreeEventsAtATimeTheFirstOrTheLastIsFound)
{
    host.addClip(fxNode, u"first", 10.0, 20.0);
    host.addClip(fxNode, u"second", 12.0, 20.0);
    host.addClip(fxNode, u"third", 14.0, 20.0);

    EXPECT_EQ(nameAt(fx, 15.0, Forward), u"third");
    EXPECT_EQ(nameAt(fx, 15.0, Backward), u"first");
}

TEST_P(TrackEventsTest, OfSeveralEventsAtATimeNoneIsRejected)
{
    host.addClip(fxNode, u"long", 9.99, 30.0);
    host.addClip(fxNode, u"short", 10.0, 10.01);

    EXPECT_EQ(nameAt(fx, 10.0, Forward), u"short");
    EXPECT_EQ(nameAt(fx, 10.0, Backward), u"long");
}

TEST_P(TrackEventsTest, EventsThatStartTogetherCountAsOneTheLastOfThem)
{
    host.addClip(fxNode, u"lower", 10.0, 20.0);
    host.addClip(fxNode, u"upper", 10.0, 30.0);

    EXPECT_EQ(nameAt(fx, 15.0, Forward), u"upper");
    EXPECT_EQ(nameAt(fx, 15.0, Backward), u"upper");
    EXPECT_EQ(nameAt(fx, 10.0, Backward), u"");
}

TEST_P(TrackEventsTest, TheEventsOfATrackAreThoseOfItsKind)
{
    host.addClip(fxNode, u"clip", 1.0, 2.0);
    host.addPart(fxNode, u"part", 3.0, 4.0);
    host.addPointMarker(memoNode, u"point", 1.0);
    host.addRangeMarker(memoNode, u"range", 2.0, 3.0);
    const auto picture = host.addTrack(TypeWord::Video, u"Picture");
    host.addClip(picture, u"reel", 0.0, 5.0);
    const Track video = host.handle(picture);

    EXPECT_EQ(namesOf(fx.clipEvents()), (Names{u"clip", u"part"}));
    EXPECT_EQ(namesOf(memos.clipEvents()), (Names{u"point", u"range"}));
    EXPECT_EQ(namesOf(video.clipEvents()), (Names{u"reel"}));
}

TEST_P(TrackEventsTest, TracksOfOtherKindsHaveNoEventsOfTheirKind)
{
    const auto rulerNode = host.addTrack(TypeWord::Ruler, u"Tempo");
    host.addPointMarker(rulerNode, u"bar", 1.0);
    const auto folderNode = host.addTrack(TypeWord::Folder, u"Sound");
    host.addTrack(TypeWord::Audio, u"inside", folderNode.get());

    EXPECT_TRUE(host.handle(rulerNode).clipEvents().empty());
    EXPECT_TRUE(host.handle(folderNode).clipEvents().empty());
}

TEST_P(TrackEventsTest, EventsOfAnotherKindThanTheTrackAreLeftOut)
{
    const auto project = makeCounted<FakeProject>(GetParam());
    Project adapter(host.context(), project.get());
    const auto node = makeCounted<FakeNode>();
    node->words = {TypeWord::Track, TypeWord::Audio};
    node->children = {makeCounted<FakeNode>(1.0, 2.0), makeCounted<FakeNode>(3.0, 4.0)};
    node->children[0]->words = {TypeWord::Marker};
    node->children[1]->words = {TypeWord::Audio};
    const Track track(&adapter, node.get());

    const std::vector<HostEvent> events = track.clipEvents();

    ASSERT_EQ(events.size(), 1U);
    EXPECT_EQ(events[0].node(), node->children[1].get());
}

TEST_P(TrackEventsTest, TheNextUserIdIsOneMoreThanTheHighest)
{
    EXPECT_EQ(memos.nextUserId(), 1);

    const auto first = host.addPointMarker(memoNode, u"first", 1.0);
    host.addPointMarker(memoNode, u"without", 2.0);
    const auto third = host.addPointMarker(memoNode, u"third", 3.0);
    EXPECT_EQ(memos.nextUserId(), 1);

    HostEvent(memos, first).setUserId(7);
    HostEvent(memos, third).setUserId(3);
    EXPECT_EQ(memos.nextUserId(), 8);
}

TEST_P(TrackEventsTest, ThereIsNoUserIdBehindTheHighestOfAll)
{
    const auto marker = host.addPointMarker(memoNode, u"marker", 1.0);
    host.addPointMarker(memoNode, u"without", 2.0);
    HostEvent(memos, marker).setUserId(std::numeric_limits<std::int64_t>::max());

    EXPECT_EQ(resultOf([&] { memos.nextUserId(); }), Result::OutOfRange);
    EXPECT_EQ(resultOf([&] { memos.assignIds(0.0, 10.0); }), Result::OutOfRange);
    EXPECT_EQ(resultOf([&] { memos.assignOwnIds(0.0, 10.0); }), Result::OutOfRange);
}

TEST_P(TrackEventsTest, GivesIdsToThoseInTheRangeThatHaveNone)
{
    const auto outside = host.addPointMarker(memoNode, u"outside", 1.0);
    const auto first = host.addPointMarker(memoNode, u"first", 10.0);
    const auto known = host.addPointMarker(memoNode, u"known", 11.0);
    const auto last = host.addRangeMarker(memoNode, u"last", 12.0, 20.0);
    HostEvent(memos, known).setUserId(4);

    memos.assignIds(10.0, 20.0);

    EXPECT_EQ(idOf(outside), -1);
    EXPECT_EQ(idOf(first), 5);
    EXPECT_EQ(idOf(known), 4);
    EXPECT_EQ(idOf(last), 6);

    memos.assignIds(0.0, 20.0);
    EXPECT_EQ(idOf(outside), 7);
    EXPECT_EQ(idOf(first), 5);
}

TEST_P(TrackEventsTest, GivesEachInTheRangeAnIdOfItsOwn)
{
    const auto withId = [&](double start, std::int64_t id) {
        const auto memo = host.addPointMarker(memoNode, u"memo", start);
        HostEvent(memos, memo).setUserId(id);
        return memo;
    };
    const auto before = withId(9.0, 4);
    const auto none = host.addPointMarker(memoNode, u"none", 10.0);
    const auto first = withId(11.0, 4);
    const auto zero = withId(12.0, 0);
    const auto second = withId(13.0, 4);
    const auto other = withId(14.0, 6);
    const auto third = withId(15.0, 4);
    const auto atEnd = withId(20.0, 4);

    memos.assignOwnIds(10.0, 20.0);

    EXPECT_EQ(idOf(before), 4);
    EXPECT_EQ(idOf(none), 7);
    EXPECT_EQ(idOf(first), 4);
    EXPECT_EQ(idOf(zero), 8);
    EXPECT_EQ(idOf(second), 9);
    EXPECT_EQ(idOf(other), 6);
    EXPECT_EQ(idOf(third), 10);
    EXPECT_EQ(idOf(atEnd), 4) << "A range doesn't hold its end.";

    memos.assignOwnIds(10.0, 20.0);
    EXPECT_EQ(idOf(none), 7);
    EXPECT_EQ(idOf(third), 10);
}

TEST_P(TrackEventsTest, AMemoWithoutIdCannotTakeThatOfALaterOne)
{
    const auto none = host.addPointMarker(memoNode, u"none", 10.0);
    const auto known = host.addPointMarker(memoNode, u"known", 11.0);
    HostEvent(memos, known).setUserId(1);

    memos.assignOwnIds(0.0, 20.0);

    EXPECT_EQ(idOf(none), 2);
    EXPECT_EQ(idOf(known), 1);
}

TEST_P(TrackEventsTest, RemovesAllThatStandsOnTheTrack)
{
    host.addClip(fxNode, u"first", 1.0, 3.0);
    const auto part = host.addPart(fxNode, u"part", 4.0, 9.0);
    host.addClip(part, u"inside", 5.0, 6.0);
    host.addClip(fxNode, u"last", 10.0, 12.0);
    const std::string before = host.dump();

    host.edit(u"Remove", [&] { fx.removeAll(*host.transaction()); });

    EXPECT_TRUE(standin::tests::childrenOf(*fxNode).empty());
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.dump(), before);
}

TEST_P(TrackEventsTest, RemovesOneEvent)
{
    const auto first = host.addClip(fxNode, u"first", 1.0, 3.0);
    host.addClip(fxNode, u"second", 4.0, 5.0);
    HostEvent event(fx, first);

    host.edit(u"Remove", [&] { fx.removeEvent(*host.transaction(), event); });

    EXPECT_EQ(standin::tests::namesOf(*fxNode), (Names{u"second"}));
}

TEST_P(TrackEventsTest, RemovesTheEventsThatLieInARangeWhole)
{
    host.addClip(fxNode, u"before", 1.0, 10.0);
    host.addClip(fxNode, u"over start", 9.5, 12.0);
    host.addClip(fxNode, u"whole", 10.0, 20.0);
    host.addPart(fxNode, u"part", 13.0, 14.0);
    host.addClip(fxNode, u"over end", 15.0, 20.5);
    host.addClip(fxNode, u"around", 1.0, 30.0);
    host.addClip(fxNode, u"behind", 20.0, 25.0);

    host.edit(u"Remove", [&] { fx.removeRange(*host.transaction(), clock(10.0), clock(20.0)); });

    EXPECT_EQ(standin::tests::namesOf(*fxNode), (Names{u"before", u"around", u"over start", u"over end", u"behind"}));
}

TEST_P(TrackEventsTest, APointAtTheEndOfARangeIsNotRemovedWithIt)
{
    host.addPointMarker(memoNode, u"before", 9.9);
    host.addPointMarker(memoNode, u"start", 10.1);
    host.addPointMarker(memoNode, u"inside", 15.0);
    host.addRangeMarker(memoNode, u"up to the end", 19.0, 20.3);
    host.addPointMarker(memoNode, u"end", 20.3);

    host.edit(u"Remove", [&] { memos.removeRange(*host.transaction(), clock(10.1), clock(20.3)); });

    EXPECT_EQ(standin::tests::namesOf(*memoNode), (Names{u"before", u"end"}));
}

TEST_P(TrackEventsTest, RemovesNothingInARangeWithoutLength)
{
    host.addPointMarker(memoNode, u"point", 10.0);

    host.edit(u"Remove", [&] { memos.removeRange(*host.transaction(), clock(10.0), clock(10.0)); });

    EXPECT_EQ(standin::tests::namesOf(*memoNode), (Names{u"point"}));
}

TEST_P(TrackEventsTest, ReportsRemovalsThatTheHostRefuses)
{
    HostEvent event(fx, host.addClip(fxNode, u"clip", 1.0, 3.0));

    // No transaction is open.
    EXPECT_EQ(resultOf([&] { fx.removeAll(*host.transaction()); }), Result::HostCallFailed);
    EXPECT_EQ(resultOf([&] { fx.removeEvent(*host.transaction(), event); }), Result::HostCallFailed);
    EXPECT_EQ(resultOf([&] { fx.removeRange(*host.transaction(), clock(0.0), clock(9.0)); }), Result::HostCallFailed);
}

TEST_P(TrackEventsTest, TheSpanOfAnEventEndsWithTheOutermostPartAroundIt)
{
    const auto clip = host.addClip(fxNode, u"clip", 1.0, 3.0);
    const auto outer = host.addPart(fxNode, u"outer", 10.0, 40.0);
    const auto inner = host.addPart(outer, u"inner", 12.0, 30.0);
    const auto inside = host.addClip(inner, u"inside", 15.0, 20.0);

    EXPECT_EQ(fx.eventSpan(HostEvent(fx, clip)), (SecondsRange{1.0, 3.0}));
    EXPECT_EQ(fx.eventSpan(HostEvent(fx, outer)), (SecondsRange{10.0, 40.0}));
    EXPECT_EQ(fx.eventSpan(HostEvent(fx, inner)), (SecondsRange{12.0, 40.0}));
    EXPECT_EQ(fx.eventSpan(HostEvent(fx, inside)), (SecondsRange{15.0, 40.0}));
}

TEST_P(TrackEventsTest, TheSpanOfAnEventIsMovedByAPartThatTheHostDoesNotCallAnOwner)
{
    const auto project = makeCounted<FakeProject>(GetParam());
    Project adapter(host.context(), project.get());
    const auto track = makeCounted<FakeNode>(7.0, 300.0);
    const auto part = makeCounted<FakeNode>(100.0, 200.0);
    part->words = {TypeWord::Part};
    const auto owner = makeCounted<FakeNode>(5.0, 30.0);
    const auto event = makeCounted<FakeNode>(10.0, 20.0);
    event->owner = owner.get();
    const Track handle(&adapter, track.get());

    EXPECT_EQ(handle.eventSpan(HostEvent(handle, event)), (SecondsRange{10.0, 30.0}));
    owner->parent = track.get();
    EXPECT_EQ(handle.eventSpan(HostEvent(handle, event)), (SecondsRange{10.0, 30.0}));
    owner->parent = part.get();
    EXPECT_EQ(handle.eventSpan(HostEvent(handle, event)), (SecondsRange{10.0, 130.0}));

    // An owner that is no node ends the way up.
    const auto last = makeCounted<FakeNode>(0.0, 70.0);
    last->isNode = false;
    owner->owner = last.get();
    EXPECT_EQ(handle.eventSpan(HostEvent(handle, event)), (SecondsRange{10.0, 130.0}));
    owner->isNode = false;
    EXPECT_EQ(handle.eventSpan(HostEvent(handle, event)), (SecondsRange{10.0, 20.0}));
}

TEST_P(TrackEventsTest, AnEventThatEndsBeforeItStartsHasNoSpan)
{
    const auto project = makeCounted<FakeProject>(GetParam());
    Project adapter(host.context(), project.get());
    const auto track = makeCounted<FakeNode>();
    const Track handle(&adapter, track.get());

    EXPECT_EQ(resultOf([&] { handle.eventSpan(HostEvent(handle, makeCounted<FakeNode>(2.0, 1.0))); }),
              Result::InvalidArgument);
    EXPECT_EQ(resultOf([&] { handle.eventSpan(HostEvent()); }), Result::NotAvailable);
}

} // namespace cadrel::host
