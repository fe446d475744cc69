// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/HostEvent.h"

#include "host/border/HostFailure.h"
#include "standin/project/ClipEvent.h"
#include "tests/support/host/FakeProject.h"
#include "tests/support/host/TrackHost.h"
#include "velmark/Attributes.h"
#include "velmark/Media.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <functional>
#include <limits>
#include <string>

using namespace Velmark;

namespace cadrel::host {

using tests::FakeNode;
using tests::FakeProject;
using tests::TrackHost;
using util::Result;

namespace {

class ForeignClip : public Implements<ForeignClip, FObject, IMediaClip> {
public:
    static constexpr const char* ClassName = "ForeignClip";

    uint32 getFrameCount() override { return 1; }
    IFilePath* getFile() override { return nullptr; }
};

/// With a clock that begins at 0 and with one that begins at 01:00:00:00. Times of the project's clock are given
/// through `clock`.
class HostEventTest : public testing::TestWithParam<double> {
protected:
    double clock(double seconds) const { return seconds + GetParam(); }
    HostEvent clipFrom(double start, double end) { return {fx, host.addClip(fxNode, u"clip", start, end)}; }
    HostEvent pointAt(double time) { return {memos, host.addPointMarker(memoNode, u"point", time)}; }
    HostEvent rangeFrom(double start, double end)
    {
        return {memos, host.addRangeMarker(memoNode, u"range", start, end)};
    }

    TrackHost host{GetParam()};
    IEditTransaction& transaction = *host.transaction();
    const TrackHost::Node memoNode = host.addTrack(TypeWord::Marker, u"Memos");
    const Track memos = host.handle(memoNode);
    const TrackHost::Node fxNode = host.addTrack(TypeWord::Audio, u"FX");
    const Track fx = host.handle(fxNode);
};

INSTANTIATE_TEST_SUITE_P(Origins, HostEventTest, testing::Values(0.0, 3600.0));

/// What every operation answers, as one value; two where they differ.
Result::Type answerOfAll(HostEvent event, IEditTransaction& transaction)
{
    const std::function<void()> operations[] = {
        [&] { event.isClip(); },
        [&] { event.isMarker(); },
        [&] { event.isRange(); },
        [&] { event.getClip(); },
        [&] { event.setClip(nullptr, 0); },
        [&] { event.getClipFrameCount(); },
        [&] { event.getStart(); },
        [&] { event.setStart(transaction, 1.0); },
        [&] { event.getEnd(); },
        [&] { event.setEnd(transaction, 1.0); },
        [&] { event.setLength(transaction, 1.0); },
        [&] { event.getSourceOffset(); },
        [&] { event.getName(); },
        [&] { event.setName(transaction, L"name"); },
        [&] { event.getUserId(); },
        [&] { event.setUserId(1); },
        [&] { event.setUserId(-1); },
        [&] { event.remove(transaction); },
    };
    const Result::Type answer = resultOf(operations[0]);
    for (const auto& operation : operations)
        EXPECT_EQ(resultOf(operation), answer);
    return answer;
}

} // namespace

TEST_P(HostEventTest, AnEmptyHandleIsNotAvailableForAnything)
{
    const HostEvent withoutEvent(fx, nullptr);

    EXPECT_FALSE(HostEvent());
    EXPECT_FALSE(withoutEvent);
    EXPECT_EQ(HostEvent().node(), nullptr);
    EXPECT_EQ(answerOfAll(HostEvent(), transaction), Result::NotAvailable);
    EXPECT_EQ(answerOfAll(withoutEvent, transaction), Result::NotAvailable);
}

TEST_P(HostEventTest, AnEventWhoseTrackHasGoneIsNotAvailableForAnything)
{
    const HostEvent event = clipFrom(1.0, 2.0);

    host.edit(u"Remove", [&] { requireOk(transaction.remove(host.root(), fxNode.get())); });

    EXPECT_TRUE(event);
    EXPECT_EQ(answerOfAll(event, transaction), Result::NotAvailable);
}

TEST_P(HostEventTest, IsEqualToAHandleOnTheSameEvent)
{
    const auto node = host.addClip(fxNode, u"clip", 1.0, 2.0);

    EXPECT_EQ(HostEvent(fx, node), HostEvent(fx, node));
    EXPECT_NE(HostEvent(fx, node), clipFrom(1.0, 2.0));
    EXPECT_EQ(HostEvent(fx, node).node(), node.get());
}

TEST_P(HostEventTest, HoldsItsEventAsLongAsItLives)
{
    const auto node = makeCounted<FakeNode>();
    {
        const HostEvent event(fx, node);
        const HostEvent copy = event;
        EXPECT_EQ(node->refCount(), 3);
    }

    EXPECT_EQ(node->refCount(), 1);
}

TEST_P(HostEventTest, KnowsWhatKindOfEventItIs)
{
    EXPECT_TRUE(clipFrom(1.0, 2.0).isClip());
    EXPECT_FALSE(clipFrom(1.0, 2.0).isMarker());
    EXPECT_FALSE(clipFrom(1.0, 2.0).isRange());
    EXPECT_FALSE(HostEvent(fx, host.addPart(fxNode, u"part", 1.0, 2.0)).isClip());
    EXPECT_FALSE(pointAt(1.0).isClip());
    EXPECT_TRUE(pointAt(1.0).isMarker());
    EXPECT_FALSE(pointAt(1.0).isRange());
    EXPECT_TRUE(rangeFrom(1.0, 2.0).isMarker());
    EXPECT_TRUE(rangeFrom(1.0, 2.0).isRange());
}

TEST_P(HostEventTest, TellsItsTimesByTheProjectsClock)
{
    const HostEvent event = clipFrom(10.5, 20.25);

    EXPECT_EQ(event.getStart(), clock(10.5));
    EXPECT_EQ(event.getEnd(), clock(20.25));
}

TEST_P(HostEventTest, MovesItsStartWithItsLength)
{
    HostEvent event = clipFrom(10.0, 20.0);

    event.setStart(transaction, clock(12.5));

    EXPECT_EQ(event.node()->getStart(nullptr), 12.5);
    EXPECT_EQ(event.node()->getEnd(nullptr), 22.5);
}

TEST_P(HostEventTest, MovesItsEndAlone)
{
    HostEvent event = clipFrom(10.0, 20.0);

    event.setEnd(transaction, clock(12.5));
    EXPECT_EQ(event.node()->getStart(nullptr), 10.0);
    EXPECT_EQ(event.node()->getEnd(nullptr), 12.5);

    event.setLength(transaction, 5.0);
    EXPECT_EQ(event.node()->getStart(nullptr), 10.0);
    EXPECT_EQ(event.node()->getEnd(nullptr), 15.0);
}

TEST_P(HostEventTest, SetsTheTimesOfWhatIsNotInsertedYet)
{
    HostEvent event(fx, query<IProjectNode>(create<IClipEvent>(host.context())));

    event.setStart(transaction, clock(3.0));
    event.setEnd(transaction, clock(7.0));

    EXPECT_EQ(event.node()->getStart(nullptr), 3.0);
    EXPECT_EQ(event.node()->getEnd(nullptr), 7.0);
}

TEST_P(HostEventTest, ReportsTimesThatTheHostRefuses)
{
    HostEvent event = clipFrom(10.0, 20.0);
    HostEvent point = pointAt(10.0);

    EXPECT_EQ(resultOf([&] { event.setStart(transaction, clock(-1.0)); }), Result::HostCallFailed);
    EXPECT_EQ(resultOf([&] { event.setEnd(transaction, clock(9.0)); }), Result::HostCallFailed);
    EXPECT_EQ(resultOf([&] { event.setLength(transaction, -1.0); }), Result::HostCallFailed);
    EXPECT_EQ(resultOf([&] { point.setEnd(transaction, clock(11.0)); }), Result::HostCallFailed);
    EXPECT_EQ(resultOf([&] { point.setLength(transaction, 1.0); }), Result::HostCallFailed);
}

TEST_P(HostEventTest, TheOffsetIntoItsSourceHasNothingToDoWithTheClock)
{
    const HostEvent event = clipFrom(10.0, 20.0);
    dynamic_cast<standin::ClipEvent&>(*event.node()).setSourceOffset(2.5);

    EXPECT_EQ(event.getSourceOffset(), 2.5);
    EXPECT_EQ(pointAt(1.0).getSourceOffset(), 0.0);
}

TEST_P(HostEventTest, PlaysAClipOfSoManyFrames)
{
    HostEvent event = clipFrom(10.0, 12.0);
    standin::MediaClip& media = host.addMedia(u"/sound/door.wav", 4.0);
    EXPECT_FALSE(event.getClip());

    event.setClip(&media, 0);
    EXPECT_EQ(event.getClip(), static_cast<IMediaClip*>(&media));
    EXPECT_EQ(event.getClipFrameCount(), 100U);

    event.setClip(nullptr, 0);
    EXPECT_FALSE(event.getClip());
}

TEST_P(HostEventTest, MissesTheClipOfWhatHasNone)
{
    HostEvent point = pointAt(1.0);

    EXPECT_EQ(resultOf([&] { point.getClip(); }), Result::HostObjectMissing);
    EXPECT_EQ(resultOf([&] { point.setClip(nullptr, 0); }), Result::HostObjectMissing);
    EXPECT_EQ(resultOf([&] { point.getClipFrameCount(); }), Result::HostObjectMissing);
    EXPECT_EQ(resultOf([&] { clipFrom(1.0, 2.0).getClipFrameCount(); }), Result::HostObjectMissing);
}

TEST_P(HostEventTest, ReportsAClipThatTheHostRefuses)
{
    HostEvent event = clipFrom(1.0, 2.0);
    ForeignClip foreign;

    EXPECT_EQ(resultOf([&] { event.setClip(&foreign, 0); }), Result::HostCallFailed);
}

TEST_P(HostEventTest, ReadsAndWritesItsName)
{
    HostEvent event = pointAt(1.0);
    EXPECT_EQ(event.getName(), L"point");

    event.setName(transaction, L"T\u00fcr \U0001F6AA");
    EXPECT_EQ(std::u16string(event.node()->getName()), u"T\u00fcr \U0001F6AA");
    EXPECT_EQ(event.getName(), L"T\u00fcr \U0001F6AA");
}

TEST_P(HostEventTest, HasNoUserIdUntilItIsGivenOne)
{
    HostEvent event = pointAt(1.0);
    EXPECT_EQ(event.getUserId(), -1);

    event.setUserId(0);
    EXPECT_EQ(event.getUserId(), 0);
    event.setUserId(std::numeric_limits<std::int64_t>::max());
    EXPECT_EQ(event.getUserId(), std::numeric_limits<std::int64_t>::max());
}

TEST_P(HostEventTest, StoresItsUserIdWithTheProject)
{
    HostEvent event = pointAt(1.0);

    event.setUserId(12);

    FVariant stored;
    ASSERT_EQ(event.node()->getAttribute("CadrEventUserId", stored), ResultOk);
    EXPECT_EQ(stored.type(), FVariant::Type::Integer);
    EXPECT_EQ(stored.asInteger(), 12);
    EXPECT_TRUE(dynamic_cast<standin::Node&>(*event.node()).attributes().at("CadrEventUserId").isPersistent);
}

TEST_P(HostEventTest, AUserIdThatIsNoNumberReadsAsZero)
{
    const HostEvent event = pointAt(1.0);
    const auto list = create<IAttributeData>(host.context());

    ASSERT_EQ(event.node()->setAttribute("CadrEventUserId", FVariant::string("12"), true), ResultOk);
    EXPECT_EQ(event.getUserId(), 0);
    ASSERT_EQ(event.node()->setAttribute("CadrEventUserId", FVariant::object(list.get()), false), ResultOk);
    EXPECT_EQ(event.getUserId(), 0);
}

TEST_P(HostEventTest, AUserIdOfNoKnownTypeReadsAsAbsent)
{
    struct Untyped : FakeNode {
        int32 getAttribute(const char*, FVariant& value) override
        {
            value = FVariant();
            return ResultOk;
        }
    };

    EXPECT_EQ(HostEvent(memos, makeCounted<Untyped>()).getUserId(), -1);
}

TEST_P(HostEventTest, RefusesANegativeUserId)
{
    HostEvent event = pointAt(1.0);

    EXPECT_EQ(resultOf([&] { event.setUserId(-1); }), Result::InvalidArgument);
    EXPECT_EQ(event.getUserId(), -1);
}

TEST_P(HostEventTest, ReportsWhatTheHostRefusesToWriteDown)
{
    const auto project = makeCounted<FakeProject>(GetParam());
    Project adapter(host.context(), project.get());
    const auto node = makeCounted<FakeNode>();
    const Track track(&adapter, node.get());
    HostEvent event(track, node);

    node->setterResult = ResultFalse;
    EXPECT_EQ(resultOf([&] { event.setName(transaction, L"name"); }), Result::HostCallFailed);
    EXPECT_EQ(resultOf([&] { event.setUserId(1); }), Result::HostCallFailed);
}

TEST_P(HostEventTest, GoesOutOfItsTrack)
{
    HostEvent event = clipFrom(1.0, 2.0);

    EXPECT_EQ(resultOf([&] { event.remove(transaction); }), Result::HostCallFailed); // none is open
    host.edit(u"Remove", [&] { event.remove(transaction); });

    EXPECT_TRUE(standin::tests::childrenOf(*fxNode).empty());
    EXPECT_EQ(event.node()->getParent(), nullptr);
}

} // namespace cadrel::host
