// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/standin/TestHost.h"

#include "standin/project/ClipEvent.h"
#include "velmark/Attributes.h"
#include "velmark/Automation.h"
#include "velmark/Tracks.h"

#include <gtest/gtest.h>

#include <limits>
#include <string>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

using Names = std::vector<std::u16string>;

constexpr double Infinity = std::numeric_limits<double>::infinity();
constexpr double NotANumber = std::numeric_limits<double>::quiet_NaN();

/// A host with a track and a clip from 10 to 14 s on it.
struct HostWithClip : TestHost {
    Node track = addTrack(TypeWord::Audio, u"DX 1");
    Node clip = addClip(track, u"line", 10.0, 14.0);
};

} // namespace

TEST(ProjectNode, AttributesHoldAnIntegerATextOrAnObject)
{
    HostWithClip host;
    const auto list = create<IAttributeData>(host.context());
    list->setBinary("block", "abc", 3, true);

    EXPECT_EQ(host.clip->setAttribute("a", FVariant::integer(-5'000'000'000), true), ResultOk);
    EXPECT_EQ(host.clip->setAttribute("b", FVariant::string("A001"), true), ResultOk);
    EXPECT_EQ(host.clip->setAttribute("c", FVariant::object(list.get()), true), ResultOk);

    FVariant value;
    ASSERT_EQ(host.clip->getAttribute("a", value), ResultOk);
    EXPECT_TRUE(value.isInteger());
    EXPECT_EQ(value.asInteger(), -5'000'000'000);
    ASSERT_EQ(host.clip->getAttribute("b", value), ResultOk);
    EXPECT_STREQ(value.asString(), "A001");
    ASSERT_EQ(host.clip->getAttribute("c", value), ResultOk);
    char bytes[4] = {};
    ASSERT_EQ(query<IAttributeData>(value.asObject())->getBinary("block", bytes, 3), ResultOk);
    EXPECT_STREQ(bytes, "abc");
}

TEST(ProjectNode, AnAttributeListIsCopiedWhenItIsSetAndWhenItIsGot)
{
    HostWithClip host;
    const auto list = create<IAttributeData>(host.context());
    list->setBinary("block", "abc", 3, true);
    host.clip->setAttribute("a", FVariant::object(list.get()), true);
    const std::string before = host.dump();

    list->setBinary("block", "another", 7, true);
    FVariant value;
    host.clip->getAttribute("a", value);
    query<IAttributeData>(value.asObject())->setBinary("block", "one", 3, true);

    EXPECT_EQ(host.dump(), before);
}

TEST(ProjectNode, ATextThatWasSetIsTheNodesOwn)
{
    HostWithClip host;
    std::string reel = "A001";

    host.clip->setAttribute("reel", FVariant::string(reel.c_str()), true);
    reel = "B002";

    FVariant value;
    host.clip->getAttribute("reel", value);
    EXPECT_STREQ(value.asString(), "A001");
}

TEST(ProjectNode, AnAttributeCanBeReplacedByOneOfAnotherKind)
{
    HostWithClip host;
    host.clip->setAttribute("a", FVariant::integer(1), true);

    host.clip->setAttribute("a", FVariant::string("one"), true);

    FVariant value;
    host.clip->getAttribute("a", value);
    EXPECT_STREQ(value.asString(), "one");
    EXPECT_FALSE(value.isInteger());
}

TEST(ProjectNode, ARemovedAttributeIsNotThere)
{
    HostWithClip host;
    host.clip->setAttribute("a", FVariant::integer(1), true);
    EXPECT_EQ(host.clip->hasAttribute("a"), ResultOk);

    EXPECT_EQ(host.clip->removeAttribute("a"), ResultOk);

    EXPECT_NE(host.clip->hasAttribute("a"), ResultOk);
    EXPECT_NE(host.clip->removeAttribute("a"), ResultOk);
}

TEST(ProjectNode, AMissingAttributeLeavesTheValueAsItWas)
{
    HostWithClip host;
    FVariant value = FVariant::integer(7);

    EXPECT_NE(host.clip->getAttribute("none", value), ResultOk);

    EXPECT_EQ(value.asInteger(), 7);
}

TEST(ProjectNode, WhatIsNoAttributeIsRefused)
{
    HostWithClip host;
    FVariant value;

    EXPECT_NE(host.clip->setAttribute(nullptr, FVariant::integer(1), true), ResultOk);
    EXPECT_NE(host.clip->setAttribute("\xff", FVariant::integer(1), true), ResultOk);
    EXPECT_NE(host.clip->setAttribute("a", FVariant(), true), ResultOk);
    EXPECT_NE(host.clip->setAttribute("a", FVariant::string(nullptr), true), ResultOk);
    EXPECT_NE(host.clip->setAttribute("a", FVariant::string("caf\xe9"), true), ResultOk);
    EXPECT_NE(host.clip->setAttribute("a", FVariant::object(nullptr), true), ResultOk);

    EXPECT_NE(host.clip->hasAttribute("a"), ResultOk);
    EXPECT_NE(host.clip->hasAttribute(nullptr), ResultOk);
    EXPECT_NE(host.clip->getAttribute(nullptr, value), ResultOk);
    EXPECT_NE(host.clip->removeAttribute(nullptr), ResultOk);
}

TEST(ProjectNode, OnlyAnAttributeListCanBeStoredWithTheProject)
{
    HostWithClip host;
    std::vector<std::string> calls;
    const auto foreign = makeCounted<Recorder>(calls);
    const FVariant value = FVariant::object(static_cast<FObject*>(foreign.get()));

    EXPECT_NE(host.clip->setAttribute("a", value, true), ResultOk);
    EXPECT_EQ(host.clip->setAttribute("a", value, false), ResultOk);
}

TEST(ProjectNode, AttributesGiveTheirObjectsBack)
{
    std::vector<std::string> calls;
    const auto foreign = makeCounted<Recorder>(calls);
    {
        HostWithClip host;
        host.clip->setAttribute("a", FVariant::object(static_cast<FObject*>(foreign.get())), false);
        EXPECT_EQ(foreign->refCount(), 2);
    }

    EXPECT_EQ(foreign->refCount(), 1);
}

TEST(ProjectNode, HasTheNameThatItWasGiven)
{
    HostWithClip host;
    const auto name = makeCounted<StringObject>("T\xc3\xb6ne");

    EXPECT_EQ(host.clip->setName(host.track.get(), name.get(), 0), ResultOk);

    EXPECT_EQ(std::u16string(host.clip->getName()), u"T\u00f6ne");
}

TEST(ProjectNode, KeepsItsNameWhenThereIsNoneOrABrokenOne)
{
    HostWithClip host;

    EXPECT_NE(host.clip->setName(nullptr, nullptr, 0), ResultOk);
    const char16_t half[] = {u'a', 0xD800, 0};
    EXPECT_NE(host.clip->setName(nullptr, text(half).get(), 0), ResultOk);
    const char16_t otherHalf[] = {0xDC00, u'a', 0};
    EXPECT_NE(host.clip->setName(nullptr, text(otherHalf).get(), 0), ResultOk);

    EXPECT_EQ(std::u16string(host.clip->getName()), u"line");
}

TEST(ProjectNode, SetStartMovesAnEventAndKeepsItsLength)
{
    HostWithClip host;

    EXPECT_EQ(host.clip->setStart(host.track.get(), 0, 20.0), ResultOk);

    EXPECT_EQ(host.clip->getStart(nullptr), 20.0);
    EXPECT_EQ(host.clip->getEnd(nullptr), 24.0);
}

TEST(ProjectNode, SetEndAndSetLengthMoveTheEndAlone)
{
    HostWithClip host;

    EXPECT_EQ(host.clip->setEnd(nullptr, 0, 17.0), ResultOk);
    EXPECT_EQ(host.clip->getEnd(nullptr), 17.0);

    EXPECT_EQ(host.clip->setLength(nullptr, host.transaction(), 2.5), ResultOk);
    EXPECT_EQ(host.clip->getEnd(nullptr), 12.5);
    EXPECT_EQ(host.clip->getStart(nullptr), 10.0);
}

TEST(ProjectNode, TimesThatCannotBeAreRefused)
{
    HostWithClip host;
    const std::string before = host.dump();

    for (const double time : {NotANumber, Infinity, -Infinity, -1.0, 1.1e9, 1e308, -1e308})
        EXPECT_NE(host.clip->setStart(nullptr, 0, time), ResultOk) << time;
    for (const double time : {NotANumber, Infinity, -Infinity, 9.9, 1.1e9})
        EXPECT_NE(host.clip->setEnd(nullptr, 0, time), ResultOk) << time;
    for (const double length : {NotANumber, Infinity, -Infinity, -0.1, 1.1e9})
        EXPECT_NE(host.clip->setLength(nullptr, nullptr, length), ResultOk) << length;

    EXPECT_EQ(host.dump(), before);
}

TEST(ProjectNode, AHairBelowTheLeastTimeIsThatTime)
{
    HostWithClip host;

    EXPECT_EQ(host.clip->setStart(nullptr, 0, -1e-9), ResultOk);
    EXPECT_EQ(host.clip->getStart(nullptr), 0.0);

    EXPECT_EQ(host.clip->setEnd(nullptr, 0, -1e-9), ResultOk);
    EXPECT_EQ(host.clip->getEnd(nullptr), 0.0);
}

TEST(ProjectNode, APointMarkerHasNoLength)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Marker, u"Memos");
    const auto marker = host.addPointMarker(track, u"M", 5.0);

    EXPECT_NE(marker->setEnd(nullptr, 0, 6.0), ResultOk);
    EXPECT_NE(marker->setLength(nullptr, nullptr, 1.0), ResultOk);
    EXPECT_EQ(marker->setStart(nullptr, 0, 7.0), ResultOk);

    EXPECT_EQ(marker->getStart(nullptr), 7.0);
    EXPECT_EQ(marker->getEnd(nullptr), 7.0);
}

TEST(ProjectNode, ARangeMarkerHasALength)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Marker, u"Memos");
    const auto marker = host.addRangeMarker(track, u"M", 5.0, 6.0);

    EXPECT_EQ(marker->setStart(nullptr, 0, 7.0), ResultOk);
    EXPECT_EQ(marker->setLength(nullptr, nullptr, 3.0), ResultOk);

    EXPECT_EQ(marker->getStart(nullptr), 7.0);
    EXPECT_EQ(marker->getEnd(nullptr), 10.0);
}

TEST(ProjectNode, TracksAndTheProjectStandAtTheBeginning)
{
    HostWithClip host;

    for (IProjectNode* const node : {host.track.get(), host.root()}) {
        EXPECT_NE(node->setStart(nullptr, 0, 1.0), ResultOk);
        EXPECT_NE(node->setEnd(nullptr, 0, 1.0), ResultOk);
        EXPECT_NE(node->setLength(nullptr, nullptr, 1.0), ResultOk);
        EXPECT_EQ(node->getStart(nullptr), 0.0);
        EXPECT_EQ(node->getEnd(nullptr), 14.0);
    }
}

TEST(ProjectNode, TimesOfWhatLiesInAPartCanBeAskedFromTheProjectAndFromThePart)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto part = host.addPart(track, u"storm", 100.0, 160.0);
    const auto clip = host.addClip(part, u"thunder", 110.0, 115.0);

    EXPECT_EQ(clip->getStart(nullptr), 110.0);
    EXPECT_EQ(clip->getStart(track.get()), 110.0);
    EXPECT_EQ(clip->getStart(host.root()), 110.0);
    EXPECT_EQ(clip->getStart(part.get()), 10.0);
    EXPECT_EQ(clip->getEnd(part.get()), 15.0);

    EXPECT_EQ(clip->setStart(part.get(), 0, 20.0), ResultOk);
    EXPECT_EQ(clip->setEnd(nullptr, 0, 130.0), ResultOk);
    EXPECT_EQ(clip->getStart(nullptr), 120.0);
    EXPECT_EQ(clip->getEnd(part.get()), 30.0);
}

TEST(ProjectNode, TheTimesOfAllElseCanBeAskedFromAPartToo)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto part = host.addPart(track, u"storm", 100.0, 160.0);

    for (IProjectNode* const node : {track.get(), host.root()}) {
        EXPECT_EQ(node->getStart(part.get()), -100.0);
        EXPECT_EQ(node->getEnd(part.get()), 60.0);
    }
}

TEST(ProjectNode, WhatLiesInAPartMovesWithIt)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto part = host.addPart(track, u"storm", 100.0, 160.0);
    const auto inner = host.addPart(part, u"rain", 105.0, 150.0);
    const auto clip = host.addClip(inner, u"drops", 110.0, 115.0);

    part->setStart(nullptr, 0, 200.0);

    EXPECT_EQ(clip->getStart(nullptr), 210.0);
    EXPECT_EQ(clip->getEnd(nullptr), 215.0);
    EXPECT_EQ(clip->getStart(inner.get()), 5.0);
}

TEST(ProjectNode, NothingBeginsBeforeThePartThatItLiesIn)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto part = host.addPart(track, u"storm", 100.0, 160.0);
    const auto clip = host.addClip(part, u"thunder", 110.0, 115.0);

    EXPECT_NE(clip->setStart(nullptr, 0, 99.0), ResultOk);
    EXPECT_NE(clip->setStart(part.get(), 0, -1.0), ResultOk);

    EXPECT_EQ(clip->getStart(nullptr), 110.0);
}

TEST(ProjectNode, AForeignTimeContextIsRefused)
{
    HostWithClip host;
    std::vector<std::string> calls;
    const auto foreign = makeCounted<Recorder>(calls);
    FUnknown* const context = static_cast<FObject*>(foreign.get());
    Project& other = host.application.createProject();

    EXPECT_NE(host.clip->setStart(context, 0, 1.0), ResultOk);
    EXPECT_NE(host.clip->setEnd(context, 0, 20.0), ResultOk);
    EXPECT_NE(host.clip->setLength(context, nullptr, 20.0), ResultOk);
    EXPECT_NE(host.clip->setStart(static_cast<IProjectNode*>(&other), 0, 1.0), ResultOk);

    EXPECT_EQ(host.clip->getStart(context), 10.0);
    EXPECT_EQ(host.clip->getEnd(context), 14.0);
}

TEST(ProjectNode, AForeignTimeContextGivesTheTimesOfTheProject)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto part = host.addPart(track, u"storm", 100.0, 160.0);
    const auto clip = host.addClip(part, u"thunder", 110.0, 115.0);
    IProjectNode* const other = &host.application.createProject();

    EXPECT_EQ(clip->getStart(other), 110.0);
    EXPECT_EQ(clip->getEnd(other), 115.0);
}

TEST(ProjectNode, AnEventAsTimeContextStandsForWhatItLiesIn)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto part = host.addPart(track, u"storm", 100.0, 160.0);
    const auto clip = host.addClip(part, u"thunder", 110.0, 115.0);

    EXPECT_EQ(clip->getStart(clip.get()), 10.0);
}

TEST(ProjectNode, HasTheParentThatItLiesIn)
{
    TestHost host;
    const auto folder = host.addTrack(TypeWord::Folder, u"Dialogue");
    const auto track = host.addTrack(TypeWord::Audio, u"DX 1", folder.get());
    const auto part = host.addPart(track, u"scene", 0.0, 10.0);
    const auto clip = host.addClip(part, u"line", 1.0, 2.0);
    const auto point = host.addPoint(track, Envelope::Curve::Volume, 1.0, 0.5f);

    EXPECT_EQ(clip->getParent(), part.get());
    EXPECT_EQ(part->getParent(), track.get());
    EXPECT_EQ(track->getParent(), folder.get());
    EXPECT_EQ(folder->getParent(), host.root());
    EXPECT_EQ(host.root()->getParent(), nullptr);
    const auto curve = host.curveOf(track, Envelope::Curve::Volume);
    EXPECT_EQ(point->getParent(), curve.get());
    EXPECT_EQ(curve->getParent(), track.get());
}

TEST(ProjectNode, WhatIsNotInsertedHasNoParent)
{
    TestHost host;
    const auto clip = query<IProjectNode>(create<IClipEvent>(host.context()));
    const auto track = query<IProjectNode>(Counted<FUnknown>::adopt(host.document()->createTrack(TypeWord::Audio)));

    EXPECT_EQ(clip->getParent(), nullptr);
    EXPECT_EQ(track->getParent(), nullptr);
}

TEST(ProjectNode, ChildrenComeByTheirStartAndThoseThatStartTogetherInTheOrderOfTheirInsertion)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"DX 1");
    host.addClip(track, u"second", 2.0, 9.0);
    host.addClip(track, u"third", 2.0, 3.0);
    host.addClip(track, u"first", 1.0, 2.0);
    const auto moved = host.addClip(track, u"fourth", 0.0, 2.0);

    moved->setStart(nullptr, 0, 5.0);

    EXPECT_EQ(namesOf(*track), (Names{u"first", u"second", u"third", u"fourth"}));
}

TEST(ProjectNode, APartIsOneChild)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto part = host.addPart(track, u"storm", 10.0, 20.0);
    host.addClip(part, u"thunder", 11.0, 12.0);
    host.addClip(track, u"after", 30.0, 31.0);

    EXPECT_EQ(namesOf(*track), (Names{u"storm", u"after"}));
    EXPECT_EQ(namesOf(*part), (Names{u"thunder"}));
}

TEST(ProjectNode, TracksComeFromTopToBottom)
{
    TestHost host;
    const auto folder = host.addTrack(TypeWord::Folder, u"Z");
    host.addTrack(TypeWord::Audio, u"A");
    host.addTrack(TypeWord::Audio, u"D", folder.get());
    host.addTrack(TypeWord::Audio, u"C", folder.get());

    EXPECT_EQ(namesOf(*host.root()), (Names{u"Z", u"A"}));
    EXPECT_EQ(namesOf(*folder), (Names{u"D", u"C"}));
}

TEST(ProjectNode, WhatHasNoChildrenHasAnIteratorThatIsDone)
{
    HostWithClip host;

    const auto ofClip = Counted<INodeIterator>::adopt(host.clip->newChildIterator());
    const auto point = create<IProjectNode>(host.context(), ClassId::AutomationPoint);
    const auto ofPoint = Counted<INodeIterator>::adopt(point->newChildIterator());

    EXPECT_TRUE(ofClip->isDone());
    EXPECT_EQ(ofClip->next(), nullptr);
    EXPECT_TRUE(ofPoint->isDone());
    EXPECT_EQ(ofPoint->next(), nullptr);
}

TEST(ProjectNode, AnIteratorBehindItsEndStaysThere)
{
    HostWithClip host;
    const auto iterator = Counted<INodeIterator>::adopt(host.track->newChildIterator());

    EXPECT_EQ(iterator->next(), host.clip.get());

    EXPECT_TRUE(iterator->isDone());
    EXPECT_EQ(iterator->next(), nullptr);
    EXPECT_EQ(iterator->next(), nullptr);
}

TEST(ProjectNode, AnIteratorEndsWhereItsNextChildWasTakenAway)
{
    HostWithClip host;
    const auto second = host.addClip(host.track, u"next", 20.0, 21.0);
    const auto iterator = Counted<INodeIterator>::adopt(host.track->newChildIterator());
    EXPECT_EQ(iterator->next(), host.clip.get());

    host.edit(u"Delete", [&] { host.transaction()->remove(host.track.get(), second.get()); });

    EXPECT_TRUE(iterator->isDone());
    EXPECT_EQ(iterator->next(), nullptr);
}

TEST(ProjectNode, AnIteratorKeepsItsContainerAlive)
{
    Counted<INodeIterator> iterator;
    {
        TestHost host;
        host.addTrack(TypeWord::Audio, u"DX 1");
        iterator = Counted<INodeIterator>::adopt(host.root()->newChildIterator());
    }

    EXPECT_FALSE(iterator->isDone());
    EXPECT_EQ(std::u16string(iterator->next()->getName()), u"DX 1");
    EXPECT_TRUE(iterator->isDone());
}

TEST(ProjectNode, AnEventAnswersToTheKindOfItsTrack)
{
    TestHost host;
    const auto audio = host.addTrack(TypeWord::Audio, u"A");
    const auto video = host.addTrack(TypeWord::Video, u"V");
    const auto marker = host.addTrack(TypeWord::Marker, u"M");
    const auto part = host.addPart(audio, u"part", 0.0, 10.0);
    const auto inPart = host.addClip(part, u"clip", 1.0, 2.0);
    const auto picture = host.addClip(video, u"shot", 1.0, 2.0);
    const auto point = host.addPointMarker(marker, u"P", 1.0);
    const auto range = host.addRangeMarker(marker, u"R", 1.0, 2.0);

    EXPECT_TRUE(inPart->isType("audio"));
    EXPECT_FALSE(inPart->isType("video"));
    EXPECT_FALSE(inPart->isType("part"));
    EXPECT_FALSE(inPart->isType("track"));
    EXPECT_TRUE(part->isType("part"));
    EXPECT_TRUE(part->isType("audio"));
    EXPECT_TRUE(picture->isType("video"));
    EXPECT_TRUE(point->isType("marker"));
    EXPECT_FALSE(point->isType("range"));
    EXPECT_TRUE(range->isType("marker"));
    EXPECT_TRUE(range->isType("range"));
}

TEST(ProjectNode, NoNodeAnswersToNoWordOrToAnUnknownOne)
{
    HostWithClip host;
    const auto part = host.addPart(host.track, u"part", 20.0, 30.0);
    const auto memos = host.addTrack(TypeWord::Marker, u"Memos");
    const auto marker = host.addPointMarker(memos, u"M", 1.0);
    const auto point = host.addPoint(host.track, Envelope::Curve::Pan, 1.0, 0.5f);

    for (IProjectNode* const node :
         {host.root(), host.track.get(), host.clip.get(), part.get(), marker.get(), point.get()}) {
        EXPECT_FALSE(node->isType(nullptr));
        EXPECT_FALSE(node->isType(""));
        EXPECT_FALSE(node->isType("Audio"));
    }
}

TEST(ProjectNode, OnlyClipEventsPlayFromAnOffset)
{
    HostWithClip host;
    dynamic_cast<ClipEvent&>(*host.clip).setSourceOffset(3.5);

    EXPECT_EQ(host.clip->getSourceOffset(nullptr), 3.5);
    EXPECT_EQ(host.track->getSourceOffset(nullptr), 0.0);
}

TEST(ProjectNode, SelectionIsWhatTheUserMade)
{
    HostWithClip host;
    EXPECT_FALSE(host.track->isSelected());

    dynamic_cast<standin::Node&>(*host.track).setSelected(true);

    EXPECT_TRUE(host.track->isSelected());
}

TEST(ProjectNode, AnswersForAllOfItsInterfacesWithOneIdentity)
{
    HostWithClip host;

    const auto identity = query<FUnknown>(host.clip);
    EXPECT_EQ(query<FUnknown>(query<IClipEvent>(host.clip)), identity);
    EXPECT_EQ(query<FUnknown>(query<IEventNode>(host.clip)), identity);
    EXPECT_FALSE(query<ITrackNode>(host.clip));
    EXPECT_FALSE(query<IAutomationPoint>(host.clip));
    EXPECT_TRUE(query<ITrackNode>(host.track));
}

} // namespace standin::tests
