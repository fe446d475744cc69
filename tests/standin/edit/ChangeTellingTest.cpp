// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/standin/TestHost.h"

#include "standin/edit/DependencyManager.h"
#include "velmark/Attributes.h"
#include "velmark/Automation.h"
#include "velmark/Tracks.h"

#include <gtest/gtest.h>

#include <functional>
#include <map>
#include <string>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

using Calls = std::vector<std::string>;

/// The change flags of the nodes that have any, by name; the project is "project".
using Flags = std::map<std::u16string, uint32>;

constexpr uint32 Removed = ChangeFlag::Removed;
constexpr uint32 Children = ChangeFlag::Children;
constexpr uint32 Content = ChangeFlag::Content;

/// A project whose changes somebody listens to, as the module does: as edit hook, as dependent and on idle.
struct HostWithListener : TestHost {
    HostWithListener()
    {
        application.idle();
        service<IProjectManager>(context())->addNotification(listener.get());
        service<IDependencyManager>(context())->addDependent(document(), listener.get());
        service<IIdleManager>(context())->addIdleHandler(listener.get());
        listener->whenCalled = [this](const std::string& call) { flagsIn[call] = flags(); };
    }
    ~HostWithListener()
    {
        service<IIdleManager>(context())->removeIdleHandler(listener.get());
        service<IDependencyManager>(context())->removeDependent(document(), listener.get());
        service<IProjectManager>(context())->removeNotification(listener.get());
    }

    Flags flags()
    {
        const std::map<std::u16string, IProjectNode*> nodes{
            {u"project", root()},    {u"folder", folder.get()}, {u"inner", inner.get()}, {u"track", track.get()},
            {u"other", other.get()}, {u"memos", memos.get()},   {u"clip", clip.get()},   {u"part", part.get()},
            {u"door", inPart.get()}, {u"marker", marker.get()}, {u"curve", curve.get()}, {u"point", point.get()}};
        Flags flags;
        for (const auto& [name, node] : nodes) {
            if (node->changeFlags() != 0)
                flags[name] = node->changeFlags();
        }
        return flags;
    }

    /// What was told of the edits: the flags in the dependent's update.
    Flags told(const std::function<void()>& edits)
    {
        flagsIn.clear();
        edit(u"Edit", edits);
        EXPECT_EQ(flagsIn["edited"], flagsIn["update"]);
        EXPECT_EQ(flags(), Flags{});
        return flagsIn["update"];
    }

    Node folder = addTrack(TypeWord::Folder, u"Dialogue");
    Node inner = addTrack(TypeWord::Folder, u"Boom", folder.get());
    Node track = addTrack(TypeWord::Audio, u"DX 1", inner.get());
    Node other = addTrack(TypeWord::Audio, u"DX 2");
    Node memos = addTrack(TypeWord::Marker, u"Memos");
    Node clip = addClip(track, u"line", 10.0, 14.0);
    Node part = addPart(other, u"scene", 20.0, 40.0);
    Node inPart = addClip(part, u"door", 25.0, 26.0);
    Node marker = addPointMarker(memos, u"memo", 5.0);
    Node point = addPoint(track, Envelope::Curve::Volume, 3.0, 0.5f);
    Node curve = curveOf(track, Envelope::Curve::Volume);

    Calls calls;
    Counted<Recorder> listener = makeCounted<Recorder>(calls);
    std::map<std::string, Flags> flagsIn;
};

} // namespace

TEST(ChangeTelling, ACommitTellsTheHooksAndThenTheDependents)
{
    HostWithListener host;

    host.edit(u"Edit", [&] {
        host.clip->setStart(nullptr, 0, 1.0);
        EXPECT_EQ(host.calls, Calls{});
    });

    EXPECT_EQ(host.calls, (Calls{"edited", "update"}));
}

TEST(ChangeTelling, ACommitOfNothingTellsNobody)
{
    HostWithListener host;

    host.edit(u"Nothing", [] {});

    EXPECT_EQ(host.calls, Calls{});
}

TEST(ChangeTelling, UndoAndRedoTellTheDependentsAlone)
{
    HostWithListener host;
    host.edit(u"Edit", [&] { host.clip->setStart(nullptr, 0, 1.0); });
    host.calls.clear();

    host.undo();
    EXPECT_EQ(host.calls, Calls{"update"});
    EXPECT_EQ(host.flagsIn["update"], (Flags{{u"project", Content}, {u"track", Content}}));
    EXPECT_EQ(host.flags(), Flags{});

    host.redo();
    EXPECT_EQ(host.calls, (Calls{"update", "update"}));
    EXPECT_EQ(host.flagsIn["update"], (Flags{{u"project", Content}, {u"track", Content}}));
}

TEST(ChangeTelling, AnUndoThatThereIsNotTellsNobody)
{
    HostWithListener host;

    EXPECT_FALSE(host.redo());

    EXPECT_EQ(host.calls, Calls{});
}

TEST(ChangeTelling, EditsOutsideOfTransactionsAreToldAtTheNextIdle)
{
    HostWithListener host;

    host.clip->setStart(nullptr, 0, 1.0);
    EXPECT_EQ(host.calls, Calls{});
    EXPECT_EQ(host.flags(), Flags{});

    host.application.idle();
    EXPECT_EQ(host.calls, (Calls{"update", "idle"}));
    EXPECT_EQ(host.flagsIn["update"], (Flags{{u"project", Content}, {u"track", Content}}));
    EXPECT_EQ(host.flagsIn["idle"], Flags{});

    host.application.idle();
    EXPECT_EQ(host.calls, (Calls{"update", "idle", "idle"}));
}

TEST(ChangeTelling, EditsOutsideOfTransactionsAreToldWithTheNextCommit)
{
    HostWithListener host;
    host.inPart->setStart(nullptr, 0, 30.0);

    const Flags flags = host.told([&] { host.clip->setStart(nullptr, 0, 1.0); });

    EXPECT_EQ(flags, (Flags{{u"project", Content}, {u"track", Content}, {u"other", Content}}));
    host.calls.clear();
    host.application.idle();
    EXPECT_EQ(host.calls, Calls{"idle"});
}

TEST(ChangeTelling, AnIdleCallWithinATransactionTellsNothing)
{
    HostWithListener host;

    host.edit(u"Edit", [&] {
        host.clip->setStart(nullptr, 0, 1.0);
        host.application.idle();
        EXPECT_EQ(host.calls, Calls{"idle"});
    });

    EXPECT_EQ(host.calls, (Calls{"idle", "edited", "update"}));
}

TEST(ChangeTelling, ABlockedIdleStillTellsOfChanges)
{
    HostWithListener host;
    service<IIdleManager>(host.context())->setIdleBlocked(true);
    host.clip->setStart(nullptr, 0, 1.0);

    host.application.idle();

    EXPECT_EQ(host.calls, Calls{"update"});
    service<IIdleManager>(host.context())->setIdleBlocked(false);
}

TEST(ChangeTelling, AChangeOfAnEventIsContentOfItsTrackAndOfTheProject)
{
    HostWithListener host;
    const Flags changed{{u"project", Content}, {u"track", Content}};

    EXPECT_EQ(host.told([&] { host.clip->setStart(nullptr, 0, 11.0); }), changed);
    EXPECT_EQ(host.told([&] { host.clip->setEnd(nullptr, 0, 16.0); }), changed);
    EXPECT_EQ(host.told([&] { host.clip->setName(nullptr, text(u"x").get(), 0); }), changed);
    EXPECT_EQ(host.told([&] { host.clip->setAttribute("a", FVariant::integer(1), true); }), changed);
    EXPECT_EQ(host.told([&] { host.clip->removeAttribute("a"); }), changed);
    EXPECT_EQ(host.told([&] { host.point->setStart(nullptr, 0, 4.0); }), changed);
    EXPECT_EQ(host.told([&] { query<IAutomationPoint>(host.point)->setValue(0.25f); }), changed);
}

TEST(ChangeTelling, AChangeOfATrackIsItsContent)
{
    HostWithListener host;
    const Flags changed{{u"project", Content}, {u"track", Content}};

    EXPECT_EQ(host.told([&] { host.track->setName(nullptr, text(u"x").get(), 0); }), changed);
    EXPECT_EQ(host.told([&] { host.track->setAttribute("a", FVariant::integer(1), true); }), changed);
    EXPECT_EQ(host.told([&] { query<ITrackNode>(host.track)->setFlag(TrackFlag::Lock, true); }), changed);
}

TEST(ChangeTelling, AChangeOfTheProjectIsItsContent)
{
    HostWithListener host;

    EXPECT_EQ(host.told([&] { host.document()->setProjectEnd(100.0); }), (Flags{{u"project", Content}}));
    EXPECT_EQ(host.told([&] { host.root()->setAttribute("a", FVariant::integer(1), true); }),
              (Flags{{u"project", Content}}));
}

TEST(ChangeTelling, AChangeInAPartIsContentOfTheTrack)
{
    HostWithListener host;

    EXPECT_EQ(host.told([&] { host.inPart->setStart(nullptr, 0, 30.0); }),
              (Flags{{u"project", Content}, {u"other", Content}}));
    EXPECT_EQ(host.told([&] { host.transaction()->remove(host.part.get(), host.inPart.get()); }),
              (Flags{{u"project", Content}, {u"other", Content}, {u"part", Children}, {u"door", Removed}}));
}

TEST(ChangeTelling, AnInsertedEventIsAChildAndContentOfItsTrack)
{
    HostWithListener host;

    EXPECT_EQ(host.told([&] { host.addClip(host.track, u"new", 1.0, 2.0); }),
              (Flags{{u"project", Content}, {u"track", Content | Children}}));
}

TEST(ChangeTelling, ARemovedEventIsToldAsRemoved)
{
    HostWithListener host;

    EXPECT_EQ(host.told([&] { host.transaction()->remove(host.track.get(), host.clip.get()); }),
              (Flags{{u"project", Content}, {u"track", Content | Children}, {u"clip", Removed}}));
}

TEST(ChangeTelling, AMovedEventIsToldAsRemovedAndBothTracksAsChanged)
{
    HostWithListener host;

    EXPECT_EQ(host.told([&] { host.transaction()->move(host.track.get(), host.other.get(), host.clip.get()); }),
              (Flags{{u"project", Content},
                     {u"track", Content | Children},
                     {u"other", Content | Children},
                     {u"clip", Removed}}));
}

TEST(ChangeTelling, ARemovedPointIsAChildOfItsCurveAndContentOfItsTrack)
{
    HostWithListener host;

    EXPECT_EQ(host.told([&] { host.transaction()->remove(host.curve.get(), host.point.get()); }),
              (Flags{{u"project", Content}, {u"track", Content}, {u"curve", Children}, {u"point", Removed}}));
}

TEST(ChangeTelling, AnInsertedTrackIsAChildOfItsFolderAndOfTheProject)
{
    HostWithListener host;

    EXPECT_EQ(host.told([&] { host.addTrack(TypeWord::Audio, u"new", host.inner.get()); }),
              (Flags{{u"project", Children}, {u"inner", Children}}));
    EXPECT_EQ(host.told([&] { host.addTrack(TypeWord::Audio, u"new"); }), (Flags{{u"project", Children}}));
}

TEST(ChangeTelling, ARemovedFolderIsToldAsRemovedWithTheTracksBelowIt)
{
    HostWithListener host;

    EXPECT_EQ(host.told([&] { host.transaction()->remove(host.root(), host.folder.get()); }),
              (Flags{{u"project", Children}, {u"folder", Removed}, {u"inner", Removed}, {u"track", Removed}}));
}

TEST(ChangeTelling, AMovedFolderIsToldAsRemovedWithTheTracksBelowIt)
{
    HostWithListener host;

    EXPECT_EQ(host.told([&] { host.transaction()->move(host.folder.get(), host.root(), host.inner.get()); }),
              (Flags{{u"project", Children}, {u"folder", Children}, {u"inner", Removed}, {u"track", Removed}}));
}

TEST(ChangeTelling, AnUndoneInsertionIsToldAsRemoved)
{
    HostWithListener host;
    host.edit(u"Delete", [&] { host.transaction()->remove(host.track.get(), host.clip.get()); });

    host.undo();
    EXPECT_EQ(host.flagsIn["update"], (Flags{{u"project", Content}, {u"track", Content | Children}}));
    host.redo();
    EXPECT_EQ(host.flagsIn["update"],
              (Flags{{u"project", Content}, {u"track", Content | Children}, {u"clip", Removed}}));
}

TEST(ChangeTelling, NoFlagIsSeenBeforeTheCommit)
{
    HostWithListener host;

    host.edit(u"Edit", [&] {
        host.transaction()->remove(host.track.get(), host.clip.get());
        EXPECT_EQ(host.flags(), Flags{});
    });
}

TEST(ChangeTelling, WhatWasRemovedIsAliveUntilAllHaveBeenTold)
{
    HostWithListener host;
    Node* const clip = dynamic_cast<Node*>(host.clip.get());
    int32 referencesInUpdate = 0;
    host.listener->whenCalled = [&](const std::string& call) {
        if (call == "update")
            referencesInUpdate = clip->refCount();
    };

    host.edit(u"Delete", [&] { host.transaction()->remove(host.track.get(), host.clip.get()); });

    // Those of the fixture and of two entries of the undo list stay, insertion and removal; the project's own goes.
    EXPECT_EQ(referencesInUpdate, 4);
    EXPECT_EQ(clip->refCount(), 3);
}

TEST(ChangeTelling, WhatTheHookEditsJoinsTheEntry)
{
    HostWithListener host;
    const std::string before = host.dump();
    Calls stepCalls;
    const auto step = makeCounted<Recorder>(stepCalls);
    host.listener->whenCalled = [&](const std::string& call) {
        host.flagsIn[call] = host.flags();
        if (call != "edited")
            return;
        EXPECT_EQ(host.transaction()->remove(host.memos.get(), host.marker.get()), ResultOk);
        EXPECT_EQ(host.transaction()->addStep(step.get()), ResultOk);
        host.inPart->setStart(nullptr, 0, 30.0);
    };
    const std::size_t entries = host.project.undoList().size();

    host.edit(u"Edit", [&] { host.clip->setStart(nullptr, 0, 1.0); });

    EXPECT_EQ(host.calls, (Calls{"edited", "update"}));
    EXPECT_EQ(host.project.undoList().size(), entries + 1);
    EXPECT_EQ(host.flagsIn["edited"], (Flags{{u"project", Content}, {u"track", Content}}));
    EXPECT_EQ(host.flagsIn["update"], (Flags{{u"project", Content},
                                             {u"track", Content},
                                             {u"other", Content},
                                             {u"memos", Content | Children},
                                             {u"marker", Removed}}));
    const std::string after = host.dump();
    host.undo();
    EXPECT_EQ(host.dump(), before);
    EXPECT_EQ(stepCalls, Calls{"undo"});
    host.redo();
    EXPECT_EQ(host.dump(), after);
}

TEST(ChangeTelling, TheHookNeitherBeginsNorCommitsNorReverts)
{
    HostWithListener host;
    host.listener->whenCalled = [&](const std::string& call) {
        if (call != "edited")
            return;
        EXPECT_NE(host.transaction()->begin(true), ResultOk);
        EXPECT_NE(host.transaction()->commit(host.document(), u"Hook"), ResultOk);
        EXPECT_FALSE(host.undo());
    };

    host.edit(u"Edit", [&] { host.clip->setStart(nullptr, 0, 1.0); });

    EXPECT_EQ(host.calls, (Calls{"edited", "update"}));
    EXPECT_EQ(host.project.undoList().nameAt(host.project.undoList().size() - 1), u"Edit");
}

TEST(ChangeTelling, TheEntryIsThereWhenTheDependentsAreTold)
{
    HostWithListener host;
    std::u16string last;
    host.listener->whenCalled = [&](const std::string& call) {
        if (call == "update")
            last = host.project.undoList().nameAt(host.project.undoList().size() - 1);
    };

    host.edit(u"Edit", [&] { host.clip->setStart(nullptr, 0, 1.0); });

    EXPECT_EQ(last, u"Edit");
}

TEST(ChangeTelling, WhatChangesWhileTheDependentsAreToldIsToldAnotherTime)
{
    HostWithListener host;
    bool isFirst = true;
    host.listener->whenCalled = [&](const std::string& call) {
        host.flagsIn[call] = host.flags();
        if (call == "update" && std::exchange(isFirst, false))
            host.inPart->setStart(nullptr, 0, 30.0);
    };
    host.edit(u"Edit", [&] { host.clip->setStart(nullptr, 0, 1.0); });
    EXPECT_EQ(host.flagsIn["update"], (Flags{{u"project", Content}, {u"track", Content}}));
    EXPECT_EQ(host.flags(), Flags{});

    host.application.idle();

    EXPECT_EQ(host.calls, (Calls{"edited", "update", "update", "idle"}));
    EXPECT_EQ(host.flagsIn["update"], (Flags{{u"project", Content}, {u"other", Content}}));
}

TEST(ChangeTelling, ATransactionOfADependentIsToldAnotherTime)
{
    HostWithListener host;
    bool isFirst = true;
    host.listener->whenCalled = [&](const std::string& call) {
        host.flagsIn[call] = host.flags();
        if (call == "update" && std::exchange(isFirst, false))
            host.edit(u"Inner", [&] { host.inPart->setStart(nullptr, 0, 30.0); });
    };

    host.edit(u"Outer", [&] { host.clip->setStart(nullptr, 0, 1.0); });
    EXPECT_EQ(host.calls, (Calls{"edited", "update", "edited"}));
    host.application.idle();

    EXPECT_EQ(host.calls, (Calls{"edited", "update", "edited", "update", "idle"}));
    host.undo();
    EXPECT_EQ(host.inPart->getStart(nullptr), 25.0);
    EXPECT_EQ(host.clip->getStart(nullptr), 1.0);
}

TEST(ChangeTelling, ADependentOfAnotherProjectIsNotTold)
{
    HostWithListener host;
    Project& second = host.application.createProject();
    host.calls.clear();

    host.addTrack(TypeWord::Audio, u"A", &second);

    // The hook is told of every project.
    EXPECT_EQ(host.calls, Calls{"edited"});
}

TEST(ChangeTelling, DependentsOfThePoolAreToldWhenItChanges)
{
    HostWithListener host;
    const auto dependencies = service<IDependencyManager>(host.context());
    Calls poolCalls;
    const auto ofPool = makeCounted<Recorder>(poolCalls);
    dependencies->addDependent(host.document()->getMediaPool(), ofPool.get());

    MediaClip& clip = host.addMedia(u"/sound/door.wav", 1.0);
    host.application.idle();
    EXPECT_EQ(poolCalls, Calls{"update"});

    host.edit(u"Rename", [&] { static_cast<IProjectNode&>(clip).setName(nullptr, text(u"gate").get(), 0); });
    EXPECT_EQ(poolCalls, (Calls{"update", "update"}));

    host.edit(u"Edit", [&] { host.clip->setStart(nullptr, 0, 1.0); });
    EXPECT_EQ(poolCalls, (Calls{"update", "update"}));
    dependencies->removeDependent(host.document()->getMediaPool(), ofPool.get());
}

TEST(ChangeTelling, AChangedClockIsToldAtTheNextIdle)
{
    HostWithListener host;

    host.project.setFrameRate({25.0, 0});
    host.project.setTimeOrigin(3600.0);
    host.application.idle();

    EXPECT_EQ(host.calls, (Calls{"update", "idle"}));
    EXPECT_EQ(host.flagsIn["update"], (Flags{{u"project", Content}}));
}

TEST(ChangeTelling, ThePositionAndTheLocatorsAreNoChange)
{
    HostWithListener host;

    host.document()->getLocators()->getParameter(ParameterName::LeftTime)->setValue(1, 5.0);
    service<ITransportControl>(host.context())->setPosition(7.0);
    host.application.idle();

    EXPECT_EQ(host.calls, Calls{"idle"});
}

TEST(ChangeTelling, WhatChangesInNoProjectIsToldToNobody)
{
    HostWithListener host;
    const auto fresh = create<IProjectNode>(host.context(), ClassId::RangeMarker);

    fresh->setEnd(nullptr, 0, 5.0);
    fresh->setName(nullptr, text(u"fresh").get(), 0);
    host.application.idle();

    EXPECT_EQ(host.calls, Calls{"idle"});
}

TEST(DependencyManager, TellsDependentsInTheOrderInWhichTheyCame)
{
    const auto manager = makeCounted<DependencyManager>();
    Calls calls;
    const auto a = makeCounted<Recorder>(calls, "a ");
    const auto b = makeCounted<Recorder>(calls, "b ");
    const auto object = text(u"object");
    FUnknown* const changed = static_cast<FObject*>(object.get());
    EXPECT_EQ(manager->addDependent(changed, b.get()), ResultOk);
    EXPECT_EQ(manager->addDependent(changed, a.get()), ResultOk);

    manager->tell(*changed);

    EXPECT_EQ(calls, (Calls{"b update", "a update"}));
    EXPECT_EQ(a->refCount(), 1);
    EXPECT_EQ(object->refCount(), 1);
}

TEST(DependencyManager, KnowsAnObjectByAnyOfItsInterfaces)
{
    TestHost host;
    const auto manager = makeCounted<DependencyManager>();
    Calls calls;
    const auto dependent = makeCounted<Recorder>(calls);

    EXPECT_EQ(manager->addDependent(host.document(), dependent.get()), ResultOk);
    EXPECT_NE(manager->addDependent(host.root(), dependent.get()), ResultOk);
    manager->tell(*query<ITimeBase>(host.document()));
    EXPECT_EQ(calls, Calls{"update"});

    EXPECT_EQ(manager->removeDependent(host.root(), dependent.get()), ResultOk);
    manager->tell(*host.document());
    EXPECT_EQ(calls, Calls{"update"});
}

TEST(DependencyManager, RefusesNullAndWhatItHasNot)
{
    TestHost host;
    const auto manager = makeCounted<DependencyManager>();
    Calls calls;
    const auto dependent = makeCounted<Recorder>(calls);

    EXPECT_NE(manager->addDependent(nullptr, dependent.get()), ResultOk);
    EXPECT_NE(manager->addDependent(host.document(), nullptr), ResultOk);
    EXPECT_NE(manager->removeDependent(nullptr, dependent.get()), ResultOk);
    EXPECT_NE(manager->removeDependent(host.document(), nullptr), ResultOk);
    EXPECT_NE(manager->removeDependent(host.document(), dependent.get()), ResultOk);
}

TEST(DependencyManager, PassesOverADependentThatAnotherRemoves)
{
    TestHost host;
    const auto manager = makeCounted<DependencyManager>();
    Calls calls;
    const auto first = makeCounted<Recorder>(calls, "first ");
    const auto second = makeCounted<Recorder>(calls, "second ");
    manager->addDependent(host.document(), first.get());
    manager->addDependent(host.document(), second.get());
    first->whenCalled = [&](const std::string&) {
        manager->removeDependent(host.document(), first.get());
        manager->removeDependent(host.document(), second.get());
    };

    manager->tell(*host.document());

    EXPECT_EQ(calls, Calls{"first update"});
}

} // namespace standin::tests
