// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/standin/TestHost.h"

#include "standin/edit/EditService.h"
#include "standin/edit/ProjectManager.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Part.h"
#include "standin/project/Track.h"
#include "velmark/Attributes.h"
#include "velmark/Automation.h"
#include "velmark/Events.h"
#include "velmark/Tracks.h"

#include <gtest/gtest.h>

#include <functional>
#include <limits>
#include <string>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

using Calls = std::vector<std::string>;
using Names = std::vector<std::u16string>;

constexpr double Infinity = std::numeric_limits<double>::infinity();
constexpr double NotANumber = std::numeric_limits<double>::quiet_NaN();

/// A project with something of everything that can be edited.
struct HostWithProject : TestHost {
    Node folder = addTrack(TypeWord::Folder, u"Dialogue");
    Node track = addTrack(TypeWord::Audio, u"DX 1", folder.get());
    Node other = addTrack(TypeWord::Audio, u"DX 2");
    Node memos = addTrack(TypeWord::Marker, u"Memos");
    Node clip = addClip(track, u"line", 10.0, 14.0);
    Node next = addClip(track, u"next", 10.0, 12.0);
    Node part = addPart(other, u"scene", 20.0, 40.0);
    Node inPart = addClip(part, u"door", 25.0, 26.0);
    Node marker = addRangeMarker(memos, u"memo", 5.0, 6.0);
    Node point = addPoint(track, Envelope::Curve::Volume, 3.0, 0.5f);
    Node samePlace = addPoint(track, Envelope::Curve::Volume, 3.0, 0.75f);
};

/// Does what it is told through the host, as one entry; and checks that undo and redo lead to the same bytes.
void expectUndoable(HostWithProject& host, const std::function<void()>& edits)
{
    const std::string before = host.dump();
    host.edit(u"Edit", edits);
    const std::string after = host.dump();
    ASSERT_NE(before, after);

    for (int round = 0; round < 2; ++round) {
        EXPECT_TRUE(host.undo());
        EXPECT_EQ(host.dump(), before);
        EXPECT_TRUE(host.redo());
        EXPECT_EQ(host.dump(), after);
    }
}

} // namespace

TEST(EditTransaction, IsAskedOfTheEditService)
{
    TestHost host;

    EXPECT_TRUE(host.editService());
    EXPECT_EQ(query<IEditTransaction>(host.editService()).get(), host.transaction());
}

TEST(EditTransaction, OnlyOneCanBeOpen)
{
    TestHost host;
    EXPECT_EQ(host.transaction()->begin(true), ResultOk);

    EXPECT_NE(host.transaction()->begin(true), ResultOk);

    EXPECT_EQ(host.transaction()->commit(host.document(), u"Edit"), ResultOk);
    EXPECT_EQ(host.transaction()->begin(true), ResultOk);
    EXPECT_EQ(host.transaction()->commit(host.document(), u"Edit"), ResultOk);
}

TEST(EditTransaction, ACommitOfNothingMakesNoEntry)
{
    TestHost host;

    host.edit(u"Nothing", [] {});

    EXPECT_EQ(host.project.undoList().size(), 0U);
    EXPECT_FALSE(host.undo());
}

TEST(EditTransaction, SettingWhatIsThereAlreadyIsNoEdit)
{
    HostWithProject host;
    host.clip->setAttribute("a", FVariant::integer(1), true);
    const std::size_t entries = host.project.undoList().size();

    host.edit(u"Nothing", [&] {
        host.clip->setName(nullptr, text(u"line").get(), 0);
        host.clip->setStart(nullptr, 0, 10.0);
        host.clip->setAttribute("a", FVariant::integer(1), true);
        query<IAutomationPoint>(host.point)->setValue(0.5f);
        query<ITrackNode>(host.track)->setFlag(TrackFlag::Lock, false);
    });

    EXPECT_EQ(host.project.undoList().size(), entries);
}

TEST(EditTransaction, ACommitMakesOneEntryOfItsName)
{
    HostWithProject host;
    const std::size_t entries = host.project.undoList().size();

    host.edit(u"Trim", [&] {
        host.clip->setEnd(nullptr, 0, 13.0);
        host.next->setEnd(nullptr, 0, 13.0);
    });

    ASSERT_EQ(host.project.undoList().size(), entries + 1);
    EXPECT_EQ(host.project.undoList().nameAt(entries), u"Trim");
}

TEST(EditTransaction, AnEntryMayHaveNoName)
{
    HostWithProject host;
    const std::size_t entries = host.project.undoList().size();

    host.edit(nullptr, [&] { host.clip->setEnd(nullptr, 0, 13.0); });

    EXPECT_EQ(host.project.undoList().nameAt(entries), u"");
}

TEST(EditTransaction, CommitNeedsAnOpenTransactionAndAnOpenProject)
{
    HostWithProject host;
    EXPECT_NE(host.transaction()->commit(host.document(), u"Edit"), ResultOk);

    host.transaction()->begin(true);
    host.clip->setEnd(nullptr, 0, 13.0);
    const auto closed = makeCounted<Project>(host.application.edits().log());
    EXPECT_NE(host.transaction()->commit(nullptr, u"Edit"), ResultOk);
    EXPECT_NE(host.transaction()->commit(closed.get(), u"Edit"), ResultOk);

    EXPECT_NE(host.transaction()->begin(true), ResultOk);
    EXPECT_EQ(host.transaction()->commit(host.document(), u"Edit"), ResultOk);
    EXPECT_TRUE(host.undo());
    EXPECT_EQ(host.clip->getEnd(nullptr), 14.0);
}

TEST(EditTransaction, EveryEditNeedsItOpen)
{
    HostWithProject host;
    const std::string before = host.dump();
    const auto fresh = query<IProjectNode>(create<IClipEvent>(host.context()));
    const auto list = create<IObjectList>(host.context());
    list->add(host.track.get(), 0);
    Calls calls;
    const auto step = makeCounted<Recorder>(calls);
    IEditTransaction* const transaction = host.transaction();
    FUnknown* clipboard = nullptr;

    EXPECT_NE(transaction->insert(host.track.get(), fresh.get()), ResultOk);
    EXPECT_NE(transaction->remove(host.track.get(), host.clip.get()), ResultOk);
    EXPECT_NE(transaction->move(host.track.get(), host.other.get(), host.clip.get()), ResultOk);
    EXPECT_NE(transaction->deleteRange(host.document(), 0, 0.0, 100.0), ResultOk);
    EXPECT_NE(transaction->copyAll(host.document(), &clipboard, 0.0, 100.0, 0), ResultOk);
    EXPECT_NE(transaction->addStep(step.get()), ResultOk);
    EXPECT_NE(host.editService()->copyRange(host.document(), list.get(), 0, 0.0, 5.0, 50.0), ResultOk);
    EXPECT_GT(host.editService()->closeRange(host.document(), list.get(), 0.0, 5.0, 0.0), ResultFalse);

    EXPECT_EQ(clipboard, nullptr);
    EXPECT_EQ(step->refCount(), 1);
    EXPECT_EQ(host.dump(), before);
}

TEST(EditTransaction, InsertPutsAnEventIntoATrack)
{
    HostWithProject host;
    const auto fresh = query<IProjectNode>(create<IClipEvent>(host.context()));
    fresh->setStart(host.other.get(), 0, 30.0);
    fresh->setEnd(host.other.get(), 0, 31.0);

    expectUndoable(host, [&] { EXPECT_EQ(host.transaction()->insert(host.other.get(), fresh.get()), ResultOk); });

    EXPECT_EQ(childrenOf(*host.other), (std::vector{host.part, fresh}));
    EXPECT_EQ(fresh->getStart(nullptr), 30.0);
}

TEST(EditTransaction, InsertPutsATrackIntoAFolderOrIntoTheRoot)
{
    HostWithProject host;
    const auto top = query<IProjectNode>(Counted<FUnknown>::adopt(host.document()->createTrack("video")));
    const auto inside = query<IProjectNode>(Counted<FUnknown>::adopt(host.document()->createTrack("audio")));
    const auto root = Counted<FUnknown>::adopt(host.document()->getContainer(nullptr));

    expectUndoable(host, [&] {
        EXPECT_EQ(host.transaction()->insert(root.get(), top.get()), ResultOk);
        EXPECT_EQ(host.transaction()->insert(host.folder.get(), inside.get()), ResultOk);
    });

    EXPECT_EQ(top->getParent(), host.root());
    EXPECT_EQ(inside->getParent(), host.folder.get());
}

TEST(EditTransaction, WhatIsInsertedIntoAPartKeepsItsTimesOfTheProject)
{
    HostWithProject host;
    const auto fresh = query<IProjectNode>(create<IClipEvent>(host.context()));
    fresh->setStart(nullptr, 0, 30.0);
    fresh->setEnd(nullptr, 0, 31.0);

    expectUndoable(host, [&] { EXPECT_EQ(host.transaction()->insert(host.part.get(), fresh.get()), ResultOk); });

    EXPECT_EQ(fresh->getStart(nullptr), 30.0);
    EXPECT_EQ(fresh->getEnd(nullptr), 31.0);
    EXPECT_EQ(fresh->getStart(host.part.get()), 10.0);
}

TEST(EditTransaction, InsertRefusesWhatCannotLieThere)
{
    HostWithProject host;
    IProjectNode& media = host.addMedia(u"/a.wav", 1.0);
    const std::string before = host.dump();
    const auto fresh = query<IProjectNode>(create<IClipEvent>(host.context()));
    const auto freshMarker = create<IProjectNode>(host.context(), ClassId::PointMarker);
    const auto freshPoint = create<IProjectNode>(host.context(), ClassId::AutomationPoint);
    const auto freshTrack = query<IProjectNode>(Counted<FUnknown>::adopt(host.document()->createTrack("audio")));
    const auto curve = host.curveOf(host.track, Envelope::Curve::Volume);
    Calls calls;
    const auto foreign = makeCounted<Recorder>(calls);
    FUnknown* const foreignObject = static_cast<FObject*>(foreign.get());
    const auto refuses = [&](FUnknown* parent, FUnknown* child) {
        return host.transaction()->insert(parent, child) != ResultOk;
    };

    host.transaction()->begin(true);
    EXPECT_TRUE(refuses(nullptr, fresh.get()));
    EXPECT_TRUE(refuses(host.track.get(), nullptr));
    EXPECT_TRUE(refuses(nullptr, nullptr));
    EXPECT_TRUE(refuses(foreignObject, fresh.get()));
    EXPECT_TRUE(refuses(host.track.get(), foreignObject));
    EXPECT_TRUE(refuses(host.root(), fresh.get()));
    EXPECT_TRUE(refuses(host.folder.get(), fresh.get()));
    EXPECT_TRUE(refuses(host.memos.get(), fresh.get()));
    EXPECT_TRUE(refuses(host.clip.get(), fresh.get()));
    EXPECT_TRUE(refuses(curve.get(), fresh.get()));
    EXPECT_TRUE(refuses(host.track.get(), freshMarker.get()));
    EXPECT_TRUE(refuses(host.part.get(), freshMarker.get()));
    EXPECT_TRUE(refuses(host.track.get(), freshPoint.get()));
    EXPECT_TRUE(refuses(host.track.get(), freshTrack.get()));
    EXPECT_TRUE(refuses(host.part.get(), freshTrack.get()));
    EXPECT_TRUE(refuses(host.track.get(), &media));
    EXPECT_TRUE(refuses(host.folder.get(), host.root()));
    EXPECT_TRUE(refuses(host.track.get(), curve.get()));
    host.transaction()->commit(host.document(), u"Edit");

    EXPECT_EQ(host.dump(), before);
    for (IProjectNode* const node : {fresh.get(), freshMarker.get(), freshPoint.get(), freshTrack.get(), &media})
        EXPECT_EQ(node->getParent(), nullptr);
}

TEST(EditTransaction, InsertRefusesWhatIsInsertedAlready)
{
    HostWithProject host;
    const std::string before = host.dump();

    host.transaction()->begin(true);
    EXPECT_NE(host.transaction()->insert(host.track.get(), host.clip.get()), ResultOk);
    EXPECT_NE(host.transaction()->insert(host.other.get(), host.clip.get()), ResultOk);
    EXPECT_NE(host.transaction()->insert(host.root(), host.folder.get()), ResultOk);
    host.transaction()->commit(host.document(), u"Edit");

    EXPECT_EQ(host.dump(), before);
}

TEST(EditTransaction, InsertRefusesAParentThatIsInNoOpenProject)
{
    HostWithProject host;
    const auto fresh = query<IProjectNode>(create<IClipEvent>(host.context()));
    const auto loose = query<IProjectNode>(Counted<FUnknown>::adopt(host.document()->createTrack("audio")));
    const auto closed = makeCounted<Project>(host.application.edits().log());
    const auto inClosed = Track::create(Track::Kind::Audio);
    inClosed->insertInto(*closed);

    host.transaction()->begin(true);
    EXPECT_NE(host.transaction()->insert(loose.get(), fresh.get()), ResultOk);
    EXPECT_NE(host.transaction()->insert(static_cast<IProjectNode*>(inClosed.get()), fresh.get()), ResultOk);
    EXPECT_EQ(host.transaction()->commit(host.document(), u"Edit"), ResultOk);

    EXPECT_EQ(fresh->getParent(), nullptr);
}

TEST(EditTransaction, InsertRefusesAnEventThatWouldBeginBeforeItsPart)
{
    HostWithProject host;
    const auto fresh = query<IProjectNode>(create<IClipEvent>(host.context()));
    fresh->setStart(nullptr, 0, 19.0);

    host.transaction()->begin(true);
    EXPECT_NE(host.transaction()->insert(host.part.get(), fresh.get()), ResultOk);
    host.transaction()->commit(host.document(), u"Edit");

    EXPECT_EQ(fresh->getStart(nullptr), 19.0);
}

TEST(EditTransaction, WhatLiesBeyondAllTimeDoesNotGoToAnotherPlace)
{
    HostWithProject host;
    host.inPart->setEnd(nullptr, 0, FurthestTime);
    host.part->setStart(nullptr, 0, 1000.0);
    const std::string before = host.dump();

    host.transaction()->begin(true);
    EXPECT_NE(host.transaction()->move(host.root(), host.track.get(), host.inPart.get()), ResultOk);
    host.transaction()->commit(host.document(), u"Edit");

    EXPECT_EQ(host.dump(), before);
}

TEST(EditTransaction, InsertRefusesWhatPlaysAClipOfAnotherPool)
{
    HostWithProject host;
    Project& otherProject = host.application.createProject();
    const auto media = makeCounted<MediaClip>(MediaClip::Kind::Audio, u"/other.wav", 1.0);
    otherProject.pool().add(media);
    const auto fresh = create<IClipEvent>(host.context());
    fresh->setClip(media.get(), 0);
    const auto part = makeCounted<Part>();
    const auto inPart = makeCounted<ClipEvent>();
    inPart->setClip(media.get(), 0);
    inPart->insertInto(*part);

    host.transaction()->begin(true);
    EXPECT_NE(host.transaction()->insert(host.track.get(), fresh.get()), ResultOk);
    EXPECT_NE(host.transaction()->insert(host.track.get(), static_cast<IProjectNode*>(part.get())), ResultOk);
    host.transaction()->commit(host.document(), u"Edit");

    EXPECT_EQ(namesOf(*host.track), (Names{u"line", u"next"}));
}

TEST(EditTransaction, WhatWasInOneProjectDoesNotGoIntoAnother)
{
    HostWithProject host;
    Project& otherProject = host.application.createProject();
    const auto otherTrack = host.addTrack(TypeWord::Audio, u"elsewhere", &otherProject);

    host.transaction()->begin(true);
    EXPECT_NE(host.transaction()->move(host.track.get(), otherTrack.get(), host.clip.get()), ResultOk);
    host.transaction()->remove(host.track.get(), host.clip.get());
    EXPECT_NE(host.transaction()->insert(otherTrack.get(), host.clip.get()), ResultOk);
    EXPECT_EQ(host.transaction()->insert(host.track.get(), host.clip.get()), ResultOk);
    host.transaction()->commit(host.document(), u"Edit");

    EXPECT_EQ(host.clip->getParent(), host.track.get());
    EXPECT_EQ(namesOf(*otherTrack), Names{});
}

TEST(EditTransaction, RemoveTakesAnEventAway)
{
    HostWithProject host;

    expectUndoable(host, [&] { EXPECT_EQ(host.transaction()->remove(host.track.get(), host.clip.get()), ResultOk); });

    EXPECT_EQ(host.clip->getParent(), nullptr);
    EXPECT_EQ(namesOf(*host.track), Names{u"next"});
}

TEST(EditTransaction, ARemovedEventComesBackInItsPlaceAmongThoseThatStartTogether)
{
    HostWithProject host;
    ASSERT_EQ(namesOf(*host.track), (Names{u"line", u"next"}));
    host.edit(u"Delete", [&] { host.transaction()->remove(host.track.get(), host.clip.get()); });

    host.undo();

    EXPECT_EQ(namesOf(*host.track), (Names{u"line", u"next"}));
}

TEST(EditTransaction, RemoveTakesATrackWithAllThatIsInIt)
{
    HostWithProject host;

    expectUndoable(host, [&] { EXPECT_EQ(host.transaction()->remove(host.root(), host.folder.get()), ResultOk); });

    EXPECT_EQ(namesOf(*host.root()), (Names{u"DX 2", u"Memos"}));
    EXPECT_EQ(namesOf(*host.track), (Names{u"line", u"next"}));
}

TEST(EditTransaction, RemoveTakesAPointOutOfItsCurve)
{
    HostWithProject host;
    const auto curve = host.curveOf(host.track, Envelope::Curve::Volume);

    expectUndoable(host, [&] { EXPECT_EQ(host.transaction()->remove(curve.get(), host.point.get()), ResultOk); });

    EXPECT_EQ(childrenOf(*curve), std::vector{host.samePlace});
}

TEST(EditTransaction, RemoveAndMoveTakeAnyParentThatIsAroundTheChild)
{
    HostWithProject host;
    const auto curve = host.curveOf(host.track, Envelope::Curve::Volume);

    host.transaction()->begin(true);
    EXPECT_EQ(host.transaction()->move(host.root(), host.other.get(), host.clip.get()), ResultOk);
    EXPECT_EQ(host.transaction()->remove(host.other.get(), host.inPart.get()), ResultOk);
    EXPECT_EQ(host.transaction()->remove(host.folder.get(), host.point.get()), ResultOk);
    EXPECT_EQ(host.transaction()->remove(host.root(), host.samePlace.get()), ResultOk);
    host.transaction()->commit(host.document(), u"Edit");

    EXPECT_EQ(host.clip->getParent(), host.other.get());
    EXPECT_EQ(namesOf(*host.part), Names{});
    EXPECT_EQ(namesOf(*curve), Names{});
}

TEST(EditTransaction, RemoveRefusesWhatDoesNotLieInTheParent)
{
    HostWithProject host;
    const std::string before = host.dump();
    const auto fresh = query<IProjectNode>(create<IClipEvent>(host.context()));
    Calls calls;
    const auto foreign = makeCounted<Recorder>(calls);
    FUnknown* const foreignObject = static_cast<FObject*>(foreign.get());
    const auto refuses = [&](FUnknown* parent, FUnknown* child) {
        return host.transaction()->remove(parent, child) != ResultOk;
    };

    host.transaction()->begin(true);
    EXPECT_TRUE(refuses(host.other.get(), host.clip.get()));
    EXPECT_TRUE(refuses(host.clip.get(), host.clip.get()));
    EXPECT_TRUE(refuses(host.track.get(), fresh.get()));
    EXPECT_TRUE(refuses(host.track.get(), host.track.get()));
    EXPECT_TRUE(refuses(host.track.get(), host.folder.get()));
    EXPECT_TRUE(refuses(host.root(), host.root()));
    EXPECT_TRUE(refuses(nullptr, host.clip.get()));
    EXPECT_TRUE(refuses(host.track.get(), nullptr));
    EXPECT_TRUE(refuses(foreignObject, host.clip.get()));
    EXPECT_TRUE(refuses(host.track.get(), foreignObject));
    EXPECT_TRUE(refuses(host.track.get(), host.curveOf(host.track, Envelope::Curve::Volume).get()));
    host.transaction()->commit(host.document(), u"Edit");

    EXPECT_EQ(host.dump(), before);
}

TEST(EditTransaction, WhatIsTakenOutOfAPartKeepsItsTimesOfTheProject)
{
    HostWithProject host;

    expectUndoable(host, [&] { host.transaction()->remove(host.part.get(), host.inPart.get()); });

    EXPECT_EQ(host.inPart->getStart(nullptr), 25.0);
    EXPECT_EQ(host.inPart->getEnd(nullptr), 26.0);
}

TEST(EditTransaction, MoveTakesAnEventToAnotherTrack)
{
    HostWithProject host;

    expectUndoable(host, [&] {
        EXPECT_EQ(host.transaction()->move(host.track.get(), host.other.get(), host.clip.get()), ResultOk);
    });

    EXPECT_EQ(host.clip->getParent(), host.other.get());
    EXPECT_EQ(host.clip->getStart(nullptr), 10.0);
}

TEST(EditTransaction, MoveInAndOutOfPartsKeepsTheTimesOfTheProject)
{
    HostWithProject host;
    host.clip->setStart(nullptr, 0, 22.5);

    expectUndoable(host, [&] {
        EXPECT_EQ(host.transaction()->move(host.track.get(), host.part.get(), host.clip.get()), ResultOk);
        EXPECT_EQ(host.transaction()->move(host.part.get(), host.track.get(), host.inPart.get()), ResultOk);
    });

    EXPECT_EQ(host.clip->getStart(nullptr), 22.5);
    EXPECT_EQ(host.clip->getStart(host.part.get()), 2.5);
    EXPECT_EQ(host.inPart->getStart(nullptr), 25.0);
    EXPECT_EQ(host.inPart->getEnd(nullptr), 26.0);
}

TEST(EditTransaction, MoveTakesATrackIntoAFolder)
{
    HostWithProject host;

    expectUndoable(
        host, [&] { EXPECT_EQ(host.transaction()->move(host.root(), host.folder.get(), host.other.get()), ResultOk); });

    EXPECT_EQ(namesOf(*host.folder), (Names{u"DX 1", u"DX 2"}));
    EXPECT_EQ(namesOf(*host.root()), (Names{u"Dialogue", u"Memos"}));
}

TEST(EditTransaction, MoveWithinOneParentGoesToTheBottom)
{
    HostWithProject host;

    expectUndoable(host,
                   [&] { EXPECT_EQ(host.transaction()->move(host.root(), host.root(), host.folder.get()), ResultOk); });

    EXPECT_EQ(namesOf(*host.root()), (Names{u"DX 2", u"Memos", u"Dialogue"}));
}

TEST(EditTransaction, MoveRefusesWhatCannotBe)
{
    HostWithProject host;
    const auto inner = host.addTrack(TypeWord::Folder, u"inner", host.folder.get());
    const auto innerPart = host.addPart(host.part, u"inner", 25.0, 30.0);
    const std::string before = host.dump();
    const auto refuses = [&](FUnknown* parent, FUnknown* newParent, FUnknown* child) {
        return host.transaction()->move(parent, newParent, child) != ResultOk;
    };

    host.transaction()->begin(true);
    EXPECT_TRUE(refuses(host.root(), host.folder.get(), host.folder.get()));
    EXPECT_TRUE(refuses(host.root(), inner.get(), host.folder.get()));
    EXPECT_TRUE(refuses(host.other.get(), host.part.get(), host.part.get()));
    EXPECT_TRUE(refuses(host.other.get(), innerPart.get(), host.part.get()));
    EXPECT_TRUE(refuses(host.other.get(), host.memos.get(), host.part.get()));
    EXPECT_TRUE(refuses(host.track.get(), host.folder.get(), host.clip.get()));
    EXPECT_TRUE(refuses(host.other.get(), host.track.get(), host.clip.get()));
    EXPECT_TRUE(refuses(host.track.get(), host.part.get(), host.clip.get()));
    EXPECT_TRUE(refuses(nullptr, host.other.get(), host.clip.get()));
    EXPECT_TRUE(refuses(host.track.get(), nullptr, host.clip.get()));
    EXPECT_TRUE(refuses(host.track.get(), host.other.get(), nullptr));
    host.transaction()->commit(host.document(), u"Edit");

    EXPECT_EQ(host.dump(), before);
}

TEST(EditTransaction, NothingIsNestedDeeperThanTheLimit)
{
    TestHost host;
    TestHost::Node folder = host.addTrack(TypeWord::Folder, u"F");
    // The project is the first level, and this the second.
    for (int level = 2; level < Project::DeepestNesting; ++level)
        folder = host.addTrack(TypeWord::Folder, u"F", folder.get());

    EXPECT_ANY_THROW(host.addTrack(TypeWord::Folder, u"too deep", folder.get()));
    host.transaction()->commit(host.document(), u"Edit");

    const auto pair = host.addTrack(TypeWord::Folder, u"G");
    host.addTrack(TypeWord::Audio, u"A", pair.get());
    host.transaction()->begin(true);
    EXPECT_NE(host.transaction()->move(host.root(), folder->getParent(), pair.get()), ResultOk);
    EXPECT_EQ(host.transaction()->move(host.root(), folder->getParent()->getParent(), pair.get()), ResultOk);
    host.transaction()->commit(host.document(), u"Edit");
}

TEST(EditTransaction, SettersInsideItAreUndoneAndRedone)
{
    HostWithProject host;
    const auto list = create<IAttributeData>(host.context());
    list->setBinary("block", "abc", 3, true);
    host.clip->setAttribute("old", FVariant::string("old"), true);
    MediaClip& media = host.addMedia(u"/a.wav", 1.0);

    expectUndoable(host, [&] { host.clip->setName(nullptr, text(u"other").get(), 0); });
    expectUndoable(host, [&] { host.track->setName(nullptr, text(u"other").get(), 0); });
    expectUndoable(host, [&] { host.root()->setName(nullptr, text(u"other").get(), 0); });
    expectUndoable(host, [&] { media.setName(nullptr, text(u"other").get(), 0); });
    expectUndoable(host, [&] { host.clip->setStart(nullptr, 0, 1.0 / 3.0); });
    expectUndoable(host, [&] { host.clip->setEnd(nullptr, 0, 200.0 / 7.0); });
    expectUndoable(host, [&] { host.inPart->setLength(nullptr, host.transaction(), 0.1); });
    expectUndoable(host, [&] { host.part->setStart(nullptr, 0, 100.0); });
    expectUndoable(host, [&] { host.point->setStart(nullptr, 0, 100.0); });
    expectUndoable(host, [&] { query<IAutomationPoint>(host.point)->setValue(0.1f); });
    expectUndoable(host, [&] { query<ITrackNode>(host.track)->setFlag(TrackFlag::Lock, true); });
    expectUndoable(host, [&] { query<IClipEvent>(host.clip)->setClip(&media, 0); });
    expectUndoable(host, [&] { host.document()->setProjectEnd(1000.0); });
    expectUndoable(host, [&] { host.clip->setAttribute("a", FVariant::integer(1), true); });
    expectUndoable(host, [&] { host.clip->setAttribute("a", FVariant::object(list.get()), true); });
    expectUndoable(host, [&] { host.clip->setAttribute("old", FVariant::string("new"), true); });
    expectUndoable(host, [&] { host.clip->removeAttribute("old"); });
}

TEST(EditTransaction, AnAttributeThatIsNotStoredIsUndoneToo)
{
    HostWithProject host;
    host.edit(u"Edit", [&] { host.clip->setAttribute("session", FVariant::integer(1), false); });

    host.undo();
    EXPECT_NE(host.clip->hasAttribute("session"), ResultOk);
    host.redo();
    EXPECT_EQ(host.clip->hasAttribute("session"), ResultOk);
}

TEST(EditTransaction, SettersOutsideOfItAreNotUndone)
{
    HostWithProject host;
    const std::size_t entries = host.project.undoList().size();

    host.clip->setStart(nullptr, 0, 11.0);

    EXPECT_EQ(host.project.undoList().size(), entries);
    host.undo();
    EXPECT_EQ(host.clip->getStart(nullptr), 11.0);
}

TEST(EditTransaction, ManyEditsOfOneThingAreUndoneInTurn)
{
    HostWithProject host;

    expectUndoable(host, [&] {
        host.clip->setStart(nullptr, 0, 1.0);
        host.transaction()->remove(host.track.get(), host.clip.get());
        host.transaction()->insert(host.other.get(), host.clip.get());
        host.clip->setStart(nullptr, 0, 30.0);
        host.transaction()->move(host.other.get(), host.part.get(), host.clip.get());
        host.transaction()->remove(host.root(), host.other.get());
        host.transaction()->insert(host.folder.get(), host.other.get());
    });
}

TEST(EditTransaction, WhatIsSetWhileItIsTakenOutIsUndoneToo)
{
    HostWithProject host;

    expectUndoable(host, [&] {
        host.transaction()->remove(host.root(), host.folder.get());
        host.transaction()->remove(host.other.get(), host.part.get());
        host.part->setEnd(nullptr, 0, 50.0);
        host.inPart->setName(nullptr, text(u"gate").get(), 0);
        host.clip->setStart(nullptr, 0, 1.0);
        query<IAutomationPoint>(host.point)->setValue(0.1f);
        host.curveOf(host.track, Envelope::Curve::Volume)->setName(nullptr, text(u"curve").get(), 0);
        host.transaction()->insert(host.other.get(), host.part.get());
        host.transaction()->insert(host.root(), host.folder.get());
    });

    EXPECT_EQ(host.clip->getStart(nullptr), 1.0);
    EXPECT_EQ(std::u16string(host.inPart->getName()), u"gate");
}

TEST(EditTransaction, AnEditOfWhatWasUndoneTakesThePlaceOfIt)
{
    HostWithProject host;
    const auto fresh = host.addClip(host.other, u"fresh", 1.0, 2.0);
    host.undo();

    host.edit(u"Edit", [&] { fresh->setEnd(nullptr, 0, 3.0); });

    EXPECT_FALSE(host.redo());
    host.undo();
    EXPECT_EQ(fresh->getEnd(nullptr), 2.0);
}

TEST(EditTransaction, EachUndoTakesOneEntryBack)
{
    HostWithProject host;
    host.edit(u"One", [&] { host.clip->setStart(nullptr, 0, 1.0); });
    host.edit(u"Two", [&] { host.clip->setStart(nullptr, 0, 2.0); });

    EXPECT_TRUE(host.undo());
    EXPECT_EQ(host.clip->getStart(nullptr), 1.0);
    EXPECT_TRUE(host.undo());
    EXPECT_EQ(host.clip->getStart(nullptr), 10.0);
    EXPECT_TRUE(host.redo());
    EXPECT_TRUE(host.redo());
    EXPECT_EQ(host.clip->getStart(nullptr), 2.0);
    EXPECT_FALSE(host.redo());
}

TEST(EditTransaction, ANewEntryTakesThePlaceOfThoseThatWereUndone)
{
    HostWithProject host;
    host.edit(u"One", [&] { host.clip->setStart(nullptr, 0, 1.0); });
    const std::size_t entries = host.project.undoList().size();
    host.undo();

    host.edit(u"Two", [&] { host.clip->setStart(nullptr, 0, 2.0); });

    EXPECT_FALSE(host.redo());
    EXPECT_EQ(host.project.undoList().size(), entries);
    EXPECT_EQ(host.project.undoList().nameAt(entries - 1), u"Two");
}

TEST(EditTransaction, UndoAndRedoFailWhileItIsOpen)
{
    HostWithProject host;
    host.edit(u"One", [&] { host.clip->setStart(nullptr, 0, 1.0); });
    host.edit(u"Two", [&] { host.clip->setStart(nullptr, 0, 2.0); });
    host.undo();

    host.transaction()->begin(true);
    EXPECT_FALSE(host.undo());
    EXPECT_FALSE(host.redo());
    host.transaction()->commit(host.document(), u"Nothing");

    EXPECT_EQ(host.clip->getStart(nullptr), 1.0);
    EXPECT_TRUE(host.redo());
}

TEST(EditTransaction, UndoAndRedoWorkWhileIdleIsBlocked)
{
    HostWithProject host;
    host.edit(u"One", [&] { host.clip->setStart(nullptr, 0, 1.0); });
    const auto idle = service<IIdleManager>(host.context());
    idle->setIdleBlocked(true);

    EXPECT_TRUE(host.undo());
    EXPECT_EQ(host.clip->getStart(nullptr), 10.0);
    EXPECT_TRUE(host.redo());
    EXPECT_EQ(host.clip->getStart(nullptr), 1.0);
    idle->setIdleBlocked(false);
}

TEST(EditTransaction, StepsAreRevertedInTheirPlaceAmongTheEdits)
{
    HostWithProject host;
    Calls calls;
    const auto a = makeCounted<Recorder>(calls, "a ");
    const auto b = makeCounted<Recorder>(calls, "b ");
    const auto noteStart = [&](const std::string&) {
        calls.push_back(std::to_string(static_cast<int>(host.clip->getStart(nullptr))));
    };
    a->whenCalled = noteStart;
    b->whenCalled = noteStart;
    host.edit(u"Edit", [&] {
        host.clip->setStart(nullptr, 0, 1.0);
        EXPECT_EQ(host.transaction()->addStep(a.get()), ResultOk);
        host.clip->setStart(nullptr, 0, 2.0);
        EXPECT_EQ(host.transaction()->addStep(b.get()), ResultOk);
        host.clip->setStart(nullptr, 0, 3.0);
    });
    EXPECT_EQ(calls, Calls{});

    host.undo();
    EXPECT_EQ(calls, (Calls{"b undo", "2", "a undo", "1"}));

    calls.clear();
    host.redo();
    EXPECT_EQ(calls, (Calls{"a redo", "1", "b redo", "2"}));
}

TEST(EditTransaction, AStepAloneIsAnEntry)
{
    TestHost host;
    Calls calls;
    const auto step = makeCounted<Recorder>(calls);

    host.edit(u"Model", [&] { host.transaction()->addStep(step.get()); });

    EXPECT_EQ(host.project.undoList().size(), 1U);
    host.undo();
    host.redo();
    host.undo();
    EXPECT_EQ(calls, (Calls{"undo", "redo", "undo"}));
}

TEST(EditTransaction, AStepIsKeptAsLongAsItsEntry)
{
    HostWithProject host;
    Calls calls;
    const auto step = makeCounted<Recorder>(calls);
    host.edit(u"Model", [&] { host.transaction()->addStep(step.get()); });
    EXPECT_EQ(step->refCount(), 2);
    host.undo();
    EXPECT_EQ(step->refCount(), 2);

    host.edit(u"Other", [&] { host.clip->setStart(nullptr, 0, 1.0); });

    EXPECT_EQ(step->refCount(), 1);
}

TEST(EditTransaction, NoStepIsRefused)
{
    TestHost host;

    host.edit(u"Model", [&] { EXPECT_NE(host.transaction()->addStep(nullptr), ResultOk); });

    EXPECT_EQ(host.project.undoList().size(), 0U);
}

TEST(EditTransaction, NothingBeginsOrIsRevertedWhileAStepIs)
{
    HostWithProject host;
    Calls calls;
    const auto step = makeCounted<Recorder>(calls);
    host.edit(u"One", [&] { host.clip->setStart(nullptr, 0, 1.0); });
    host.edit(u"Model", [&] { host.transaction()->addStep(step.get()); });
    step->whenCalled = [&](const std::string&) {
        EXPECT_NE(host.transaction()->begin(true), ResultOk);
        EXPECT_FALSE(host.undo());
        EXPECT_FALSE(host.redo());
    };

    EXPECT_TRUE(host.undo());

    EXPECT_EQ(calls, Calls{"undo"});
    EXPECT_EQ(host.clip->getStart(nullptr), 1.0);
    step->whenCalled = nullptr;
}

TEST(EditTransaction, EditsOfTwoProjectsAreAnEntryOfEach)
{
    HostWithProject host;
    Project& second = host.application.createProject();
    const auto track = host.addTrack(TypeWord::Audio, u"A", &second);
    const std::size_t entries = second.undoList().size();

    host.edit(u"Both", [&] {
        host.clip->setStart(nullptr, 0, 1.0);
        track->setName(nullptr, text(u"B").get(), 0);
    });

    ASSERT_EQ(second.undoList().size(), entries + 1);
    EXPECT_EQ(second.undoList().nameAt(entries), u"Both");
    host.undo();
    EXPECT_EQ(host.clip->getStart(nullptr), 10.0);
    EXPECT_EQ(std::u16string(track->getName()), u"B");
    host.application.edits().undo(second);
    EXPECT_EQ(std::u16string(track->getName()), u"A");
}

TEST(EditTransaction, ClosingAProjectCommitsWhatIsOpen)
{
    HostWithProject host;
    Project& second = host.application.createProject();
    host.transaction()->begin(true);
    host.clip->setStart(nullptr, 0, 1.0);

    host.application.closeProject(second);

    EXPECT_EQ(host.transaction()->begin(true), ResultOk);
    host.transaction()->commit(host.document(), u"Nothing");
    EXPECT_TRUE(host.undo());
    EXPECT_EQ(host.clip->getStart(nullptr), 10.0);
}

TEST(EditTransaction, OneThatIsLeftOpenWhileAProjectClosesIsEnded)
{
    HostWithProject host;
    const auto second = Counted<Project>::share(&host.application.createProject());
    const auto inSecond = host.addTrack(TypeWord::Audio, u"A", second.get());
    Calls calls;
    const auto listener = makeCounted<Recorder>(calls);
    listener->whenCalled = [&](const std::string&) {
        host.transaction()->begin(true);
        inSecond->setName(nullptr, text(u"B").get(), 0);
        host.clip->setStart(nullptr, 0, 1.0);
    };
    service<IProjectManager>(host.context())->addNotification(listener.get());

    host.application.closeProject(*second);
    service<IProjectManager>(host.context())->removeNotification(listener.get());

    EXPECT_EQ(calls, Calls{"closing"});
    EXPECT_EQ(second->refCount(), 1);
    EXPECT_EQ(host.transaction()->begin(true), ResultOk);
    host.transaction()->commit(host.document(), u"Nothing");
    EXPECT_TRUE(host.undo());
    EXPECT_EQ(host.clip->getStart(nullptr), 10.0);
}

TEST(EditTransaction, AClosedProjectIsNotReverted)
{
    TestHost host;
    const auto second = Counted<Project>::share(&host.application.createProject());
    host.addTrack(TypeWord::Audio, u"A", second.get());

    host.application.closeProject(*second);

    EXPECT_FALSE(host.application.edits().undo(*second));
    EXPECT_EQ(second->refCount(), 1);
}

TEST(EditTransaction, EveryReferenceIsGivenBack)
{
    TestHost::Node clip;
    Counted<ClipEvent> kept;
    {
        HostWithProject host;
        clip = host.clip;
        kept = Counted<ClipEvent>::share(dynamic_cast<ClipEvent*>(clip.get()));
        expectUndoable(host, [&] {
            host.transaction()->move(host.track.get(), host.other.get(), clip.get());
            host.transaction()->remove(host.other.get(), clip.get());
        });
        host.undo();
    }

    EXPECT_EQ(kept->refCount(), 2);
    EXPECT_EQ(clip->getParent(), nullptr);
}

TEST(EditService, CopyRangeNeedsTracksOfTheProjectAndTimes)
{
    HostWithProject host;
    Project& second = host.application.createProject();
    const auto foreignTrack = host.addTrack(TypeWord::Audio, u"A", &second);
    const std::string before = host.dump();
    const auto listOf = [&](FUnknown* object) {
        auto list = create<IObjectList>(host.context());
        list->add(host.track.get(), 0);
        list->add(object, 0);
        return list;
    };
    const auto good = listOf(host.other.get());
    const auto copy = [&](IProjectDocument* document, IObjectList* list, double start, double end, double destination) {
        return host.editService()->copyRange(document, list, 0, start, end, destination);
    };

    host.transaction()->begin(true);
    EXPECT_NE(copy(host.document(), nullptr, 0.0, 20.0, 50.0), ResultOk);
    EXPECT_NE(copy(nullptr, good.get(), 0.0, 20.0, 50.0), ResultOk);
    EXPECT_NE(copy(&second, good.get(), 0.0, 20.0, 50.0), ResultOk);
    EXPECT_NE(copy(host.document(), listOf(host.clip.get()).get(), 0.0, 20.0, 50.0), ResultOk);
    EXPECT_NE(copy(host.document(), listOf(foreignTrack.get()).get(), 0.0, 20.0, 50.0), ResultOk);
    for (const double time : {NotANumber, Infinity, -Infinity, 1.1e9, 1e308}) {
        EXPECT_NE(copy(host.document(), good.get(), time, 20.0, 50.0), ResultOk) << time;
        EXPECT_NE(copy(host.document(), good.get(), 0.0, time, 50.0), ResultOk) << time;
        EXPECT_NE(copy(host.document(), good.get(), 0.0, 20.0, time), ResultOk) << time;
    }
    EXPECT_NE(copy(host.document(), good.get(), 20.0, 0.0, 50.0), ResultOk);
    EXPECT_NE(copy(host.document(), good.get(), 0.0, 20.0, FurthestTime - 10.0), ResultOk);
    host.transaction()->commit(host.document(), u"Edit");

    EXPECT_EQ(host.dump(), before);
}

TEST(EditService, CopyRangeWritesOnTheTracksOfTheListAndIsUndone)
{
    HostWithProject host;
    const auto list = create<IObjectList>(host.context());
    list->add(host.track.get(), 0);
    list->add(host.folder.get(), 0);

    expectUndoable(host, [&] {
        EXPECT_EQ(host.editService()->copyRange(host.document(), list.get(), 0, 10.0, 13.0, 50.0), ResultOk);
    });

    EXPECT_EQ(namesOf(*host.track), (Names{u"line", u"next", u"line", u"next"}));
    EXPECT_EQ(host.track->getEnd(nullptr), 53.0);
}

TEST(EditService, CloseRangeJoinsAndTellsWhetherThereWasAnythingToJoin)
{
    HostWithProject host;
    const auto list = create<IObjectList>(host.context());
    list->add(host.track.get(), 0);

    host.transaction()->begin(true);
    host.editService()->copyRange(host.document(), list.get(), 0, 10.0, 12.0, 50.0);
    host.editService()->copyRange(host.document(), list.get(), 0, 12.0, 14.0, 52.0);
    EXPECT_EQ(host.editService()->closeRange(host.document(), list.get(), 50.0, 60.0, 0.0), ResultOk);
    EXPECT_EQ(host.editService()->closeRange(host.document(), list.get(), 50.0, 60.0, 0.0), ResultFalse);
    host.transaction()->commit(host.document(), u"Edit");

    EXPECT_EQ(namesOf(*host.track), (Names{u"line", u"next", u"line", u"next"}));
}

TEST(EditService, CloseRangeFailsForWhatIsNoRangeOfTracks)
{
    HostWithProject host;
    const auto list = create<IObjectList>(host.context());
    const auto wrong = create<IObjectList>(host.context());
    wrong->add(host.clip.get(), 0);
    const auto close = [&](IProjectDocument* document, IObjectList* tracks, double start, double end) {
        return host.editService()->closeRange(document, tracks, start, end, 0.0);
    };

    host.transaction()->begin(true);
    EXPECT_GT(close(host.document(), nullptr, 0.0, 1.0), ResultFalse);
    EXPECT_GT(close(host.document(), wrong.get(), 0.0, 1.0), ResultFalse);
    EXPECT_GT(close(nullptr, list.get(), 0.0, 1.0), ResultFalse);
    EXPECT_GT(close(host.document(), list.get(), 1.0, 0.0), ResultFalse);
    EXPECT_GT(close(host.document(), list.get(), NotANumber, 1.0), ResultFalse);
    EXPECT_EQ(close(host.document(), list.get(), 0.0, 1.0), ResultFalse);
    host.transaction()->commit(host.document(), u"Edit");
}

TEST(EditTransaction, DeleteRangeEmptiesEveryTrackAndIsUndone)
{
    HostWithProject host;

    expectUndoable(host, [&] { EXPECT_EQ(host.transaction()->deleteRange(host.document(), 0, 0.0, 30.0), ResultOk); });

    EXPECT_EQ(namesOf(*host.track), Names{});
    EXPECT_EQ(namesOf(*host.memos), Names{});
    ASSERT_EQ(namesOf(*host.other), Names{u"scene"});
    EXPECT_EQ(childrenOf(*host.other)[0]->getStart(nullptr), 30.0);
}

TEST(EditTransaction, DeleteRangeNeedsAProjectAndARange)
{
    HostWithProject host;
    const std::string before = host.dump();

    host.transaction()->begin(true);
    EXPECT_NE(host.transaction()->deleteRange(nullptr, 0, 0.0, 30.0), ResultOk);
    EXPECT_NE(host.transaction()->deleteRange(host.document(), 0, 30.0, 0.0), ResultOk);
    EXPECT_NE(host.transaction()->deleteRange(host.document(), 0, 0.0, NotANumber), ResultOk);
    EXPECT_NE(host.transaction()->deleteRange(host.document(), 0, -Infinity, 30.0), ResultOk);
    host.transaction()->commit(host.document(), u"Edit");

    EXPECT_EQ(host.dump(), before);
}

TEST(EditTransaction, PasteWritesWhatCopyAllHasRead)
{
    HostWithProject host;

    expectUndoable(host, [&] {
        Counted<FUnknown> clipboard;
        EXPECT_EQ(host.transaction()->copyAll(host.document(), clipboard.out(), 5.0, 13.0, 0), ResultOk);
        EXPECT_EQ(host.transaction()->paste(host.document(), clipboard.get(), 0, 100.0), ResultOk);
    });

    EXPECT_EQ(namesOf(*host.memos), (Names{u"memo", u"memo"}));
    EXPECT_EQ(namesOf(*host.track), (Names{u"line", u"next", u"line", u"next"}));
    EXPECT_EQ(childrenOf(*host.track)[2]->getStart(nullptr), 105.0);
}

TEST(EditTransaction, PasteWritesOnTracksThatWereLoadedInTheirFolder)
{
    HostWithProject host;
    const auto log = &host.application.edits().log();
    Project& loaded = host.application.projects().add(ProjectFile::parse(host.dump(), "test.stage", *log));
    host.transaction()->begin(true);

    Counted<FUnknown> clipboard;
    EXPECT_EQ(host.transaction()->copyAll(&loaded, clipboard.out(), 5.0, 13.0, 0), ResultOk);
    EXPECT_EQ(host.transaction()->paste(&loaded, clipboard.get(), 0, 100.0), ResultOk);
    host.transaction()->commit(&loaded, u"Paste");

    const auto folder = childrenOf(loaded)[0];
    EXPECT_EQ(namesOf(*childrenOf(*folder)[0]), (Names{u"line", u"next", u"line", u"next"}));
}

TEST(EditTransaction, AClipboardIsForItsProjectAlone)
{
    HostWithProject host;
    Project& second = host.application.createProject();
    const std::string before = host.dump();

    host.transaction()->begin(true);
    Counted<FUnknown> clipboard;
    host.transaction()->copyAll(host.document(), clipboard.out(), 5.0, 13.0, 0);
    EXPECT_NE(host.transaction()->paste(&second, clipboard.get(), 0, 100.0), ResultOk);
    EXPECT_NE(host.transaction()->paste(host.document(), nullptr, 0, 100.0), ResultOk);
    EXPECT_NE(host.transaction()->paste(host.document(), host.clip.get(), 0, 100.0), ResultOk);
    EXPECT_NE(host.transaction()->paste(host.document(), clipboard.get(), 0, NotANumber), ResultOk);
    EXPECT_NE(host.transaction()->paste(host.document(), clipboard.get(), 0, FurthestTime), ResultOk);
    EXPECT_NE(host.transaction()->copyAll(host.document(), nullptr, 5.0, 13.0, 0), ResultOk);
    EXPECT_NE(host.transaction()->copyAll(host.document(), clipboard.out(), 13.0, 5.0, 0), ResultOk);
    EXPECT_FALSE(clipboard);
    host.transaction()->commit(host.document(), u"Edit");

    EXPECT_EQ(host.dump(), before);
}

} // namespace standin::tests
