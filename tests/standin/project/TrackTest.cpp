// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/standin/TestHost.h"

#include "standin/project/AutomationPoint.h"
#include "standin/project/Track.h"
#include "velmark/Automation.h"
#include "velmark/Tracks.h"

#include <gtest/gtest.h>

#include <limits>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

std::vector<int32> curveNumbersOf(const TestHost::Node& track)
{
    std::vector<int32> numbers;
    const auto curves = Counted<IObjectList>::adopt(query<ITrackNode>(track)->getAutomation());
    for (int32 index = 0; index < curves->count(); ++index)
        numbers.push_back(query<IEnvelopeTrack>(curves->at(index))->curveNumber());
    return numbers;
}

} // namespace

TEST(TrackNode, TheLockButtonCanBePressedAndReleased)
{
    TestHost host;
    const auto track = query<ITrackNode>(host.addTrack(TypeWord::Audio, u"DX 1"));
    EXPECT_NE(track->getFlag(TrackFlag::Lock), 0);

    EXPECT_EQ(track->setFlag(TrackFlag::Lock, true), ResultOk);
    EXPECT_EQ(track->getFlag(TrackFlag::Lock), 0);

    EXPECT_EQ(track->setFlag(TrackFlag::Lock, false), ResultOk);
    EXPECT_NE(track->getFlag(TrackFlag::Lock), 0);
}

TEST(TrackNode, HasNoOtherFlag)
{
    TestHost host;
    const auto track = query<ITrackNode>(host.addTrack(TypeWord::Audio, u"DX 1"));
    track->setFlag(TrackFlag::Lock, true);

    for (const char* const name : {"mute", "", "Lock", static_cast<const char*>(nullptr)}) {
        EXPECT_NE(track->setFlag(name, true), ResultOk);
        EXPECT_NE(track->getFlag(name), ResultOk);
    }
}

TEST(TrackNode, ATrackOfSoundHasCurvesForVolumePanAndMute)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"DX 1");

    EXPECT_EQ(curveNumbersOf(track), (std::vector<int32>{1, 2, 3}));
    EXPECT_EQ(Envelope::Curve::nameOf(1), "volume");
    EXPECT_EQ(Envelope::Curve::nameOf(2), "pan");
    EXPECT_EQ(Envelope::Curve::nameOf(3), "mute");
    EXPECT_EQ(Envelope::Curve::nameOf(7), "");
}

TEST(TrackNode, CurvesAreListedByTheirNumbers)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"DX 1");
    dynamic_cast<Track&>(*track).curve(99);
    dynamic_cast<Track&>(*track).curve(Envelope::Curve::Filter);

    EXPECT_EQ(curveNumbersOf(track), (std::vector<int32>{1, 2, 3, 5, 99}));
}

TEST(TrackNode, OnlySoundAndPictureCanBeAutomated)
{
    TestHost host;

    EXPECT_EQ(curveNumbersOf(host.addTrack(TypeWord::Video, u"Picture")), std::vector<int32>{});
    for (const char* const word : {TypeWord::Folder, TypeWord::Ruler, TypeWord::Marker})
        EXPECT_EQ(query<ITrackNode>(host.addTrack(word, u"T"))->getAutomation(), nullptr) << word;
}

TEST(TrackNode, ACurveOutlivesItsTrackWithoutAParent)
{
    Counted<IProjectNode> curve;
    {
        TestHost host;
        curve = host.curveOf(host.addTrack(TypeWord::Audio, u"DX 1"), Envelope::Curve::Volume);
    }

    EXPECT_EQ(curve->getParent(), nullptr);
    EXPECT_EQ(curve->changeFlags(), 0U);
}

TEST(TrackNode, EndsWithItsLastEvent)
{
    TestHost host;
    const auto folder = host.addTrack(TypeWord::Folder, u"FX");
    const auto track = host.addTrack(TypeWord::Audio, u"FX 1", folder.get());
    EXPECT_EQ(track->getEnd(nullptr), 0.0);

    host.addClip(track, u"a", 0.0, 9.0);
    host.addClip(track, u"b", 2.0, 5.0);

    EXPECT_EQ(track->getEnd(nullptr), 9.0);
    EXPECT_EQ(folder->getEnd(nullptr), 9.0);
}

TEST(AutomationPoint, HasAValueFromZeroToOne)
{
    TestHost host;
    const auto point = create<IAutomationPoint>(host.context(), ClassId::AutomationPoint);
    EXPECT_EQ(point->getValue(), 0.0f);

    EXPECT_EQ(point->setValue(1.0f), ResultOk);
    EXPECT_EQ(point->getValue(), 1.0f);
    for (const float value :
         {-0.001f, 1.001f, std::numeric_limits<float>::quiet_NaN(), std::numeric_limits<float>::infinity()})
        EXPECT_NE(point->setValue(value), ResultOk) << value;

    EXPECT_EQ(point->getValue(), 1.0f);
}

TEST(AutomationPoint, TakesAValueOf32BitsForTheShortNumberThatItStandsFor)
{
    TestHost host;
    const auto counted = create<IAutomationPoint>(host.context(), ClassId::AutomationPoint);
    auto* const point = dynamic_cast<AutomationPoint*>(counted.get());
    ASSERT_NE(point, nullptr);
    for (const double number : {0.1, 0.7, 0.333, 0.251189, 0.0, 1.0, 0.5}) {
        EXPECT_EQ(counted->setValue(static_cast<float>(number)), ResultOk);
        EXPECT_EQ(point->value(), number);
        EXPECT_EQ(counted->getValue(), static_cast<float>(number));
    }
}

TEST(AutomationPoint, StandsAtATimeAndHasNoLength)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"DX 1");
    const auto point = host.addPoint(track, Envelope::Curve::Volume, 4.0, 0.5f);

    EXPECT_EQ(point->setStart(nullptr, 0, 6.0), ResultOk);
    EXPECT_NE(point->setEnd(nullptr, 0, 7.0), ResultOk);
    EXPECT_NE(point->setLength(nullptr, nullptr, 1.0), ResultOk);
    EXPECT_NE(point->setStart(nullptr, 0, -1.0), ResultOk);

    EXPECT_EQ(point->getStart(nullptr), 6.0);
    EXPECT_EQ(point->getEnd(nullptr), 6.0);
}

TEST(EnvelopeTrack, ItsChildrenAreItsPointsByTime)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"DX 1");
    const auto late = host.addPoint(track, Envelope::Curve::Volume, 4.0, 0.5f);
    const auto early = host.addPoint(track, Envelope::Curve::Volume, 1.0, 0.5f);
    const auto together = host.addPoint(track, Envelope::Curve::Volume, 4.0, 0.9f);
    host.addPoint(track, Envelope::Curve::Pan, 2.0, 0.5f);

    const auto curve = host.curveOf(track, Envelope::Curve::Volume);

    EXPECT_EQ(childrenOf(*curve), (std::vector{early, late, together}));
}

//    1       o
//           /|
//   0.5    / |   ____o
//         /  o__/
//    0  _o              values between are on the straight line
//       2    4       8
TEST(EnvelopeTrack, RunsStraightBetweenItsPointsAndStaysAtTheFirstAndTheLast)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"DX 1");
    host.addPoint(track, Envelope::Curve::Volume, 2.0, 0.0f);
    host.addPoint(track, Envelope::Curve::Volume, 4.0, 1.0f);
    host.addPoint(track, Envelope::Curve::Volume, 4.0, 0.25f);
    host.addPoint(track, Envelope::Curve::Volume, 8.0, 0.5f);
    const Envelope& curve = dynamic_cast<Track&>(*track).curve(Envelope::Curve::Volume);

    EXPECT_EQ(curve.valueBefore(0.0), 0.0);
    EXPECT_EQ(curve.valueBehind(0.0), 0.0);
    EXPECT_EQ(curve.valueBefore(2.0), 0.0);
    EXPECT_EQ(curve.valueBehind(2.0), 0.0);
    EXPECT_EQ(curve.valueBefore(3.0), 0.5);
    EXPECT_EQ(curve.valueBehind(3.0), 0.5);
    EXPECT_EQ(curve.valueBefore(4.0), 1.0);
    EXPECT_EQ(curve.valueBehind(4.0), 0.25);
    EXPECT_EQ(curve.valueBefore(6.0), 0.375);
    EXPECT_EQ(curve.valueBefore(8.0), 0.5);
    EXPECT_EQ(curve.valueBehind(100.0), 0.5);
}

TEST(EnvelopeTrack, HasNoValueWithoutPoints)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"DX 1");
    const Envelope& curve = dynamic_cast<Track&>(*track).curve(Envelope::Curve::Volume);

    EXPECT_FALSE(curve.valueBefore(1.0));
    EXPECT_FALSE(curve.valueBehind(1.0));
}

} // namespace standin::tests
