// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/PreviewRecord.h"

#include "core/serialize/ByteArchive.h"
#include "host/border/HostFailure.h"
#include "host/border/NumberList.h"
#include "host/project/EventPrint.h"
#include "standin/project/ClipEvent.h"
#include "tests/support/host/TrackHost.h"
#include "velmark/Attributes.h"
#include "velmark/Automation.h"
#include "velmark/String.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <functional>
#include <limits>
#include <string>
#include <utility>
#include <vector>

using namespace Velmark;

namespace cadrel::host {

using tests::TrackHost;
using Names = std::vector<std::string>;
using Numbers = std::vector<double>;
/// Their times and values.
using Points = std::vector<std::pair<double, float>>;
using Curve = standin::Envelope::Curve;

namespace {

double checksum(const Numbers& numbers)
{
    core::serialize::ByteArchive bytes;
    for (const double number : numbers)
        bytes << number;
    return static_cast<double>(bytes.crc32() >> 3);
}

/// A track with two clips that were there before, and with what was written from 100 s on.
class PreviewRecordTest : public testing::Test {
protected:
    PreviewRecordTest()
    {
        host.addClip(node, u"film", 0.0, 10.0);
        host.addClip(node, u"late", 95.0, 120.0);
    }

    void addCopies()
    {
        host.addClip(node, u"one", 100.0, 110.0);
        host.addClip(node, u"two", 110.0, 130.0);
    }
    PreviewRecord record(const core::Framerate& framerate = core::Framerate(25, 0)) const
    {
        return PreviewRecord::ofContent(track, 100.0, framerate);
    }
    void keep(const PreviewRecord& kept)
    {
        host.edit(u"Keep", [&] { kept.keepOn(host.context(), track); });
    }
    std::optional<PreviewRecord> kept() const { return PreviewRecord::keptBy(track); }
    void store(const Numbers& numbers) { store(AttributeKey::Preview, numbers); }
    void store(const char* key, const Numbers& numbers) { writeNumbers(host.context(), *node, key, numbers); }
    Numbers stored(const char* key) { return readNumbers(*node, key).value_or(Numbers()); }

    /// One of an earlier project, of 100 s to 130 s without events.
    void storeEarlier()
    {
        Numbers head{100.0, 2.0, 25.0, 0.0, 130.0, checksum({})};
        head.push_back(checksum(head));
        store(head);
    }

    TrackHost::Node child(std::size_t index) { return standin::tests::childrenOf(*node)[index]; }
    Names othersOf(const PreviewRecord& written)
    {
        Names names;
        for (const auto& event : written.others(eventsReachingInto(track, 100.0, 1000.0)))
            names.push_back(ConstString(event->getName()).text8());
        return names;
    }

    /// Those of the points from 100 s on that aren't in the record.
    Points otherPoints(int32 number)
    {
        const TrackHost::Node curve = host.curveOf(node, number);
        std::vector<TrackHost::Node> points = standin::tests::childrenOf(*curve);
        std::erase_if(points, [](const TrackHost::Node& point) { return point->getStart(nullptr) < 100.0; });
        Points others;
        for (const auto& point : kept()->automation().others(*curve, points))
            others.emplace_back(point->getStart(nullptr), query<IAutomationPoint>(point)->getValue());
        return others;
    }

    TrackHost host{0.0};
    const TrackHost::Node node = host.addTrack(TypeWord::Audio, u"DX");
    const Track track = host.handle(node);
};

} // namespace

TEST_F(PreviewRecordTest, KnowsWhatWasWrittenWhenItIsReadAgain)
{
    addCopies();
    keep(record());

    ASSERT_TRUE(kept());
    EXPECT_EQ(kept()->start(), 100.0);
    EXPECT_EQ(kept()->end(), 130.0);
    EXPECT_EQ(othersOf(*kept()), Names{"late"});
}

TEST_F(PreviewRecordTest, KnowsNoEndWhereNothingWasWritten)
{
    keep(record());

    ASSERT_TRUE(kept());
    EXPECT_EQ(kept()->start(), 100.0);
    EXPECT_FALSE(kept()->end());
    EXPECT_EQ(othersOf(*kept()), Names{"late"});
}

TEST_F(PreviewRecordTest, ReachesToTheLastPointOfItsAutomation)
{
    host.addPoint(node, Curve::Volume, 99.0, 0.5F);
    EXPECT_FALSE(record().end());

    host.addPoint(node, Curve::Volume, 100.0, 0.5F);
    EXPECT_EQ(record().end(), 100.0);
    host.addPoint(node, Curve::Volume, 140.0, 0.5F);
    addCopies();
    keep(record());

    EXPECT_EQ(kept()->end(), 140.0);
}

TEST_F(PreviewRecordTest, TellsPointsThatWereDrawnMovedOrGivenAnotherValueFromThoseThatWereWritten)
{
    host.addPoint(node, Curve::Volume, 99.0, 0.5F);
    const auto moved = host.addPoint(node, Curve::Volume, 100.0, 0.5F);
    host.addPoint(node, Curve::Volume, 105.0, 0.1F);
    const auto changed = host.addPoint(node, Curve::Volume, 110.0, 0.25F);
    host.addPoint(node, Curve::Pan, 120.0, 0.75F);
    keep(record());
    EXPECT_EQ(otherPoints(Curve::Volume), Points{});
    EXPECT_EQ(otherPoints(Curve::Pan), Points{});

    requireOk(moved->setStart(nullptr, 0, 100.04));
    requireOk(query<IAutomationPoint>(changed)->setValue(0.2501F));
    host.addPoint(node, Curve::Volume, 120.0, 0.75F);
    host.addPoint(node, Curve::Pan, 120.5, 0.75F);
    host.addPoint(node, Curve::Mute, 120.0, 0.75F);

    EXPECT_EQ(otherPoints(Curve::Volume), (Points{{100.04, 0.5F}, {110.0, 0.2501F}, {120.0, 0.75F}}));
    EXPECT_EQ(otherPoints(Curve::Pan), (Points{{120.5, 0.75F}}));
    EXPECT_EQ(otherPoints(Curve::Mute), (Points{{120.0, 0.75F}}));
}

TEST_F(PreviewRecordTest, TellsAPointThatTheUserHasSetAtOneThatWasWritten)
{
    for (const float value : {0.25F, 0.75F})
        host.addPoint(node, Curve::Volume, 100.0, value);
    keep(record());

    for (const float value : {0.75F, 0.5F})
        host.addPoint(node, Curve::Volume, 100.0, value);

    EXPECT_EQ(otherPoints(Curve::Volume), (Points{{100.0, 0.75F}, {100.0, 0.5F}}));
}

TEST_F(PreviewRecordTest, ReadsThoseOfEarlierProjectsWhichKnowCurvesButNoPoints)
{
    for (const int32 curve : {Curve::Volume, Curve::Pan}) {
        for (const double time : {100.0, 130.0, 130.01})
            host.addPoint(node, curve, time, 0.5F);
    }
    storeEarlier();
    // Whatever stands on the volume up to the end of what was written, as nobody knows what was drawn.
    store(AttributeKey::PreviewCurves, {checksum({100.0, 1.0}), 1.0});
    EXPECT_EQ(otherPoints(Curve::Volume), (Points{{130.01, 0.5F}}));
    EXPECT_EQ(otherPoints(Curve::Pan), (Points{{100.0, 0.5F}, {130.0, 0.5F}, {130.01, 0.5F}}));
    store(AttributeKey::PreviewCurves, {checksum({100.0})});
    EXPECT_EQ(otherPoints(Curve::Volume).size(), 3U);

    // Whatever stands there at all.
    removeNumbers(*node, AttributeKey::PreviewCurves);
    EXPECT_EQ(otherPoints(Curve::Volume), (Points{{130.01, 0.5F}}));
    EXPECT_EQ(otherPoints(Curve::Pan), (Points{{130.01, 0.5F}}));
    for (const Numbers& numbers : {Numbers{100.0, 130.0}, Numbers{100.0, 1.0, 25.0, 0.0, 130.0}}) {
        store(numbers);
        EXPECT_EQ(otherPoints(Curve::Pan), (Points{{130.01, 0.5F}}));
    }
}

TEST_F(PreviewRecordTest, OfEarlierProjectsIsNoneWhereItsCurvesAreDamaged)
{
    storeEarlier();
    const Numbers whole{checksum({100.0, 1.0}), 1.0};
    store(AttributeKey::PreviewCurves, whole);
    ASSERT_TRUE(kept());

    for (const Numbers& damaged : {Numbers{whole[0] + 1.0, 1.0}, Numbers{whole[0], 2.0}, Numbers{whole[0]}, Numbers{},
                                   Numbers{checksum({101.0, 1.0}), 1.0}}) {
        SCOPED_TRACE(testing::PrintToString(damaged));
        store(AttributeKey::PreviewCurves, damaged);
        EXPECT_FALSE(kept());
        EXPECT_TRUE(PreviewRecord::headKeptBy(track));
    }
    node->setAttribute(AttributeKey::PreviewCurves, FVariant::integer(1), true);
    EXPECT_FALSE(kept());
}

TEST_F(PreviewRecordTest, KeepsTheFrameRate)
{
    const std::vector<core::Framerate> framerates{core::Framerate(25, 0), core::Framerate(30, true, 1),
                                                  core::Framerate(24, true, 0), core::Framerate(30, 1)};
    for (const core::Framerate& framerate : framerates) {
        keep(record(framerate));

        ASSERT_TRUE(kept()->framerate());
        EXPECT_EQ(kept()->framerate()->rate, framerate.rate);
        EXPECT_EQ(kept()->framerate()->framesPerSecond, framerate.framesPerSecond);
        EXPECT_EQ(kept()->framerate()->dropFrame, framerate.dropFrame);
        EXPECT_EQ(kept()->framerate()->pulledDown, framerate.pulledDown);
    }
    keep(record(core::Framerate()));
    EXPECT_FALSE(kept()->framerate());
}

TEST_F(PreviewRecordTest, TellsWhatWasMovedTrimmedRenamedOrSlippedFromWhatWasWritten)
{
    addCopies();
    keep(record());
    const TrackHost::Node copy = child(3);
    ASSERT_EQ(std::u16string(copy->getName()), u"two");
    auto& clip = dynamic_cast<standin::ClipEvent&>(*copy);
    const std::vector<std::function<void()>> edits{
        [&] { copy->setStart(nullptr, 0, 110.04); }, [&] { copy->setEnd(nullptr, 0, 129.96); },
        [&] { copy->setName(nullptr, standin::tests::text(u"two").get(), 0), clip.setSourceOffset(0.04); }};
    for (const auto& change : edits) {
        host.edit(u"Edit", change);
        EXPECT_EQ(othersOf(*kept()), (Names{"late", "two"}));
        ASSERT_TRUE(host.undo());
        EXPECT_EQ(othersOf(*kept()), Names{"late"});
    }

    host.edit(u"Rename", [&] { copy->setName(nullptr, standin::tests::text(u"twO").get(), 0); });
    EXPECT_EQ(othersOf(*kept()), (Names{"late", "twO"}));
}

TEST_F(PreviewRecordTest, TellsAClipThatWasGivenAnotherFile)
{
    addCopies();
    auto& first = host.addMedia(u"/sound/first take.wav", 60.0);
    auto& second = host.addMedia(u"/sound/second take.wav", 60.0);
    auto& copy = dynamic_cast<standin::ClipEvent&>(*child(3));
    copy.setClip(Counted<standin::MediaClip>::share(&first));
    keep(record());
    EXPECT_EQ(othersOf(*kept()), Names{"late"});

    copy.setClip(Counted<standin::MediaClip>::share(&second));
    EXPECT_EQ(othersOf(*kept()), (Names{"late", "two"}));
    copy.setClip(nullptr);
    EXPECT_EQ(othersOf(*kept()), (Names{"late", "two"}));
}

TEST_F(PreviewRecordTest, TellsAPartInWhichSomethingWasEdited)
{
    const TrackHost::Node part = host.addPart(node, u"reel", 100.0, 130.0);
    const TrackHost::Node inner = host.addPart(part, u"scene", 100.0, 120.0);
    const TrackHost::Node deep = host.addClip(inner, u"take", 105.0, 110.0);
    host.addClip(part, u"atmo", 120.0, 130.0);
    keep(record());
    EXPECT_EQ(othersOf(*kept()), Names{"late"});

    const std::vector<std::function<void()>> edits{
        [&] { deep->setStart(nullptr, 0, 106.0); },
        [&] { deep->setEnd(nullptr, 0, 111.0); },
        [&] { deep->setName(nullptr, standin::tests::text(u"better take").get(), 0); },
        [&] { dynamic_cast<standin::ClipEvent&>(*deep).setSourceOffset(0.5); },
        [&] { requireOk(host.transaction()->remove(host.root(), deep.get())); },
        [&] { host.addClip(inner, u"take", 112.0, 114.0); },
        [&] { host.addClip(part, u"take", 112.0, 114.0); }};
    for (const auto& change : edits) {
        host.edit(u"Edit", change);
        EXPECT_EQ(othersOf(*kept()), (Names{"late", "reel"}));
        ASSERT_TRUE(host.undo());
        EXPECT_EQ(othersOf(*kept()), Names{"late"});
    }
}

TEST_F(PreviewRecordTest, TellsACopyOfACopyThatTheUserHasLaidOverIt)
{
    addCopies();
    host.addClip(node, u"one", 100.0, 110.0);
    keep(record());
    EXPECT_EQ(othersOf(*kept()), Names{"late"});

    host.addClip(node, u"one", 100.0, 110.0);

    EXPECT_EQ(othersOf(*kept()), (Names{"late", "one"}));
}

TEST_F(PreviewRecordTest, ReadsThoseOfEarlierProjectsWhichKnowPlacesAlone)
{
    addCopies();
    store({100.0, 135.0, 100.0, 110.0, 110.0, 130.0});
    child(3)->setName(nullptr, standin::tests::text(u"three").get(), 0);

    ASSERT_TRUE(kept());
    EXPECT_EQ(kept()->start(), 100.0);
    EXPECT_EQ(kept()->end(), 135.0);
    EXPECT_FALSE(kept()->framerate());
    EXPECT_EQ(othersOf(*kept()), Names{"late"});

    store({100.0});
    EXPECT_FALSE(kept()->end());
    EXPECT_EQ(othersOf(*kept()), (Names{"late", "one", "three"}));
}

TEST_F(PreviewRecordTest, ReadsThoseOfEarlierProjectsWhichKnowNamesButNoContent)
{
    addCopies();
    auto& copy = dynamic_cast<standin::ClipEvent&>(*child(3));
    store({100.0, 1.0, 25.0, 0.0, 130.0, 100.0, 110.0, 0.0, namePrintOf(*child(2)) * 1.0, 110.0, 130.0, 0.0,
           namePrintOf(copy) * 1.0});
    copy.setClip(Counted<standin::MediaClip>::share(&host.addMedia(u"/sound/take.wav", 60.0)));

    ASSERT_TRUE(kept());
    EXPECT_EQ(kept()->end(), 130.0);
    ASSERT_TRUE(kept()->framerate());
    EXPECT_EQ(othersOf(*kept()), Names{"late"}) << "That it has another clip can't be told.";
    copy.setName(nullptr, standin::tests::text(u"three").get(), 0);
    EXPECT_EQ(othersOf(*kept()), (Names{"late", "three"}));
}

TEST_F(PreviewRecordTest, ItsHeadIsReadWithoutItsEvents)
{
    addCopies();
    keep(record());
    for (const bool isDamaged : {false, true}) {
        SCOPED_TRACE(isDamaged);
        if (isDamaged)
            store(AttributeKey::PreviewEvents, {100.0, 110.0});

        const auto head = PreviewRecord::headKeptBy(track);

        ASSERT_TRUE(head);
        EXPECT_EQ(head->start, 100.0);
        EXPECT_EQ(head->end, 130.0);
        EXPECT_EQ(head->framerate->framesPerSecond, 25);
        EXPECT_EQ(kept().has_value(), !isDamaged);
    }
    store({100.0, 135.0, 100.0, 110.0});
    EXPECT_EQ(PreviewRecord::headKeptBy(track)->end, 135.0);
    store({100.0, 99.0});
    EXPECT_FALSE(PreviewRecord::headKeptBy(track));
    PreviewRecord::dropFrom(track);
    EXPECT_FALSE(PreviewRecord::headKeptBy(track));
    EXPECT_EQ(node->hasAttribute(AttributeKey::PreviewEvents), ResultFalse);
    EXPECT_EQ(node->hasAttribute(AttributeKey::PreviewCurves), ResultFalse);
}

TEST_F(PreviewRecordTest, IsNoneOnceAnyNumberIsDamaged)
{
    addCopies();
    host.addPoint(node, Curve::Volume, 100.0, 0.5F);
    host.addPoint(node, Curve::Pan, 110.0, 0.25F);
    keep(record());
    EXPECT_EQ(stored(AttributeKey::PreviewCurves), (Numbers{1.0, 100.0, 0.5, 2.0, 110.0, 0.25}));
    const std::vector<std::pair<const char*, std::size_t>> attributes{
        {AttributeKey::Preview, 7}, {AttributeKey::PreviewEvents, 8}, {AttributeKey::PreviewCurves, 6}};
    for (const auto& [key, size] : attributes) {
        SCOPED_TRACE(key);
        const Numbers numbers = stored(key);
        ASSERT_EQ(numbers.size(), size);
        const bool isHead = key == AttributeKey::Preview;
        const auto expectNone = [&, &stored = key](const Numbers& damaged) {
            SCOPED_TRACE(testing::PrintToString(damaged));
            store(stored, damaged);
            EXPECT_FALSE(kept());
            EXPECT_EQ(PreviewRecord::headKeptBy(track).has_value(), !isHead);
        };
        for (std::size_t index = 0; index < numbers.size(); ++index) {
            for (const double wrong : {numbers[index] + 1.0, 1e9, -1.0, std::numeric_limits<double>::quiet_NaN()}) {
                Numbers damaged = numbers;
                damaged[index] = wrong;
                expectNone(damaged);
            }
        }
        Numbers shorter = numbers;
        shorter.pop_back();
        expectNone(shorter);
        expectNone({});
        store(key, numbers);
        EXPECT_TRUE(kept());
    }
    for (const char* const key : {AttributeKey::PreviewEvents, AttributeKey::PreviewCurves}) {
        const Numbers numbers = stored(key);
        node->removeAttribute(key);
        EXPECT_FALSE(kept());
        store(key, numbers);
        EXPECT_TRUE(kept());
    }
}

TEST_F(PreviewRecordTest, AnEndBeforeThatOfItsEventsIsTheirs)
{
    store({100.0, 105.0, 100.0, 110.0});
    EXPECT_EQ(kept()->end(), 110.0);
    store({100.0, 1.0, 25.0, 0.0, 105.0, 100.0, 110.0, 0.0, 7.0});
    EXPECT_EQ(kept()->end(), 110.0);
}

TEST_F(PreviewRecordTest, IsNoneWhereItCannotHaveBeenWritten)
{
    // All that was there stands before the start, which is after the begin of the timeline, and a day is added at most.
    const double furthest = 2.0 * (100.0 + 86400.0);
    for (const Numbers& numbers :
         {Numbers{0.0}, Numbers{-1.0}, Numbers{0.0, 10.0, 0.0, 10.0}, Numbers{100.0, furthest + 1.0},
          Numbers{100.0, 1.0, 25.0, 0.0, 1e9}, Numbers{100.0, 110.0, 0.0, 10.0}, Numbers{100.0, 110.0, 99.99, 110.0},
          Numbers{100.0, 1.0, 25.0, 0.0, 110.0, 0.0, 10.0, 0.0, 7.0}}) {
        SCOPED_TRACE(testing::PrintToString(numbers));
        store(numbers);

        EXPECT_FALSE(kept());
        EXPECT_FALSE(PreviewRecord::headKeptBy(track));
    }
    for (const Numbers& numbers : {Numbers{0.001}, Numbers{100.0, furthest}, Numbers{100.0, 110.0, 100.0, 110.0}}) {
        SCOPED_TRACE(testing::PrintToString(numbers));
        store(numbers);

        EXPECT_TRUE(kept());
    }
}

TEST_F(PreviewRecordTest, IsNoneWhereTheNumbersMakeNoSense)
{
    EXPECT_FALSE(kept());
    EXPECT_FALSE(PreviewRecord::isKeptBy(track));
    for (const Numbers& numbers :
         {Numbers{}, Numbers{1e9 + 1.0}, Numbers{-1e9 - 1.0}, Numbers{100.0, 99.0}, Numbers{100.0, 1.0, 25.0},
          Numbers{100.0, 2.0, 25.0, 0.0, 130.0}, Numbers{100.0, 3.0, 25.0, 0.0, 130.0},
          Numbers{100.0, 1.0, 25.0, 0.0, 130.0, 100.0, 130.0},
          Numbers{100.0, 1.0, 25.0, 0.0, 99.0, 100.0, 110.0, 0.0, 7.0}}) {
        SCOPED_TRACE(testing::PrintToString(numbers));
        store(numbers);

        EXPECT_TRUE(PreviewRecord::isKeptBy(track));
        EXPECT_FALSE(kept());
    }
    for (const Numbers& numbers : {Numbers{1e9}, Numbers{100.0, 100.0}, Numbers{100.0, 1.0, 25.0, 0.0, 99.0},
                                   Numbers{100.0, 1.0, 25.0, 0.0, 100.0}}) {
        SCOPED_TRACE(testing::PrintToString(numbers));
        store(numbers);

        EXPECT_TRUE(kept());
    }
    store({100.0, 1.0, 0.5, -3.0, 100.0});
    EXPECT_FALSE(kept()->framerate());
}

TEST_F(PreviewRecordTest, IsDroppedWithItsAttribute)
{
    keep(record());

    PreviewRecord::dropFrom(track);

    EXPECT_FALSE(PreviewRecord::isKeptBy(track));
    PreviewRecord::dropFrom(track);
}

TEST_F(PreviewRecordTest, EventsReachIntoAStretchWithoutItsEnd)
{
    struct Case {
        double start;
        double end;
        Names names;
    };
    for (const Case& at : {Case{0.0, 1000.0, {"film", "late"}}, Case{10.0, 95.0, {}}, Case{9.96, 95.0, {"film"}},
                           Case{10.0, 95.04, {"late"}}, Case{120.0, 130.0, {}}, Case{0.0, 0.04, {"film"}}}) {
        SCOPED_TRACE(at.start);
        Names names;
        for (const auto& event : eventsReachingInto(track, at.start, at.end))
            names.push_back(ConstString(event->getName()).text8());
        EXPECT_EQ(names, at.names);
    }
}

} // namespace cadrel::host
