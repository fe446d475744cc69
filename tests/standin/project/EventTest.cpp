// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/standin/TestHost.h"

#include "standin/project/ClipEvent.h"
#include "standin/project/Marker.h"
#include "standin/project/Part.h"
#include "standin/project/Track.h"
#include "velmark/Attributes.h"
#include "velmark/Events.h"
#include "velmark/Media.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

/// A clip of somebody else.
class ForeignClip : public Implements<ForeignClip, FObject, IMediaClip> {
public:
    static constexpr const char* ClassName = "ForeignClip";

    uint32 getFrameCount() override { return 1; }
    IFilePath* getFile() override { return nullptr; }
};

Counted<ClipEvent> clipEvent(double start, double end, double offset)
{
    auto event = makeCounted<ClipEvent>();
    event->setSpan(start, end);
    event->setSourceOffset(offset);
    return event;
}

Counted<Marker> marker(bool isRange, double start, double end)
{
    auto event = makeCounted<Marker>(isRange);
    event->setSpan(start, end);
    return event;
}

} // namespace

TEST(EventNode, TheOwnerOfAnEventIsThePartAroundIt)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto outer = host.addPart(track, u"outer", 0.0, 20.0);
    const auto inner = host.addPart(outer, u"inner", 1.0, 19.0);
    const auto clip = host.addClip(inner, u"clip", 2.0, 3.0);

    EXPECT_EQ(query<IEventNode>(clip)->getOwner(), query<IEventNode>(inner).get());
    EXPECT_EQ(query<IEventNode>(inner)->getOwner(), query<IEventNode>(outer).get());
    EXPECT_EQ(query<IEventNode>(outer)->getOwner(), nullptr);
}

TEST(ClipEvent, KeepsAReferenceToItsClip)
{
    TestHost host;
    MediaClip& media = host.addMedia(u"/sound/door.wav", 5.0);
    const int32 references = media.refCount();
    const auto event = create<IClipEvent>(host.context());
    EXPECT_EQ(event->getClip(), nullptr);

    EXPECT_EQ(event->setClip(&media, 0), ResultOk);
    EXPECT_EQ(event->getClip(), &media);
    EXPECT_EQ(media.refCount(), references + 1);

    EXPECT_EQ(event->setClip(nullptr, 0), ResultOk);
    EXPECT_EQ(event->getClip(), nullptr);
    EXPECT_EQ(media.refCount(), references);
}

TEST(ClipEvent, RefusesAClipOfAnotherHostOrAnotherProject)
{
    TestHost host;
    MediaClip& media = host.addMedia(u"/sound/door.wav", 5.0);
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto event = query<IClipEvent>(host.addClip(track, u"door", 1.0, 2.0));
    event->setClip(&media, 0);
    Project& other = host.application.createProject();
    const auto ofOther = makeCounted<MediaClip>(MediaClip::Kind::Audio, u"/other.wav", 1.0);
    other.pool().add(ofOther);
    const auto ofNone = makeCounted<MediaClip>(MediaClip::Kind::Audio, u"/none.wav", 1.0);
    const auto foreign = makeCounted<ForeignClip>();

    EXPECT_NE(event->setClip(foreign.get(), 0), ResultOk);
    EXPECT_NE(event->setClip(ofOther.get(), 0), ResultOk);
    EXPECT_NE(event->setClip(ofNone.get(), 0), ResultOk);

    EXPECT_EQ(event->getClip(), &media);
}

TEST(ClipEvent, RefusesAClipOfAnotherProjectWhileItIsTakenOut)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto event = host.addClip(track, u"door", 1.0, 2.0);
    const auto part = host.addPart(track, u"storm", 10.0, 20.0);
    const auto inPart = host.addClip(part, u"thunder", 12.0, 13.0);
    const std::string before = host.dump();
    Project& other = host.application.createProject();
    const auto ofOther = makeCounted<MediaClip>(MediaClip::Kind::Audio, u"/other.wav", 1.0);
    other.pool().add(ofOther);
    host.edit(u"Delete", [&] {
        host.transaction()->remove(track.get(), event.get());
        host.transaction()->remove(track.get(), part.get());
    });

    EXPECT_NE(query<IClipEvent>(event)->setClip(ofOther.get(), 0), ResultOk);
    EXPECT_NE(query<IClipEvent>(inPart)->setClip(ofOther.get(), 0), ResultOk);

    EXPECT_TRUE(host.undo());
    EXPECT_EQ(host.dump(), before);
}

//     the event    10|--------------|18      from 3 s of its clip on
//     the piece         12|----|15           from 5 s on
TEST(Event, APieceOfAClipPlaysWhatTheEventPlaysThere)
{
    const auto media = makeCounted<MediaClip>(MediaClip::Kind::Audio, u"/a.wav", 60.0);
    const auto event = clipEvent(10.0, 18.0, 3.0);
    event->setClip(media);

    const auto piece = event->cutOut(12.0, 15.0);

    const auto& clip = dynamic_cast<const ClipEvent&>(*piece);
    EXPECT_EQ(clip.start(), 12.0);
    EXPECT_EQ(clip.end(), 15.0);
    EXPECT_EQ(clip.sourceOffset(), 5.0);
    EXPECT_EQ(clip.clip(), media.get());
    EXPECT_EQ(clip.parent(), nullptr);
    EXPECT_EQ(event->start(), 10.0);
    EXPECT_EQ(event->end(), 18.0);
}

TEST(Event, APieceHasTheNameTheAttributesAndTheSelectionOfTheEvent)
{
    const auto event = marker(true, 1.0, 9.0);
    event->setName(u"music");
    event->setSelected(true);
    event->setAttribute("reel", Attribute{std::string("A001"), true});
    event->setAttribute("mark", Attribute{int64{7}, false});
    event->setUnknownMembers("{\"colour\":1}");

    const auto piece = event->cutOut(2.0, 3.0);

    EXPECT_TRUE(piece->isType(TypeWord::Range));
    EXPECT_EQ(piece->name(), u"music");
    EXPECT_TRUE(piece->selected());
    EXPECT_EQ(piece->attributes(), event->attributes());
    EXPECT_EQ(piece->unknownMembers(), "{\"colour\":1}");
}

//     the part     100|--------------------|160
//       a               105|---|115                      cut to 110..115
//       b                       |120--130|
//       c                                  150|---|158   behind the end
//     the piece          110|---------------|140
TEST(Event, APieceOfAPartHasTheContentCutAsThePartIs)
{
    const auto part = makeCounted<Part>();
    part->setSpan(100.0, 160.0);
    clipEvent(5.0, 15.0, 1.0)->insertInto(*part);
    clipEvent(20.0, 30.0, 2.0)->insertInto(*part);
    clipEvent(50.0, 58.0, 3.0)->insertInto(*part);

    const auto piece = part->cutOut(110.0, 140.0);

    EXPECT_EQ(piece->start(), 110.0);
    EXPECT_EQ(piece->end(), 140.0);
    ASSERT_EQ(piece->childCount(), 2U);
    const auto& a = dynamic_cast<const ClipEvent&>(*piece->firstChild());
    EXPECT_EQ(a.start(), 0.0);
    EXPECT_EQ(a.end(), 5.0);
    EXPECT_EQ(a.sourceOffset(), 6.0);
    const auto& b = dynamic_cast<const ClipEvent&>(*piece->lastChild());
    EXPECT_EQ(b.start(), 10.0);
    EXPECT_EQ(b.end(), 20.0);
    EXPECT_EQ(b.sourceOffset(), 2.0);
    EXPECT_EQ(part->childCount(), 3U);
}

TEST(Event, WhatOnlyTouchesThePieceOfAPartStaysBehind)
{
    const auto part = makeCounted<Part>();
    part->setSpan(0.0, 100.0);
    clipEvent(0.0, 10.0, 0.0)->insertInto(*part);
    clipEvent(9.0, 10.000001, 0.0)->insertInto(*part);
    clipEvent(10.0, 10.0, 0.0)->insertInto(*part);
    clipEvent(20.0, 20.0, 0.0)->insertInto(*part);
    clipEvent(20.0, 30.0, 0.0)->insertInto(*part);

    const auto piece = part->cutOut(10.0, 20.0);

    ASSERT_EQ(piece->childCount(), 1U);
    EXPECT_EQ(piece->firstChild()->start(), 0.0);
    EXPECT_EQ(piece->firstChild()->end(), 0.0);
}

TEST(Event, WhatIsTooShortToBeCutIsInThePieceOfAPartInWhichItBegins)
{
    const auto part = makeCounted<Part>();
    part->setSpan(0.0, 100.0);
    clipEvent(5.0, 5.000001, 0.0)->insertInto(*part);
    clipEvent(9.999998, 10.000002, 0.0)->insertInto(*part);
    clipEvent(30.0, 30.000003, 0.0)->insertInto(*part);

    const auto first = part->cutOut(0.0, 10.0);
    const auto second = part->cutOut(10.0, 100.0);

    ASSERT_EQ(first->childCount(), 1U);
    EXPECT_EQ(first->firstChild()->start(), 5.0);
    ASSERT_EQ(second->childCount(), 2U);
    EXPECT_EQ(second->firstChild()->start(), 0.0);
    EXPECT_EQ(second->lastChild()->start(), 20.0);
}

//     the part      |---- a ----|..b..|      b stands behind the end of the part, where nobody hears it
//     the pieces    |-- a --|
//                           | a |..b..|
TEST(Event, TheLastPieceOfAPartHasWhatThePartHoldsBehindItsEnd)
{
    const auto part = makeCounted<Part>();
    part->setSpan(100.0, 110.0);
    clipEvent(0.0, 10.0, 0.0)->insertInto(*part);
    clipEvent(10.0, 14.0, 0.0)->insertInto(*part);

    const auto first = part->cutOut(100.0, 106.0);
    const auto last = part->cutOut(106.0, 110.0);

    EXPECT_EQ(first->childCount(), 1U);
    EXPECT_EQ(last->end(), 110.0);
    ASSERT_EQ(last->childCount(), 2U);
    EXPECT_EQ(last->lastChild()->start(), 4.0);
    EXPECT_EQ(last->lastChild()->end(), 8.0);
}

TEST(Event, PiecesThatStandSideBySideContinueEachOther)
{
    const auto event = clipEvent(10.0, 18.0, 3.0);

    const auto first = event->cutOut(10.0, 14.0);
    const auto second = event->cutOut(14.0, 18.0);

    EXPECT_TRUE(first->isContinuedBy(*second));
    EXPECT_FALSE(second->isContinuedBy(*first));
}

TEST(Event, PiecesThatWereMovedTogetherContinueEachOtherUpToTheTolerance)
{
    const auto event = clipEvent(10.0, 18.0, 3.0);
    const auto first = event->cutOut(10.0, 14.0);
    const auto second = event->cutOut(14.0, 18.0);
    first->setSpan(110.0, 114.0);

    second->setSpan(114.000002, 118.000002);
    EXPECT_TRUE(first->isContinuedBy(*second));

    second->setSpan(114.000003, 118.000003);
    EXPECT_FALSE(first->isContinuedBy(*second));
}

TEST(Event, PiecesOfPiecesContinueEachOther)
{
    const auto event = clipEvent(0.0, 9.0, 0.0);
    const auto front = event->cutOut(0.0, 6.0);

    const auto first = front->cutOut(1.0, 4.0);
    const auto second = event->cutOut(4.0, 9.0);

    EXPECT_TRUE(first->isContinuedBy(*second));
}

TEST(Event, PiecesFromDifferentPlacesOfOneEventDoNotContinueEachOther)
{
    const auto event = clipEvent(10.0, 18.0, 3.0);
    const auto first = event->cutOut(10.0, 14.0);
    const auto other = event->cutOut(15.0, 18.0);

    other->setSpan(14.0, 17.0);

    EXPECT_FALSE(first->isContinuedBy(*other));
}

TEST(Event, PiecesThatDifferInNameOrAttributesOrSourceDoNotContinueEachOther)
{
    const auto media = makeCounted<MediaClip>(MediaClip::Kind::Audio, u"/a.wav", 60.0);
    const auto event = clipEvent(10.0, 18.0, 3.0);
    const auto first = event->cutOut(10.0, 14.0);
    const auto renamed = event->cutOut(14.0, 18.0);
    renamed->setName(u"other");
    const auto marked = event->cutOut(14.0, 18.0);
    marked->setAttribute("a", Attribute{int64{1}, true});
    const auto slipped = event->cutOut(14.0, 18.0);
    dynamic_cast<ClipEvent&>(*slipped).setSourceOffset(7.5);
    const auto replaced = event->cutOut(14.0, 18.0);
    dynamic_cast<ClipEvent&>(*replaced).setClip(media);

    for (const auto& second : {renamed, marked, slipped, replaced})
        EXPECT_FALSE(first->isContinuedBy(*second));
}

TEST(Event, EventsThatWereNeverOneDoNotContinueEachOther)
{
    EXPECT_FALSE(clipEvent(10.0, 14.0, 3.0)->isContinuedBy(*clipEvent(14.0, 18.0, 7.0)));
}

TEST(Event, PiecesOfARangeMarkerContinueEachOtherButACopyOfTheWholeDoesNot)
{
    const auto event = marker(true, 10.0, 18.0);
    const auto first = event->cutOut(10.0, 14.0);
    const auto second = event->cutOut(14.0, 18.0);
    const auto copy = event->cutOut(10.0, 18.0);
    copy->setSpan(18.0, 26.0);

    EXPECT_TRUE(first->isContinuedBy(*second));
    EXPECT_FALSE(event->isContinuedBy(*copy));
}

TEST(Event, APointMarkerIsContinuedByNothing)
{
    const auto event = marker(false, 10.0, 10.0);

    EXPECT_FALSE(event->isContinuedBy(*event->cutOut(10.0, 10.0)));
}

TEST(Event, JoiningGivesTheEventBack)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    auto& container = dynamic_cast<Container&>(*track);
    const auto event = clipEvent(10.0, 18.0, 3.0);
    const auto first = event->cutOut(10.0, 14.0);
    const auto second = event->cutOut(14.0, 18.0);
    first->insertInto(container);
    second->insertInto(container);

    first->join(*second);

    EXPECT_EQ(container.childCount(), 1U);
    EXPECT_EQ(first->start(), 10.0);
    EXPECT_EQ(first->end(), 18.0);
    EXPECT_EQ(second->parent(), nullptr);
}

//     the part      |---- a ----|-- b --|
//     its pieces    |---- a --|a|-- b --|      joined: a is one again, b lies where it lay
TEST(Event, JoiningPartsJoinsTheirContent)
{
    const auto track = Track::create(Track::Kind::Audio);
    const auto part = makeCounted<Part>();
    part->setSpan(100.0, 120.0);
    clipEvent(0.0, 12.0, 1.0)->insertInto(*part);
    clipEvent(12.0, 20.0, 50.0)->insertInto(*part);
    const auto first = part->cutOut(100.0, 110.0);
    const auto second = part->cutOut(110.0, 120.0);
    first->insertInto(*track);
    second->insertInto(*track);
    ASSERT_TRUE(first->isContinuedBy(*second));

    first->join(*second);

    EXPECT_EQ(track->childCount(), 1U);
    EXPECT_EQ(first->end(), 120.0);
    ASSERT_EQ(first->childCount(), 2U);
    const auto& a = dynamic_cast<const ClipEvent&>(*first->firstChild());
    EXPECT_EQ(a.start(), 0.0);
    EXPECT_EQ(a.end(), 12.0);
    EXPECT_EQ(a.sourceOffset(), 1.0);
    const auto& b = dynamic_cast<const ClipEvent&>(*first->lastChild());
    EXPECT_EQ(b.start(), 12.0);
    EXPECT_EQ(b.end(), 20.0);
    EXPECT_EQ(b.sourceOffset(), 50.0);
}

} // namespace standin::tests
