// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/MemoSync.h"

#include "core/cut/Cut.h"
#include "host/border/HostFailure.h"
#include "host/project/Project.h"
#include "tests/support/NotQuadratic.h"
#include "tests/support/SecondsOf.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/host/TrackHost.h"
#include "tests/support/standin/RandomProject.h"
#include "velmark/Attributes.h"
#include "velmark/Module.h"
#include "velmark/String.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <functional>
#include <map>
#include <memory>
#include <numeric>
#include <optional>
#include <set>
#include <sstream>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

using namespace Velmark;
using cadrel::tests::expectNotQuadratic;
using cadrel::tests::makeEvent;
using cadrel::tests::secondsOf;
using cadrel::tests::thrownBy;
using cadrel::util::Result;
using standin::tests::Chance;
using standin::tests::childrenOf;
using standin::tests::SeededChance;
using standin::tests::text;

namespace cadrel::host {

using tests::TrackHost;

namespace {

using Content = std::vector<std::string>;

/// A transaction in which nothing can be done.
class RefusingTransaction : public Implements<RefusingTransaction, FObject, IEditTransaction> {
public:
    static constexpr const char* ClassName = "RefusingTransaction";

    int32 begin(bool) override { return ResultFalse; }
    int32 commit(IProjectDocument*, const char16_t*) override { return ResultFalse; }
    int32 insert(FUnknown*, FUnknown*) override { return ResultFalse; }
    int32 remove(FUnknown*, FUnknown*) override { return ResultFalse; }
    int32 move(FUnknown*, FUnknown*, FUnknown*) override { return ResultFalse; }
    int32 copyAll(IProjectDocument*, FUnknown**, double, double, int32) override { return ResultFalse; }
    int32 paste(IProjectDocument*, FUnknown*, int32, double) override { return ResultFalse; }
    int32 deleteRange(IProjectDocument*, int32, double, double) override { return ResultFalse; }
    int32 addStep(IEditStep*) override { return ResultFalse; }
};

/// The film begins at 01:00:00:00, where the clock of the project begins itself or an hour later. The tests give seconds of
/// the film, and in the preview those of its copy.
///
///     film       |----- 10 ===== 20 --------------- 30 ===== 40 -----
///                         source                     destination
class PreviewedMemos {
public:
    static constexpr double Day = 86400.0;

    explicit PreviewedMemos(double origin) : hook(makeCounted<standin::tests::Recorder>(calls)), host(origin)
    {
        hook->whenCalled = [this](const std::string& call) {
            if (call == "edited")
                followed = thrownBy([this] { host.adapter.onProjectEdited(*host.transaction()); });
        };
        requireOk(service<IProjectManager>(host.context())->addNotification(hook.get()));

        host.adapter.computePreviewOffset();
        createMarkerTracks();
        memos = query<IProjectNode>(host.adapter.tracksOfType(TypeWord::Marker).back().node());
    }
    PreviewedMemos(const PreviewedMemos&) = delete;
    PreviewedMemos& operator=(const PreviewedMemos&) = delete;
    ~PreviewedMemos() { service<IProjectManager>(host.context())->removeNotification(hook.get()); }

    void createMarkerTracks()
    {
        host.edit(u"Tracks", [&] { host.adapter.createMarkerTracks(*host.transaction()); });
    }

    /// In the host's seconds.
    double film(double seconds) const { return 3600.0 + seconds - host.origin; }

    TrackHost::Node addMemo(const char16_t* name, double start, double end)
    {
        return host.addRangeMarker(memos, name, film(start), film(end));
    }
    TrackHost::Node addMemo(const char16_t* name, double time) { return host.addPointMarker(memos, name, film(time)); }

    /// A memo in the preview, as the user writes it.
    TrackHost::Node addCopy(const char16_t* name, double start, double end)
    {
        return addMemo(name, Day + start, Day + end);
    }
    TrackHost::Node addCopy(const char16_t* name, double time) { return addMemo(name, Day + time); }

    static std::shared_ptr<core::EventBase> event(const char* srcIn, const char* srcOut, const char* dstIn,
                                                  const char* dstOut)
    {
        return makeEvent("A012", srcIn, srcOut, dstIn, dstOut, 1);
    }
    /// In frames of the film.
    static std::shared_ptr<core::EventBase> carried(int source, int destination, int length)
    {
        const auto at = [](int frames) { return core::Timecode(90000 + frames); };
        auto event = std::make_shared<core::EventBase>();
        event->setTimecodes(at(source), at(source + length), at(destination), at(destination + length));
        return event;
    }
    static std::shared_ptr<core::EventBase> staying(int start, int length) { return carried(start, start, length); }
    static std::shared_ptr<core::EventBase> tenSeconds()
    {
        return event("01:00:10:00", "01:00:20:00", "01:00:30:00", "01:00:40:00");
    }

    /// Previews the events, one after the other, and lets the user look at them.
    void preview(const std::vector<std::shared_ptr<core::EventBase>>& events)
    {
        createMarkerTracks();
        previewWithTheirIds(events);
    }
    /// The same of memos whatever ids they have.
    void previewWithTheirIds(const std::vector<std::shared_ptr<core::EventBase>>& events)
    {
        host.adapter.model().settings().setCreateDestinationMarkers(false);
        host.edit(u"Preview", [&] {
            host.adapter.startWriting();
            for (const auto& previewed : events)
                host.adapter.processCut(*host.transaction(), *host.adapter.makeCut(previewed));
            host.adapter.rememberWritten();
        });
        for (const auto& previewed : events)
            host.adapter.previewEvents().add(previewed);
        host.adapter.model().setPreviewActive(true);
        host.adapter.onProjectChanged();
    }

    /// The copy of that name in the preview, the first of several.
    TrackHost::Node copyOf(const char16_t* name, int which = 0)
    {
        for (const auto& memo : childrenOf(*memos)) {
            if (memo->getStart(nullptr) + host.origin >= Day && std::u16string(memo->getName()) == name && which-- == 0)
                return memo;
        }
        return nullptr;
    }
    TrackHost::Node memoOf(const char16_t* name)
    {
        for (const auto& memo : childrenOf(*memos)) {
            if (std::u16string(memo->getName()) == name)
                return memo;
        }
        return nullptr;
    }
    std::int64_t idOf(const TrackHost::Node& memo) { return HostEvent(host.handle(memos), memo).getUserId(); }

    // What the user does in the preview.
    void move(const TrackHost::Node& copy, double start)
    {
        host.edit(u"Move", [&] { requireOk(copy->setStart(nullptr, 0, film(Day + start))); });
    }
    void resize(const TrackHost::Node& copy, double start, double end)
    {
        host.edit(u"Resize", [&] {
            requireOk(copy->setStart(nullptr, 0, film(Day + start)));
            requireOk(copy->setEnd(nullptr, 0, film(Day + end)));
        });
    }
    void rename(const TrackHost::Node& copy, const char16_t* name)
    {
        host.edit(u"Rename", [&] { requireOk(copy->setName(nullptr, text(name).get(), 0)); });
    }
    void remove(const TrackHost::Node& copy)
    {
        host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), copy.get())); });
    }

    /// What the user has selected is pasted there with all that it keeps.
    TrackHost::Node paste(const TrackHost::Node& memo, double start) { return paste(memo, start, memo->getName()); }
    /// The same under another name.
    TrackHost::Node paste(const TrackHost::Node& memo, double start, const std::u16string& name)
    {
        const double length = memo->getEnd(nullptr) - memo->getStart(nullptr);
        TrackHost::Node pasted;
        host.edit(u"Paste", [&] {
            pasted = memo->isType(TypeWord::Range) ? addMemo(name.c_str(), start, start + length)
                                                   : addMemo(name.c_str(), start);
            for (const char* const key : {AttributeKey::EventUserId, AttributeKey::Followed, AttributeKey::Reel}) {
                FVariant value;
                if (memo->getAttribute(key, value) == ResultOk)
                    requireOk(pasted->setAttribute(key, value, true));
            }
        });
        return pasted;
    }
    /// What the user does while nobody follows.
    void unfollowed(const std::function<void()>& edits)
    {
        const auto following = std::exchange(hook->whenCalled, [](const std::string&) {});
        edits();
        hook->whenCalled = following;
    }
    void endPreview()
    {
        host.adapter.model().setPreviewActive(false);
        host.edit(u"End", [&] { host.adapter.clearPreview(*host.transaction()); });
    }

    /// The memos of the real programme, "name start-end"; of a point "name time". To the thousandth.
    Content film() { return content(0.0, Day - 3600.0); }
    /// Their copies.
    Content copies() { return content(Day, 2.0 * Day); }

    std::vector<std::string> calls;
    Counted<standin::tests::Recorder> hook;
    /// What became of the last edit.
    Result::Type followed = Result::Ok;
    cadrel::tests::TestProject timecodes;
    TrackHost host;
    TrackHost::Node memos;

private:
    Content content(double from, double to)
    {
        Content found;
        for (const auto& memo : childrenOf(*memos)) {
            const double start = memo->getStart(nullptr);
            if (start < film(from) || start >= film(to))
                continue;
            std::ostringstream line;
            line << ConstString(memo->getName()).text8() << " " << rounded(start - film(from));
            if (memo->isType(TypeWord::Range))
                line << "-" << rounded(memo->getEnd(nullptr) - film(from));
            found.push_back(line.str());
        }
        return found;
    }
    static double rounded(double seconds) { return std::round(seconds * 1000.0) / 1000.0; }
};

class MemoSyncTest : public testing::TestWithParam<double>, protected PreviewedMemos {
protected:
    MemoSyncTest() : PreviewedMemos(GetParam()) {}
};

INSTANTIATE_TEST_SUITE_P(Origins, MemoSyncTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(MemoSyncTest, APreviewShowsTheMemosOfItsSource)
{
    addMemo(u"loud", 12.0, 15.0);
    addMemo(u"cue", 17.0);
    addMemo(u"elsewhere", 50.0);

    preview({tenSeconds()});

    EXPECT_EQ(film(), (Content{"loud 12-15", "cue 17", "elsewhere 50"}));
    EXPECT_EQ(copies(), (Content{"loud 32-35", "cue 37"}));
    EXPECT_EQ(idOf(copyOf(u"loud")), idOf(memoOf(u"loud")));
}

TEST_P(MemoSyncTest, AMemoFollowsItsCopyThatMoves)
{
    addMemo(u"loud", 12.0, 15.0);
    addMemo(u"cue", 17.0);
    addMemo(u"elsewhere", 50.0);
    preview({tenSeconds()});

    move(copyOf(u"loud"), 33.0);
    EXPECT_EQ(film(), (Content{"loud 13-16", "cue 17", "elsewhere 50"}));

    move(copyOf(u"cue"), 31.5);
    EXPECT_EQ(film(), (Content{"cue 11.5", "loud 13-16", "elsewhere 50"}));
    EXPECT_EQ(copies(), (Content{"cue 31.5", "loud 33-36"}));
    EXPECT_EQ(followed, Result::Ok);
}

TEST_P(MemoSyncTest, AMemoFollowsTheLengthOfItsCopy)
{
    addMemo(u"loud", 12.0, 15.0);
    preview({tenSeconds()});

    resize(copyOf(u"loud"), 31.0, 38.0);

    EXPECT_EQ(film(), Content{"loud 11-18"});
}

TEST_P(MemoSyncTest, AMemoFollowsTheNameOfItsCopy)
{
    addMemo(u"loud", 12.0, 15.0);
    addMemo(u"cue", 17.0);
    preview({tenSeconds()});

    rename(copyOf(u"cue"), u"gunshot");

    EXPECT_EQ(film(), (Content{"loud 12-15", "gunshot 17"}));
}

TEST_P(MemoSyncTest, AMemoGoesWithItsCopy)
{
    addMemo(u"loud", 12.0, 15.0);
    addMemo(u"cue", 17.0);
    addMemo(u"elsewhere", 50.0);
    preview({tenSeconds()});

    remove(copyOf(u"loud"));

    EXPECT_EQ(film(), (Content{"cue 17", "elsewhere 50"}));
}

TEST_P(MemoSyncTest, WhatIsWrittenInThePreviewIsWrittenInTheFilm)
{
    addMemo(u"loud", 12.0, 15.0);
    preview({tenSeconds()});

    addCopy(u"room tone", 36.0, 39.0);
    addCopy(u"splash", 31.0);

    EXPECT_EQ(film(), (Content{"splash 11", "loud 12-15", "room tone 16-19"}));
    EXPECT_EQ(idOf(memoOf(u"loud")), 1);
    EXPECT_EQ(idOf(memoOf(u"room tone")), 2);
    EXPECT_EQ(idOf(copyOf(u"room tone")), 2);
    EXPECT_EQ(idOf(memoOf(u"splash")), 3);
    EXPECT_EQ(idOf(copyOf(u"splash")), 3);
    FVariant reel;
    EXPECT_EQ(memoOf(u"splash")->getAttribute(AttributeKey::Reel, reel), ResultOk);
    EXPECT_STREQ(reel.asString(), "");
}

TEST_P(MemoSyncTest, WhatWasWrittenInThePreviewIsFollowedFromThenOn)
{
    preview({tenSeconds()});
    addCopy(u"splash", 31.0);

    move(copyOf(u"splash"), 33.0);
    EXPECT_EQ(film(), Content{"splash 13"});

    remove(copyOf(u"splash"));
    EXPECT_EQ(film(), Content());
}

TEST_P(MemoSyncTest, TheCopyOfACopyIsAMemoOfItsOwn)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});

    // Attributes travel with what is copied.
    host.edit(u"Paste", [&] {
        const auto pasted = addCopy(u"cue", 38.0);
        HostEvent(host.handle(memos), pasted).setUserId(idOf(memoOf(u"cue")));
    });

    EXPECT_EQ(film(), (Content{"cue 12", "cue 18"}));
    EXPECT_NE(idOf(copyOf(u"cue", 0)), idOf(copyOf(u"cue", 1)));
}

TEST_P(MemoSyncTest, TheEditAndWhatFollowsAreOneEntryOfTheUndoList)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    const std::string before = host.dump();
    move(copyOf(u"cue"), 38.0);
    const std::string behind = host.dump();

    EXPECT_TRUE(host.undo());
    EXPECT_EQ(host.dump(), before);
    EXPECT_TRUE(host.redo());
    EXPECT_EQ(host.dump(), behind);
    EXPECT_EQ(film(), Content{"cue 18"});
}

TEST_P(MemoSyncTest, FollowsAfterAnUndo)
{
    addMemo(u"cue", 12.0);
    addMemo(u"loud", 15.0);
    preview({tenSeconds()});
    move(copyOf(u"cue"), 38.0);
    host.undo();

    rename(copyOf(u"loud"), u"louder");

    EXPECT_EQ(film(), (Content{"cue 12", "louder 15"}));
}

TEST_P(MemoSyncTest, NothingFollowsWithoutPreview)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    host.adapter.model().setPreviewActive(false);

    remove(copyOf(u"cue"));
    EXPECT_EQ(film(), Content{"cue 12"});

    host.adapter.model().setPreviewActive(true);
    host.adapter.resetPreviewOffset();
    addCopy(u"splash", 31.0);
    EXPECT_EQ(film(), Content{"cue 12"});
    EXPECT_EQ(followed, Result::Ok);
}

TEST_P(MemoSyncTest, NothingFollowsWhereNothingIsPreviewed)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    host.adapter.previewEvents().clear();

    remove(copyOf(u"cue"));

    EXPECT_EQ(film(), Content{"cue 12"});
}

TEST_P(MemoSyncTest, AnEditOfOtherTracksTouchesNoMemo)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    // What is edited past the system is not followed until the memos change again.
    host.adapter.model().setPreviewActive(false);
    move(copyOf(u"cue"), 38.0);
    host.adapter.model().setPreviewActive(true);

    host.addTrack(TypeWord::Audio, u"FX");
    EXPECT_EQ(film(), Content{"cue 12"});
}

TEST_P(MemoSyncTest, FindsTheMemosOfAProjectThatWasOpenedAnew)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    Project reopened(host.context(), host.document());
    reopened.computePreviewOffset();
    reopened.model().setProperty(core::PropertyKey::PreviewOffset, core::Variant(Day));
    reopened.model().setPreviewActive(true);
    reopened.previewEvents().add(tenSeconds());
    hook->whenCalled = [&](const std::string& call) {
        if (call == "edited")
            reopened.onProjectEdited(*host.transaction());
    };

    move(copyOf(u"cue"), 38.0);

    EXPECT_EQ(film(), Content{"cue 18"});
}

TEST_P(MemoSyncTest, NewMemosOfTheFilmGetAnId)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});

    const auto added = addMemo(u"later", 50.0);

    EXPECT_EQ(idOf(added), 2);
}

TEST_P(MemoSyncTest, WhatIsWrittenInTheFilmMeanwhileStays)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});

    addMemo(u"splash", 14.0);
    EXPECT_EQ(film(), (Content{"cue 12", "splash 14"}));

    move(copyOf(u"cue"), 33.0);
    EXPECT_EQ(film(), (Content{"cue 13", "splash 14"}));

    addCopy(u"gunshot", 35.0);
    EXPECT_EQ(film(), (Content{"cue 13", "splash 14", "gunshot 15"}));

    remove(copyOf(u"cue"));
    EXPECT_EQ(film(), (Content{"splash 14", "gunshot 15"}));
}

TEST_P(MemoSyncTest, AMemoThatHangsOverAnEdgeKeepsWhatIsNotInThePreview)
{
    addMemo(u"in", 8.0, 15.0);
    addMemo(u"out", 17.0, 22.0);
    addMemo(u"cue", 16.0);
    preview({tenSeconds()});
    ASSERT_EQ(copies(), (Content{"in 30-35", "cue 36", "out 37-40"}));

    rename(copyOf(u"cue"), u"gunshot");
    EXPECT_EQ(film(), (Content{"in 8-15", "gunshot 16", "out 17-22"}));

    resize(copyOf(u"in"), 30.0, 34.0);
    EXPECT_EQ(film(), (Content{"in 8-14", "gunshot 16", "out 17-22"}));

    resize(copyOf(u"in"), 32.0, 34.0);
    EXPECT_EQ(film(), (Content{"in 12-14", "gunshot 16", "out 17-22"}));
}

TEST_P(MemoSyncTest, AMemoThatOnlyReachesInIsNoOther)
{
    addMemo(u"in", 2.0, 12.0);
    addMemo(u"out", 19.0, 29.0);
    addMemo(u"cue", 16.0);
    preview({tenSeconds()});
    ASSERT_EQ(copies(), (Content{"in 30-32", "cue 36", "out 39-40"}));

    move(copyOf(u"cue"), 35.0);
    EXPECT_EQ(film(), (Content{"in 2-12", "cue 15", "out 19-29"}));

    resize(copyOf(u"out"), 38.0, 40.0);
    EXPECT_EQ(film(), (Content{"in 2-12", "cue 15", "out 18-29"}));

    remove(copyOf(u"in"));
    EXPECT_EQ(film(), (Content{"in 2-12", "cue 15", "out 18-29"}));
}

TEST_P(MemoSyncTest, AMemoThatEndsWhereTheSourceBeginsIsNotTheOneOfACopyOfItsId)
{
    const auto cue = addMemo(u"cue", 18.0, 19.0);
    preview({tenSeconds()});
    unfollowed([&] {
        paste(cue, 9.0, u"pasted");
        remove(cue);
        move(copyOf(u"cue"), 30.0);
    });

    addCopy(u"splash", 39.0);

    EXPECT_EQ(memoOf(u"pasted")->getStart(nullptr), PreviewedMemos::film(9.0));
}

TEST_P(MemoSyncTest, AMemoAtTheEndOfTheSourceIsNotInThePreview)
{
    addMemo(u"cue", 12.0);
    addMemo(u"cut", 20.0);
    preview({tenSeconds()});
    ASSERT_EQ(copies(), Content{"cue 32"});

    move(copyOf(u"cue"), 33.0);

    EXPECT_EQ(film(), (Content{"cue 13", "cut 20"}));
}

TEST_P(MemoSyncTest, AMemoCanMoveToTheStretchOfAnotherEvent)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds(), event("01:00:50:00", "01:01:00:00", "01:00:40:00", "01:00:50:00")});

    move(copyOf(u"cue"), 43.0);

    EXPECT_EQ(film(), Content{"cue 53"});
}

TEST_P(MemoSyncTest, AMemoThatMovesToTheStretchOfAnotherEventStaysTheSame)
{
    const auto cue = addMemo(u"cue", 12.0);
    const auto loud = addMemo(u"loud", 52.0, 55.0);
    const auto in = addMemo(u"in", 9.0, 13.0);
    preview({tenSeconds(), event("01:00:50:00", "01:01:00:00", "01:00:40:00", "01:00:50:00")});
    rename(cue, u"tick");
    rename(loud, u"louder");

    move(copyOf(u"cue"), 40.0);
    EXPECT_EQ(film(), (Content{"in 9-13", "tick 50", "louder 52-55"}));
    move(copyOf(u"loud"), 38.0);
    EXPECT_EQ(film(), (Content{"in 9-13", "louder 18-20", "tick 50"}));
    move(copyOf(u"in"), 45.0);
    EXPECT_EQ(film(), (Content{"louder 18-20", "tick 50", "in 55-58"}));
    EXPECT_EQ(memoOf(u"tick").get(), cue.get());
    EXPECT_EQ(memoOf(u"louder").get(), loud.get());
    EXPECT_EQ(memoOf(u"in").get(), in.get());
}

TEST_P(MemoSyncTest, AnotherMemoOfItsIdStaysWhenTheCopyOfOneMovesToTheStretchOfAnotherEvent)
{
    const auto cue = addMemo(u"cue", 12.0);
    preview({tenSeconds(), event("01:00:50:00", "01:01:00:00", "01:00:40:00", "01:00:50:00")});
    paste(cue, 65.0, u"pasted");

    move(copyOf(u"cue"), 45.0);

    EXPECT_EQ(film(), (Content{"cue 55", "pasted 65"}));
    EXPECT_EQ(memoOf(u"pasted")->getStart(nullptr), PreviewedMemos::film(65.0));
}

TEST_P(MemoSyncTest, OfTwoEventsWithTheSameSourceTheOneThatWasEditedIsFollowed)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds(), event("01:00:10:00", "01:00:20:00", "01:01:00:00", "01:01:10:00")});
    ASSERT_EQ(copies(), (Content{"cue 32", "cue 62"}));

    addCopy(u"splash", 34.0);
    EXPECT_EQ(film(), (Content{"cue 12", "splash 14"}));

    rename(copyOf(u"cue", 0), u"gunshot");
    EXPECT_EQ(film(), (Content{"gunshot 12", "splash 14"}));

    move(copyOf(u"cue"), 65.0);
    EXPECT_EQ(film(), (Content{"splash 14", "gunshot 15"}));

    remove(copyOf(u"gunshot"));
    EXPECT_EQ(film(), Content{"splash 14"});
}

TEST_P(MemoSyncTest, ACopyThatIsNotEditedChangesNothing)
{
    addMemo(u"cue", 12.0);
    addMemo(u"loud", 14.0, 16.0);
    preview({tenSeconds(), event("01:00:10:00", "01:00:20:00", "01:01:00:00", "01:01:10:00")});

    rename(copyOf(u"cue", 0), u"gunshot");
    move(copyOf(u"loud", 1), 65.0);
    EXPECT_EQ(film(), (Content{"gunshot 12", "loud 15-17"}));

    remove(copyOf(u"gunshot"));
    EXPECT_EQ(film(), Content{"loud 15-17"});

    remove(copyOf(u"loud", 1));
    EXPECT_EQ(film(), Content());
    EXPECT_EQ(copies(), (Content{"loud 34-36", "cue 62"}));
}

TEST_P(MemoSyncTest, AMemoThatIsResizedOverAnEdgeReachesToTheEdge)
{
    addMemo(u"splash", 11.0, 12.0);
    addMemo(u"loud", 18.0, 19.0);
    preview({tenSeconds()});

    resize(copyOf(u"loud"), 38.0, 43.0);
    EXPECT_EQ(film(), (Content{"splash 11-12", "loud 18-20"}));

    resize(copyOf(u"splash"), 27.0, 32.0);
    EXPECT_EQ(film(), (Content{"splash 10-12", "loud 18-20"}));

    resize(copyOf(u"loud"), 38.0, 39.5);
    EXPECT_EQ(film(), (Content{"splash 10-12", "loud 18-19.5"}));

    remove(copyOf(u"splash"));
    EXPECT_EQ(film(), Content{"loud 18-19.5"});
}

TEST_P(MemoSyncTest, AMemoThatIsDraggedOverAnEdgeKeepsWhatIsSeenOfIt)
{
    addMemo(u"loud", 15.0, 19.0);
    preview({tenSeconds()});

    move(copyOf(u"loud"), 38.5);
    EXPECT_EQ(film(), Content{"loud 18.5-20"});

    move(copyOf(u"loud"), 28.0);
    EXPECT_EQ(film(), Content{"loud 10-12"});
}

TEST_P(MemoSyncTest, AMemoThatIsDraggedOutOfThePreviewStaysUntilItComesBack)
{
    addMemo(u"loud", 12.0, 15.0);
    addMemo(u"cue", 19.0);
    preview({tenSeconds()});

    move(copyOf(u"cue"), 41.0);
    EXPECT_EQ(film(), (Content{"loud 12-15", "cue 19"}));

    move(copyOf(u"loud"), 20.0);
    EXPECT_EQ(film(), (Content{"loud 12-15", "cue 19"}));

    move(copyOf(u"cue"), 36.0);
    EXPECT_EQ(film(), (Content{"loud 12-15", "cue 16"}));

    move(copyOf(u"cue"), 40.0);
    EXPECT_EQ(film(), (Content{"loud 12-15", "cue 16"})) << "What is copied doesn't hold its end.";

    remove(copyOf(u"cue"));
    remove(copyOf(u"loud"));
    EXPECT_EQ(film(), (Content{"loud 12-15", "cue 16"})) << "Outside of the preview nothing is followed.";
}

TEST_P(MemoSyncTest, AMemoThatWasRenamedOutsideOfThePreviewBringsItsNameBack)
{
    addMemo(u"cue", 19.0);
    preview({tenSeconds()});

    move(copyOf(u"cue"), 41.0);
    rename(copyOf(u"cue"), u"gunshot");
    EXPECT_EQ(film(), Content{"cue 19"});

    move(copyOf(u"gunshot"), 36.0);
    EXPECT_EQ(film(), Content{"gunshot 16"});
}

TEST_P(MemoSyncTest, WhatIsWrittenOverAnEdgeReachesToTheEdge)
{
    preview({tenSeconds()});

    addCopy(u"long", 38.0, 43.0);
    addCopy(u"early", 25.0, 31.0);
    EXPECT_EQ(film(), (Content{"early 10-11", "long 18-20"}));
    EXPECT_EQ(idOf(memoOf(u"long")), idOf(copyOf(u"long")));

    rename(copyOf(u"long"), u"longer");
    EXPECT_EQ(film(), (Content{"early 10-11", "longer 18-20"}));
}

TEST_P(MemoSyncTest, AMemoOverSeveralStretchesBelongsToTheFirst)
{
    preview({tenSeconds(), event("01:00:50:00", "01:01:00:00", "01:00:40:00", "01:00:50:00")});

    addCopy(u"both", 38.0, 42.0);
    addCopy(u"wide", 31.0, 49.0);
    EXPECT_EQ(film(), (Content{"wide 11-20", "both 18-20"}));

    rename(copyOf(u"wide"), u"wider");
    EXPECT_EQ(film(), (Content{"wider 11-20", "both 18-20"}));

    move(copyOf(u"both"), 39.0);
    EXPECT_EQ(film(), (Content{"wider 11-20", "both 50-53"})) << "Most of it lies in the second.";
}

TEST_P(MemoSyncTest, AMemoThatLiesInSeveralStretchesIsWrittenOnce)
{
    preview({event("01:00:10:00", "01:00:16:00", "01:00:30:00", "01:00:36:00"),
             event("01:00:50:00", "01:00:54:00", "01:00:36:00", "01:00:40:00")});

    addCopy(u"wide", 31.0, 40.5);
    EXPECT_EQ(film(), Content{"wide 11-16"});

    rename(copyOf(u"wide"), u"wider");
    EXPECT_EQ(film(), Content{"wider 11-16"});
}

TEST_P(MemoSyncTest, AMemoCannotMoveToAStretchThatItOnlyTouches)
{
    addMemo(u"loud", 12.0, 15.0);
    preview({tenSeconds(), event("01:00:50:00", "01:01:00:00", "01:00:45:00", "01:00:55:00")});

    move(copyOf(u"loud"), 42.0);

    EXPECT_EQ(film(), Content{"loud 12-15"});
}

TEST_P(MemoSyncTest, OfTwoMemosWithTheSameIdEachFollowsItsOwnCopy)
{
    addMemo(u"one", 12.0);
    addMemo(u"two", 15.0);
    // A run that shows a stretch twice leaves two memos of one id.
    createMarkerTracks();
    host.edit(u"Ids", [&] { HostEvent(host.handle(memos), memoOf(u"two")).setUserId(idOf(memoOf(u"one"))); });
    previewWithTheirIds({tenSeconds()});
    ASSERT_EQ(copies(), (Content{"one 32", "two 35"}));

    move(copyOf(u"one"), 33.0);
    EXPECT_EQ(film(), (Content{"one 13", "two 15"}));

    move(copyOf(u"two"), 36.0);
    EXPECT_EQ(film(), (Content{"one 13", "two 16"}));
}

TEST_P(MemoSyncTest, WhatWasDoneToOneCopyOutlivesWhatIsDoneToAnother)
{
    addMemo(u"cue", 12.0);
    addMemo(u"loud", 17.0, 18.0);
    preview({tenSeconds(), event("01:00:10:00", "01:00:20:00", "01:01:00:00", "01:01:10:00")});

    move(copyOf(u"cue", 0), 35.0);
    rename(copyOf(u"cue", 1), u"gunshot");
    EXPECT_EQ(film(), (Content{"gunshot 15", "loud 17-18"}));

    rename(copyOf(u"loud", 0), u"louder");
    resize(copyOf(u"loud"), 67.0, 69.0);
    EXPECT_EQ(film(), (Content{"gunshot 15", "louder 17-19"}));
}

TEST_P(MemoSyncTest, WhatWasDoneToTheMemoItselfOutlivesWhatIsDoneToItsCopy)
{
    const auto cue = addMemo(u"cue", 12.0);
    const auto loud = addMemo(u"loud", 17.0, 18.0);
    preview({tenSeconds()});

    host.edit(u"Move", [&] { requireOk(cue->setStart(nullptr, 0, PreviewedMemos::film(14.0))); });
    rename(copyOf(u"cue"), u"gunshot");
    EXPECT_EQ(film(), (Content{"gunshot 14", "loud 17-18"}));

    rename(loud, u"louder");
    resize(copyOf(u"loud"), 37.0, 39.0);
    EXPECT_EQ(film(), (Content{"gunshot 14", "louder 17-19"}));
}

TEST_P(MemoSyncTest, AMemoThatIsPastedInTheFilmStaysAndFollowsNothing)
{
    for (const double pastedAt : {15.0, 11.0}) {
        SCOPED_TRACE(pastedAt);
        const auto cue = addMemo(u"cue", 12.0);
        preview({tenSeconds()});
        // Attributes travel with what is copied.
        host.edit(u"Paste", [&] {
            const auto pasted = addMemo(u"pasted", pastedAt);
            HostEvent(host.handle(memos), pasted).setUserId(idOf(cue));
        });
        const auto filmWith = [&](const char* other) {
            const std::string pasted = pastedAt > 12.0 ? "pasted 15" : "pasted 11";
            return pastedAt > 12.0 ? Content{other, pasted} : Content{pasted, other};
        };
        EXPECT_EQ(film(), filmWith("cue 12"));

        move(copyOf(u"cue"), 33.0);
        EXPECT_EQ(film(), filmWith("cue 13"));
        rename(copyOf(u"cue"), u"tick");
        EXPECT_EQ(film(), filmWith("tick 13"));
        // A copy that is pasted in the preview is another memo.
        host.edit(u"Paste", [&] {
            const auto pasted = addCopy(u"splash", 38.0);
            HostEvent(host.handle(memos), pasted).setUserId(idOf(cue));
        });
        Content expected = filmWith("tick 13");
        expected.emplace_back("splash 18");
        EXPECT_EQ(film(), expected);

        remove(copyOf(u"splash"));
        remove(copyOf(u"tick"));
        EXPECT_EQ(film(), Content{pastedAt > 12.0 ? "pasted 15" : "pasted 11"});

        host.adapter.model().setPreviewActive(false);
        host.edit(u"End", [&] {
            host.adapter.clearPreview(*host.transaction());
            for (const auto& memo : childrenOf(*memos))
                requireOk(host.transaction()->remove(host.root(), memo.get()));
        });
    }
}

TEST_P(MemoSyncTest, AMemoThatIsPastedInTheFilmStaysWhereItsEventIsShownInPieces)
{
    const auto cue = addMemo(u"cue", 18.0);
    preview({tenSeconds(), event("01:00:50:00", "01:00:52:00", "01:00:34:00", "01:00:36:00")});
    ASSERT_EQ(copies(), Content{"cue 38"});

    host.edit(u"Paste", [&] {
        const auto pasted = addMemo(u"pasted", 12.0);
        HostEvent(host.handle(memos), pasted).setUserId(idOf(cue));
    });
    EXPECT_EQ(film(), (Content{"pasted 12", "cue 18"}));

    remove(copyOf(u"cue"));
    EXPECT_EQ(film(), Content{"pasted 12"});
}

TEST_P(MemoSyncTest, AMemoOfTheFilmThatIsPastedInThePreviewIsAMemoOfItsOwn)
{
    preview({tenSeconds()});
    const auto cue = addMemo(u"cue", 12.0);

    host.edit(u"Paste", [&] {
        const auto pasted = addCopy(u"cue", 38.0);
        HostEvent(host.handle(memos), pasted).setUserId(idOf(cue));
    });

    EXPECT_EQ(film(), (Content{"cue 12", "cue 18"}));
}

TEST_P(MemoSyncTest, OfTwoMemosWithTheSameIdTheOneGoesWhoseCopyIsRemoved)
{
    addMemo(u"one", 12.0);
    addMemo(u"two", 15.0);
    createMarkerTracks();
    host.edit(u"Ids", [&] { HostEvent(host.handle(memos), memoOf(u"two")).setUserId(idOf(memoOf(u"one"))); });
    // A copy that was never edited and one whose memo was edited itself.
    const auto one = memoOf(u"one");
    previewWithTheirIds({tenSeconds()});
    ASSERT_EQ(copies(), (Content{"one 32", "two 35"}));
    ASSERT_EQ(idOf(copyOf(u"one")), idOf(copyOf(u"two")));

    rename(one, u"first");
    move(copyOf(u"two"), 36.0);
    EXPECT_EQ(film(), (Content{"first 12", "two 16"}));
    remove(copyOf(u"one"));
    EXPECT_EQ(film(), Content{"two 16"});
}

TEST_P(MemoSyncTest, AMemoCanTakeThePlaceOfAnother)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});

    host.edit(u"Replace", [&] {
        requireOk(host.transaction()->remove(host.root(), copyOf(u"cue").get()));
        addCopy(u"splash", 33.0);
    });

    EXPECT_EQ(film(), Content{"splash 13"});
}

TEST_P(MemoSyncTest, WhereNothingIsKnownOfTheCopiesTheyAreCompared)
{
    const auto cue = addMemo(u"cue", 12.0);
    addMemo(u"loud", 14.0, 16.0);
    addMemo(u"splash", 18.0);
    host.adapter.previewEvents().add(tenSeconds());
    const auto copy = addCopy(u"gunshot", 33.0);
    const auto other = addCopy(u"loud", 34.0, 37.0);
    const Track handle = host.handle(memos);
    createMarkerTracks();
    HostEvent(handle, copy).setUserId(idOf(cue));
    HostEvent(handle, other).setUserId(idOf(memoOf(u"loud")));
    host.adapter.model().setPreviewActive(true);

    host.edit(u"Edit", [&] { addCopy(u"stranger", 39.0); });
    EXPECT_EQ(film(), (Content{"gunshot 13", "loud 14-17", "splash 18"}))
        << "as many here as there: nothing was written";
}

TEST_P(MemoSyncTest, WhereNothingIsKnownOfTheCopiesTheirNumberTellsWhatWasRemovedOrWritten)
{
    addMemo(u"cue", 12.0);
    addMemo(u"splash", 18.0);
    host.adapter.previewEvents().add(tenSeconds());
    host.adapter.model().setPreviewActive(true);

    addCopy(u"stranger", 39.0);

    EXPECT_EQ(film(), Content()) << "There was one copy for two memos.";
}

TEST_P(MemoSyncTest, WhereNothingIsKnownOfTheCopiesAMemoThatWasDraggedOutStays)
{
    addMemo(u"cue", 12.0);
    addMemo(u"splash", 18.0);
    preview({tenSeconds()});
    host.adapter.model().setPreviewActive(false);
    host.adapter.onProjectChanged();
    host.adapter.model().setPreviewActive(true);

    move(copyOf(u"cue"), 41.0);

    EXPECT_EQ(film(), (Content{"cue 12", "splash 18"}));
}

TEST_P(MemoSyncTest, OfEventsThatOverlapEachIsFollowedWhereItIsSeen)
{
    addMemo(u"cue", 12.0);
    addMemo(u"covered", 17.0);
    addMemo(u"half covered", 14.0, 19.0);
    addMemo(u"over", 52.0);
    preview({tenSeconds(), event("01:00:50:00", "01:01:00:00", "01:00:35:00", "01:00:45:00")});
    ASSERT_EQ(copies(), (Content{"cue 32", "half covered 34-35", "over 37"}));

    move(copyOf(u"cue"), 33.0);
    EXPECT_EQ(film(), (Content{"cue 13", "half covered 14-19", "covered 17", "over 52"}));

    move(copyOf(u"over"), 38.0);
    EXPECT_EQ(film(), (Content{"cue 13", "half covered 14-19", "covered 17", "over 53"}));

    addCopy(u"new", 36.0);
    EXPECT_EQ(film(), (Content{"cue 13", "half covered 14-19", "covered 17", "new 51", "over 53"}));
}

TEST_P(MemoSyncTest, WhatAFasterEventDoesNotShowStays)
{
    addMemo(u"cue", 12.0);
    addMemo(u"hidden", 18.0);
    preview({event("01:00:10:00", "01:00:20:00", "01:00:30:00", "01:00:35:00"),
             event("01:00:50:00", "01:01:00:00", "01:00:35:00", "01:00:45:00")});
    ASSERT_EQ(copies(), Content{"cue 32"});

    move(copyOf(u"cue"), 33.0);

    EXPECT_EQ(film(), (Content{"cue 13", "hidden 18"}));
}

TEST_P(MemoSyncTest, BehindTheMaterialOfASlowerEventAMemoStandsAtItsEnd)
{
    preview({event("01:00:10:00", "01:00:20:00", "01:00:30:00", "01:00:50:00")});

    addCopy(u"late", 45.0);

    EXPECT_EQ(film(), Content{"late 20"});
}

TEST_P(MemoSyncTest, APointPastTheMaterialOfASlowerEventIsFollowedFromThere)
{
    preview({event("01:00:10:00", "01:00:20:00", "01:00:30:00", "01:00:50:00")});
    addCopy(u"late", 45.0);
    ASSERT_EQ(film(), Content{"late 20"});

    move(copyOf(u"late"), 35.0);
    EXPECT_EQ(film(), Content{"late 15"});

    move(copyOf(u"late"), 40.0);
    EXPECT_EQ(film(), Content{"late 20"});

    rename(copyOf(u"late"), u"later");
    EXPECT_EQ(film(), Content{"later 20"});

    remove(copyOf(u"later"));
    EXPECT_EQ(film(), Content());
}

TEST_P(MemoSyncTest, ARangePastTheMaterialOfASlowerEventKeepsItsLengthAsFarAsThereIsRoom)
{
    addMemo(u"loud", 12.0, 15.0);
    preview({event("01:00:10:00", "01:00:20:00", "01:00:30:00", "01:00:50:00")});
    ASSERT_EQ(copies(), Content{"loud 32-35"});

    move(copyOf(u"loud"), 39.96);
    EXPECT_EQ(film(), Content{"loud 19.96-20"}) << "One frame of it is seen.";

    move(copyOf(u"loud"), 40.0);
    EXPECT_EQ(film(), Content{"loud 17-20"});

    resize(copyOf(u"loud"), 45.0, 47.0);
    EXPECT_EQ(film(), Content{"loud 18-20"});

    move(copyOf(u"loud"), 33.0);
    EXPECT_EQ(film(), Content{"loud 13-15"});

    addCopy(u"late", 44.0, 48.0);
    EXPECT_EQ(film(), (Content{"loud 13-15", "late 16-20"}));

    resize(copyOf(u"late"), 40.0, 50.04);
    EXPECT_EQ(film(), (Content{"late 10-20", "loud 13-15"})) << "There is no more room than that.";
}

TEST_P(MemoSyncTest, ARangeThatHangsOverTheEndStaysWhenItsCopyIsTakenPastTheMaterialOfASlowerEvent)
{
    addMemo(u"out", 17.0, 22.0);
    preview({event("01:00:10:00", "01:00:20:00", "01:00:30:00", "01:00:50:00")});
    ASSERT_EQ(copies(), Content{"out 37-40"});

    move(copyOf(u"out"), 43.0);

    EXPECT_EQ(film(), Content{"out 17-22"});
}

TEST(MemoSync, OfAnEventThatReachesToBeforeTheTimelineWhatIsShownIsFollowed)
{
    // Before a clock that begins at 0 there is no timecode.
    PreviewedMemos at(3600.0);
    at.addMemo(u"cue", 12.0);
    at.addMemo(u"splash", 18.0);
    const auto beforeTheClock = PreviewedMemos::event("01:00:10:00", "01:00:20:00", "00:59:55:00", "01:00:05:00");
    at.preview({PreviewedMemos::event("01:00:40:00", "01:00:50:00", "00:59:40:00", "00:59:50:00"), beforeTheClock});
    ASSERT_EQ(at.copies(), Content{"splash 3"});

    at.move(at.copyOf(u"splash"), 2.0);
    EXPECT_EQ(at.film(), (Content{"cue 12", "splash 17"}));
    at.addCopy(u"gunshot", 1.0);
    EXPECT_EQ(at.film(), (Content{"cue 12", "gunshot 16", "splash 17"}));

    // Where nothing is known of the copies, their number tells.
    at.host.adapter.model().setPreviewActive(false);
    at.host.adapter.onProjectChanged();
    at.host.adapter.model().setPreviewActive(true);
    at.rename(at.copyOf(u"splash"), u"big splash");
    EXPECT_EQ(at.film(), (Content{"cue 12", "gunshot 16", "big splash 17"}));
}

TEST_P(MemoSyncTest, EventsThatWriteNothingArePassedOver)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    host.adapter.previewEvents().add(event("99:00:00:00", "01:00:20:00", "01:00:30:00", "01:00:40:00"));
    host.adapter.previewEvents().add(event("01:00:20:00", "01:00:20:00", "01:00:30:00", "01:00:40:00"));
    host.adapter.previewEvents().add(event("01:00:20:00", "01:00:10:00", "01:00:30:00", "01:00:40:00"));
    host.adapter.previewEvents().add(event("01:00:10:00", "01:00:20:00", "01:00:40:00", "01:00:40:00"));

    move(copyOf(u"cue"), 33.0);

    EXPECT_EQ(film(), Content{"cue 13"});
    EXPECT_EQ(followed, Result::Ok);
}

TEST_P(MemoSyncTest, ARefusalIsAFailure)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    const auto refusing = makeCounted<RefusingTransaction>();
    hook->whenCalled = [&](const std::string& call) {
        if (call == "edited")
            followed = thrownBy([&] { host.adapter.onProjectEdited(*refusing); });
    };

    remove(copyOf(u"cue"));
    EXPECT_EQ(followed, Result::HostCallFailed);
    EXPECT_EQ(film(), Content{"cue 12"});

    addCopy(u"splash", 35.0);
    EXPECT_EQ(followed, Result::HostCallFailed);
    EXPECT_EQ(film(), Content{"cue 12"});
}

TEST_P(MemoSyncTest, WhatCouldNotBeFollowedIsFollowedLaterAndStaysUntilThen)
{
    addMemo(u"cue", 12.0);
    addMemo(u"loud", 52.0, 55.0);
    preview({tenSeconds(), event("01:00:50:00", "01:01:00:00", "01:00:40:00", "01:00:50:00")});
    const auto whenCalled = hook->whenCalled;
    const auto refusing = makeCounted<RefusingTransaction>();
    hook->whenCalled = [&](const std::string& call) {
        if (call == "edited")
            followed = thrownBy([&] { host.adapter.onProjectEdited(*refusing); });
    };
    host.edit(u"Edit", [&] {
        requireOk(host.transaction()->remove(host.root(), copyOf(u"cue").get()));
        requireOk(copyOf(u"loud")->setStart(nullptr, 0, PreviewedMemos::film(Day + 44.0)));
    });
    ASSERT_EQ(followed, Result::HostCallFailed);
    ASSERT_EQ(film(), (Content{"cue 12", "loud 52-55"}));
    hook->whenCalled = whenCalled;

    const std::vector<std::shared_ptr<core::EventBase>> shown = host.adapter.previewEvents().events();
    endPreview();
    EXPECT_EQ(copies(), Content{"loud 44-47"});
    ASSERT_TRUE(host.undo());
    for (const auto& previewed : shown)
        host.adapter.previewEvents().add(previewed);
    host.adapter.model().setPreviewActive(true);
    host.adapter.onProjectChanged();

    addCopy(u"splash", 33.0);
    EXPECT_EQ(film(), (Content{"cue 12", "splash 13", "loud 54-57"}));
    endPreview();
    EXPECT_EQ(copies(), Content());
}

TEST_P(MemoSyncTest, OfWhatCouldNotBeFollowedOnlyWhatWasEditedIsFollowedLater)
{
    const auto cue = addMemo(u"cue", 12.0);
    const auto loud = addMemo(u"loud", 15.0, 17.0);
    preview({tenSeconds()});
    unfollowed([&] {
        move(copyOf(u"cue"), 33.0);
        rename(copyOf(u"loud"), u"louder");
    });

    host.edit(u"Edit", [&] {
        requireOk(cue->setName(nullptr, text(u"tick").get(), 0));
        requireOk(loud->setEnd(nullptr, 0, PreviewedMemos::film(18.0)));
    });

    EXPECT_EQ(film(), (Content{"tick 13", "louder 15-18"}));
    EXPECT_EQ(copies(), (Content{"cue 33", "louder 35-37"}));
}

TEST_P(MemoSyncTest, ACopyThatIsTakenBackWhereNobodyFollowsIsFollowedLater)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    move(copyOf(u"cue"), 33.0);
    ASSERT_EQ(film(), Content{"cue 13"});
    unfollowed([&] { move(copyOf(u"cue"), 32.0); });
    ASSERT_EQ(film(), Content{"cue 13"});

    addCopy(u"splash", 38.0);

    EXPECT_EQ(film(), (Content{"cue 12", "splash 18"}));
}

TEST_P(MemoSyncTest, WhatWasDoneToAMemoWhereNobodyFollowedCountsMoreThanAnEarlierEditOfItsCopy)
{
    const auto cue = addMemo(u"cue", 12.0);
    const auto loud = addMemo(u"loud", 15.0, 17.0);
    preview({tenSeconds()});
    unfollowed([&] {
        rename(copyOf(u"cue"), u"tick");
        rename(cue, u"tock");
        resize(copyOf(u"loud"), 36.0, 38.0);
        rename(copyOf(u"loud"), u"louder");
        host.edit(u"Move", [&] { requireOk(loud->setStart(nullptr, 0, PreviewedMemos::film(14.0))); });
    });

    addCopy(u"splash", 39.0);

    EXPECT_EQ(film(), (Content{"tock 12", "louder 14-16", "splash 19"}));
}

TEST_P(MemoSyncTest, WhatWasDoneToACopyAfterItsMemoWhereNobodyFollowedCountsMore)
{
    const auto cue = addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    unfollowed([&] {
        rename(copyOf(u"cue"), u"tick");
        move(copyOf(u"tick"), 33.0);
        rename(cue, u"tock");
        host.edit(u"Move", [&] { requireOk(cue->setStart(nullptr, 0, PreviewedMemos::film(14.0))); });
        rename(copyOf(u"tick"), u"bell");
    });

    addCopy(u"splash", 39.0);

    EXPECT_EQ(film(), (Content{"bell 14", "splash 19"}));
}

TEST_P(MemoSyncTest, AMemoThatWasRemovedWhereNobodyFollowedDoesNotReturnForAnEditOfItsCopy)
{
    const auto cue = addMemo(u"cue", 12.0);
    const auto loud = addMemo(u"loud", 15.0, 17.0);
    preview({tenSeconds()});
    unfollowed([&] {
        move(copyOf(u"loud"), 36.0);
        remove(loud);
        remove(cue);
        rename(copyOf(u"cue"), u"tick");
    });

    addCopy(u"splash", 39.0);
    EXPECT_EQ(film(), Content{"splash 19"});
    move(copyOf(u"splash"), 38.0);
    EXPECT_EQ(film(), Content{"splash 18"});

    endPreview();
    EXPECT_EQ(film(), Content{"splash 18"});
    EXPECT_EQ(copies(), (Content{"tick 32", "loud 36-38"})) << "What the user has done to them isn't lost.";
}

TEST_P(MemoSyncTest, AMemoThatIsRemovedAfterItsCopyWasEditedWhereNobodyFollowedDoesNotReturn)
{
    const auto cue = addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    unfollowed([&] { rename(copyOf(u"cue"), u"tick"); });

    remove(cue);
    EXPECT_EQ(film(), Content());
    addCopy(u"splash", 39.0);
    EXPECT_EQ(film(), Content{"splash 19"});

    rename(copyOf(u"tick"), u"tock");
    EXPECT_EQ(film(), (Content{"tock 12", "splash 19"}));
}

TEST_P(MemoSyncTest, AMemoThatWasWrittenWhereNobodyFollowedDoesNotGoWithTheCopyOfOneThatWasRemoved)
{
    addMemo(u"cue", 12.0);
    const auto loud = addMemo(u"loud", 15.0);
    preview({tenSeconds()});
    unfollowed([&] {
        remove(loud);
        addMemo(u"new", 16.0);
    });

    remove(copyOf(u"loud"));

    EXPECT_EQ(film(), (Content{"cue 12", "new 16"}));
}

TEST_P(MemoSyncTest, WhatIsWrittenInsteadOfAMemoThatWasShownTwiceStays)
{
    const auto cue = addMemo(u"cue", 12.0);
    preview({tenSeconds(), event("01:00:10:00", "01:00:20:00", "01:01:00:00", "01:01:10:00")});

    host.edit(u"Replace", [&] {
        for (const auto& memo : {cue, copyOf(u"cue", 0), copyOf(u"cue", 1)})
            requireOk(host.transaction()->remove(host.root(), memo.get()));
        addCopy(u"splash", 35.0);
    });

    EXPECT_EQ(film(), Content{"splash 15"});
}

TEST_P(MemoSyncTest, ACopyThatIsEditedAfterItsMemoWasRemovedIsWrittenAnew)
{
    const auto cue = addMemo(u"cue", 12.0);
    const auto loud = addMemo(u"loud", 15.0, 17.0);
    preview({tenSeconds()});
    unfollowed([&] {
        rename(copyOf(u"cue"), u"tick");
        remove(cue);
    });

    rename(copyOf(u"tick"), u"tock");
    EXPECT_EQ(film(), (Content{"tock 12", "loud 15-17"}));

    remove(loud);
    EXPECT_EQ(film(), Content{"tock 12"});
    move(copyOf(u"loud"), 36.0);
    EXPECT_EQ(film(), (Content{"tock 12", "loud 16-18"}));

    endPreview();
    EXPECT_EQ(copies(), Content());
}

TEST_P(MemoSyncTest, AMemoThatComesBackByAnUndoFollowsTheEditOfItsCopy)
{
    const auto cue = addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    unfollowed([&] {
        rename(copyOf(u"cue"), u"tick");
        remove(cue);
    });
    ASSERT_TRUE(host.undo());
    ASSERT_EQ(film(), Content{"cue 12"});

    addCopy(u"splash", 39.0);

    EXPECT_EQ(film(), (Content{"tick 12", "splash 19"}));
}

TEST_P(MemoSyncTest, WhatIsPastedWhereNobodyFollowsIsNotTakenForTheCopyThatIsMovedNext)
{
    const auto cue = addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    rename(cue, u"tick");
    unfollowed([&] { paste(cue, Day + 33.0); });

    move(copyOf(u"cue"), 37.0);

    EXPECT_EQ(film(), (Content{"tick 13", "tick 17"}));
    EXPECT_EQ(copies(), (Content{"tick 33", "cue 37"}));
}

TEST_P(MemoSyncTest, WhatIsWrittenOrPastedWhereNobodyFollowsIsWrittenInTheFilmLater)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    unfollowed([&] {
        addCopy(u"new", 33.0);
        paste(copyOf(u"cue"), Day + 35.0);
    });
    ASSERT_EQ(film(), Content{"cue 12"});

    addCopy(u"splash", 39.0);

    EXPECT_EQ(film(), (Content{"cue 12", "new 13", "cue 15", "splash 19"}));
}

TEST_P(MemoSyncTest, KeepsItsNameWhenItsCopyIsTakenFromWhereNothingIsLeftOfTheSource)
{
    preview({tenSeconds(), event("01:00:22:00", "01:00:24:00", "01:00:52:00", "01:00:56:00")});
    addCopy(u"cue", 54.5);
    ASSERT_EQ(film(), Content{"cue 24"});
    unfollowed([&] { rename(memoOf(u"cue"), u"loud"); });

    move(copyOf(u"cue"), 35.0);

    EXPECT_EQ(film(), Content{"loud 15"});
}

TEST_P(MemoSyncTest, KeepsItsNameWhenACopyIsPastedFromOneThatIsInNoStretch)
{
    for (const bool isFollowed : {true, false}) {
        SCOPED_TRACE(isFollowed);
        PreviewedMemos previewed(GetParam());
        previewed.addMemo(u"cue", 12.0);
        previewed.preview({tenSeconds()});
        previewed.move(previewed.copyOf(u"cue"), 50.0);
        previewed.rename(previewed.memoOf(u"cue"), u"loud");
        const auto pasteIt = [&] { previewed.paste(previewed.copyOf(u"cue"), Day + 35.0, u"new"); };
        if (isFollowed)
            pasteIt();
        else
            previewed.unfollowed(pasteIt);

        previewed.addCopy(u"splash", 39.0);

        EXPECT_EQ(previewed.film(), (Content{"loud 12", "new 15", "splash 19"}));
    }
}

TEST_P(MemoSyncTest, KeepsItsNameWhenACopyIsPastedFromOneThatWasTakenElsewhereWhereNobodyFollows)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds(), event("01:00:22:00", "01:00:24:00", "01:00:52:00", "01:00:54:00")});
    unfollowed([&] {
        move(copyOf(u"cue"), 53.0);
        rename(memoOf(u"cue"), u"loud");
    });

    paste(copyOf(u"cue"), Day + 35.0, u"new");

    EXPECT_EQ(film(), (Content{"loud 12", "new 15", "cue 23"}));
}

TEST_P(MemoSyncTest, KeepsTheNameUnderWhichTheUserPastesACopyThatHasNoMemoAnyMore)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    unfollowed([&] {
        rename(copyOf(u"cue"), u"tick");
        remove(memoOf(u"cue"));
    });

    paste(copyOf(u"tick"), 16.0, u"loud");
    EXPECT_EQ(film(), Content{"loud 16"});
    addCopy(u"splash", 39.0);
    EXPECT_EQ(film(), (Content{"loud 16", "splash 19"}));
}

TEST_P(MemoSyncTest, KeepsItsNameWhenItIsPastedIntoThePreviewAfterItWasPastedFromThere)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    unfollowed([&] {
        paste(copyOf(u"cue"), 17.0, u"loud");
        remove(copyOf(u"cue"));
        remove(memoOf(u"cue"));
    });

    paste(memoOf(u"loud"), Day + 35.0, u"new");

    EXPECT_EQ(film(), (Content{"new 15", "loud 17"}));
}

TEST(MemoSync, IsNotQuadraticInThePreviewedEvents)
{
    const auto secondsToFollow = [](int eventCount, bool hasMemos) {
        PreviewedMemos previewed(0.0);
        for (int second = 0; hasMemos && second < 20; ++second)
            previewed.addMemo(u"cue", second);
        for (int frame = 0; frame < eventCount; ++frame)
            previewed.host.adapter.previewEvents().add(PreviewedMemos::staying(frame, 1));
        previewed.host.adapter.model().setPreviewActive(true);
        return secondsOf([&] {
            previewed.host.adapter.onProjectChanged();
            for (int second = 0; second < 5; ++second)
                previewed.addCopy(u"note", second + 0.5);
        });
    };

    for (const bool hasMemos : {false, true}) {
        SCOPED_TRACE(hasMemos);
        // More don't fit into the caches, and look slower than they are.
        expectNotQuadratic(1250, [&](int count) { return secondsToFollow(count, hasMemos); });
    }
}

TEST(MemoSync, WhatWasWrittenOnOtherTracksIsNotReadAtEachChange)
{
    const auto secondsToTell = [](bool isWritten) {
        PreviewedMemos previewed(0.0);
        TrackHost& host = previewed.host;
        host.edit(u"Preview", [&] {
            const auto track = host.addTrack(TypeWord::Audio, u"FX");
            host.adapter.startWriting();
            for (int clip = 0; clip < 20000; ++clip)
                host.addClip(track, u"clip", PreviewedMemos::Day + clip, PreviewedMemos::Day + clip + 1.0);
            if (isWritten)
                host.adapter.rememberWritten();
        });
        host.adapter.model().setPreviewActive(true);
        return secondsOf([&] {
            for (int change = 0; change < 50; ++change)
                host.adapter.onProjectChanged();
        });
    };
    secondsToTell(true);

    // The walk over the project for its tracks remains.
    const double unwritten = std::max(secondsToTell(false), secondsToTell(false));
    EXPECT_LT(std::min(secondsToTell(true), secondsToTell(true)), 2.0 * unwritten);
}

TEST(MemoSync, AnEditElsewhereReadsNeitherTheMemosNorThePreviewedEvents)
{
    const auto editWith = [](bool hasMemos) {
        constexpr int Count = 10000;
        PreviewedMemos previewed(0.0);
        TrackHost& host = previewed.host;
        host.edit(u"Memos", [&] {
            for (int frame = 0; hasMemos && frame < Count; ++frame)
                previewed.addMemo(u"cue", frame / 25.0);
            host.adapter.startWriting();
            previewed.addCopy(u"copy", 0.0);
            host.adapter.rememberWritten();
        });
        for (int frame = 0; frame < Count; ++frame)
            previewed.host.adapter.previewEvents().add(PreviewedMemos::staying(frame, 1));
        host.adapter.model().setPreviewActive(true);
        const auto clip = host.addClip(host.addTrack(TypeWord::Audio, u"FX"), u"clip", 1.0, 2.0);
        const double noting = secondsOf([&] { host.adapter.rememberMemos(); });
        constexpr int EditCount = 100;
        const double editing = secondsOf([&] {
            for (int edit = 0; edit < EditCount; ++edit)
                host.edit(u"Move", [&] { requireOk(clip->setStart(nullptr, 0, edit)); });
        });
        // If each of them noted the memos, or the events, it would be as long.
        EXPECT_LT(editing, EditCount / 4 * noting);
    };
    for (const bool hasMemos : {false, true}) {
        SCOPED_TRACE(hasMemos);
        editWith(hasMemos);
    }
}

TEST_P(MemoSyncTest, AnEditElsewhereLeavesWhatIsKnownOfTheCopies)
{
    addMemo(u"cue", 12.0);
    preview({tenSeconds()});
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto clip = host.addClip(track, u"clip", 1.0, 2.0);

    remove(copyOf(u"cue"));
    EXPECT_EQ(film(), Content());

    ASSERT_TRUE(host.undo());
    host.edit(u"Move", [&] { requireOk(clip->setStart(nullptr, 0, 5.0)); });
    move(copyOf(u"cue"), 33.0);
    EXPECT_EQ(film(), Content{"cue 13"});
}

TEST(MemoSync, IsNotQuadraticInStretchesAndMemosUnderAMemoThatSpansThemAll)
{
    const auto secondsToFollow = [](int count) {
        PreviewedMemos previewed(0.0);
        const double length = count / 25.0;
        previewed.host.edit(u"Memos", [&] {
            previewed.addMemo(u"reel", -1.0, length + 1.0);
            previewed.addCopy(u"copy of the reel", 0.0, length);
            for (int frame = 0; frame < count; ++frame)
                previewed.addMemo(u"cue", frame / 25.0);
        });
        for (int frame = 0; frame < count; ++frame)
            previewed.host.adapter.previewEvents().add(PreviewedMemos::staying(frame, 1));
        previewed.host.adapter.model().setPreviewActive(true);
        return secondsOf([&] {
            previewed.host.adapter.onProjectChanged();
            previewed.addCopy(u"note", 0.5);
        });
    };

    expectNotQuadratic(3000, secondsToFollow);
}

TEST(MemoSync, IsNotQuadraticInCopiesThatSpanTheStretches)
{
    const auto secondsToFollow = [](int count) {
        PreviewedMemos previewed(0.0);
        previewed.host.edit(u"Memos", [&] {
            for (int index = 0; index < count; ++index)
                previewed.addCopy(u"copy", index % 7, count / 25.0 - index % 5);
        });
        for (int frame = 0; frame < count; ++frame)
            previewed.host.adapter.previewEvents().add(PreviewedMemos::staying(frame, 1));
        previewed.host.adapter.model().setPreviewActive(true);
        return secondsOf([&] { previewed.host.adapter.onProjectChanged(); });
    };

    expectNotQuadratic(2000, secondsToFollow);
}

TEST(MemoSync, IsNotQuadraticInTheMemosOfOneStretch)
{
    const auto secondsToFollow = [](int count) {
        PreviewedMemos previewed(0.0);
        previewed.host.edit(u"Memos", [&] {
            for (int index = 0; index < count; ++index)
                previewed.addMemo(u"cue", 10.0 + 8.0 * index / count);
        });
        previewed.preview({PreviewedMemos::tenSeconds()});
        const auto all = childrenOf(*previewed.memos);
        EXPECT_EQ(all.size(), static_cast<std::size_t>(2 * count));
        const double seconds = secondsOf([&] {
            previewed.host.edit(u"Move", [&] {
                for (int index = count; index < 2 * count; ++index) {
                    const auto& copy = all[static_cast<std::size_t>(index)];
                    copy->setStart(nullptr, 0, copy->getStart(nullptr) + 1.0);
                }
            });
            previewed.host.edit(u"Write", [&] {
                for (int index = 0; index < count; ++index)
                    previewed.addCopy(u"note", 30.0 + 9.0 * index / count);
            });
            previewed.host.edit(u"Remove", [&] {
                for (int index = count; index < 2 * count; ++index)
                    previewed.host.transaction()->remove(previewed.host.root(),
                                                         all[static_cast<std::size_t>(index)].get());
            });
        });
        EXPECT_EQ(childrenOf(*previewed.memos).size(), static_cast<std::size_t>(2 * count));
        return seconds;
    };

    expectNotQuadratic(1500, secondsToFollow);
}

TEST(MemoSync, IsNotQuadraticInEventsOfWhichEachIsEdited)
{
    const auto secondsToFollow = [](int count) {
        PreviewedMemos previewed(0.0);
        std::vector<std::shared_ptr<core::EventBase>> events;
        previewed.host.edit(u"Memos", [&] {
            for (int index = 0; index < count; ++index)
                previewed.addMemo(u"cue", index + 0.4);
        });
        for (int index = 0; index < count; ++index)
            events.push_back(PreviewedMemos::staying(25 * index, 25));
        previewed.preview(events);
        const auto all = childrenOf(*previewed.memos);
        EXPECT_EQ(all.size(), static_cast<std::size_t>(2 * count));
        return secondsOf([&] {
            previewed.host.edit(u"Rename", [&] {
                for (int index = count; index < 2 * count; ++index)
                    all[static_cast<std::size_t>(index)]->setName(nullptr, text(u"gunshot").get(), 0);
            });
        });
    };

    expectNotQuadratic(500, secondsToFollow);
}

/// Memos and previewed events in tens of seconds, at random; the events share neither sources nor destinations. The user
/// edits copies of memos that are seen once, and takes them over the edges of their stretch and out of it, but not into
/// another.
class RandomPreview : public PreviewedMemos {
public:
    struct Memo {
        std::string name;
        int start;
        int end; ///< that of a point is its start

        bool operator==(const Memo&) const = default;
        friend std::ostream& operator<<(std::ostream& out, const Memo& memo)
        {
            return out << memo.name << " " << memo.start << "-" << memo.end;
        }
    };
    using Memos = std::map<std::int64_t, Memo>;

    explicit RandomPreview(Chance& chance) : PreviewedMemos(chance.oneIn(2) ? 0.0 : 3600.0), m_chance(chance)
    {
        const int memoCount = somewhere(0, 12);
        for (int number = 0; number < memoCount; ++number) {
            const int start = somewhere(0, Slots * SlotLength * 25);
            add(start, somewhere(0, 300));
        }
        std::vector<int> sources(Slots);
        std::iota(sources.begin(), sources.end(), 0);
        for (std::size_t index = sources.size(); index > 1; --index)
            std::swap(sources[index - 1], sources[chance.below(index)]);
        std::vector<std::shared_ptr<core::EventBase>> events;
        for (int slot = 0; slot < Slots; ++slot) {
            if (slot > 0 && m_chance.oneIn(2))
                continue;
            const Shown shown{sources[static_cast<std::size_t>(slot)] * SlotLength * 25 + somewhere(0, 50),
                              slot * SlotLength * 25 + somewhere(0, 50), somewhere(25, 200)};
            events.push_back(carried(shown.source, shown.destination, shown.length));
            stretches.push_back(shown);
        }
        preview(events);
        expected = found();
    }

    void editSomething()
    {
        const Shown shown = m_chance.oneOf(stretches);
        // The next stretch is further away than that.
        const int from = shown.destination - Overhang;
        const int until = shown.destination + shown.length + Overhang;
        const int start = somewhere(from, until - 1);
        const int end = somewhere(start + 1, until);

        const std::vector<TrackHost::Node> copies = copiesWithin(from, until);
        if (copies.empty() || m_chance.oneIn(4)) {
            const auto copy = add(start + DayFrames, m_chance.oneIn(2) ? end - start : 0);
            const Memo written = read(copy, Day);
            if (shown.shows(written))
                expected[idOf(copy)] = {written.name, shown.toSource(written.start), shown.toSource(written.end)};
            return;
        }
        const TrackHost::Node copy = m_chance.oneOf(copies);
        const std::int64_t id = idOf(copy);
        // What lies in the film mostly elsewhere can be edited here, but not removed.
        switch (somewhere(shown.holds(expected.at(id)) ? 0 : 1, 3)) {
        case 0: {
            const bool wasShown = shown.shows(read(copy, Day));
            remove(copy);
            if (wasShown)
                expected.erase(id);
            return;
        }
        case 1:
            rename(copy, nextName().c_str());
            break;
        default:
            if (copy->isType(TypeWord::Range))
                resize(copy, start / 25.0, end / 25.0);
            else
                move(copy, start / 25.0);
        }
        const Memo edited = read(copy, Day);
        if (!shown.shows(edited))
            return;
        // What the stretch doesn't show of a memo stays.
        Memo& memo = expected.at(id);
        const auto follow = [&shown](int& own, int inPreview) {
            if (shown.clamped(own) != shown.toSource(inPreview))
                own = shown.toSource(inPreview);
        };
        memo.name = edited.name;
        follow(memo.start, edited.start);
        follow(memo.end, edited.end);
    }

    /// The memos of the film by their ids.
    Memos found()
    {
        Memos all;
        for (const auto& memo : childrenOf(*memos)) {
            if (memo->getStart(nullptr) < film(Day - 3600.0))
                RC_ASSERT(all.emplace(idOf(memo), read(memo, 0.0)).second);
        }
        return all;
    }

    Memos expected;

private:
    struct Shown {
        int source;
        int destination;
        int length;

        bool shows(const Memo& copy) const
        {
            const int behind = destination + length;
            return copy.start < behind && (copy.end > destination || copy.start >= destination);
        }
        bool holds(const Memo& memo) const { return memo.start >= source && memo.end <= source + length; }
        int clamped(int sourceTime) const { return std::clamp(sourceTime, source, source + length); }
        int toSource(int previewTime) const { return clamped(previewTime - destination + source); }
    };

    static constexpr int Slots = 6;
    static constexpr int SlotLength = 12;
    static constexpr int DayFrames = 86400 * 25;
    static constexpr int Overhang = 24;

    /// The copies that lie there whole, of memos that are in the film and that no other stretch shows.
    std::vector<TrackHost::Node> copiesWithin(int from, int until)
    {
        std::vector<TrackHost::Node> copies;
        std::map<std::int64_t, int> counts;
        for (const auto& memo : childrenOf(*memos)) {
            if (memo->getStart(nullptr) < film(Day - 3600.0))
                continue;
            const Memo copy = read(memo, Day);
            ++counts[idOf(memo)];
            if (copy.start >= from && copy.end <= until)
                copies.push_back(memo);
        }
        std::erase_if(copies, [&](const TrackHost::Node& copy) {
            return counts.at(idOf(copy)) > 1 || !expected.contains(idOf(copy));
        });
        return copies;
    }

    int somewhere(int from, int until)
    {
        return from + static_cast<int>(m_chance.below(static_cast<std::uint64_t>(until - from)));
    }
    std::u16string nextName()
    {
        const std::string name = "memo " + std::to_string(++m_names);
        return {name.begin(), name.end()};
    }
    TrackHost::Node add(int start, int length)
    {
        return length > 0 ? addMemo(nextName().c_str(), start / 25.0, (start + length) / 25.0)
                          : addMemo(nextName().c_str(), start / 25.0);
    }
    Memo read(const TrackHost::Node& memo, double from)
    {
        const auto frames = [&](double time) { return static_cast<int>(std::lround((time - film(from)) * 25.0)); };
        return {ConstString(memo->getName()).text8(), frames(memo->getStart(nullptr)), frames(memo->getEnd(nullptr))};
    }

    Chance& m_chance;
    std::vector<Shown> stretches;
    int m_names = 0;
};

RC_GTEST_PROP(MemoSyncLaw, AMemoFollowsItsCopyAndNoOtherChanges, ())
{
    SeededChance chance(*rc::gen::noShrink(rc::gen::resize(rc::kNominalSize, rc::gen::arbitrary<std::uint64_t>())));
    RandomPreview preview(chance);
    for (std::uint64_t count = 1 + chance.below(7); count > 0; --count) {
        const auto before = preview.expected;
        const std::size_t entries = preview.host.project.undoList().doneCount();
        preview.editSomething();
        RC_ASSERT(preview.found() == preview.expected);
        // An edit that changes nothing is no entry of the undo list.
        if (chance.oneIn(4) && preview.host.project.undoList().doneCount() > entries) {
            preview.host.undo();
            preview.expected = before;
            RC_ASSERT(preview.found() == before);
        }
    }
}

/// A user who writes, pastes, renames, moves and removes memos of the film and copies in several stretches, undoes and redoes
/// that, and opens the project anew. Now and then nobody follows. What he has done last of a name or a place counts, and
/// what he has removed doesn't return.
class BusyUser : public PreviewedMemos {
public:
    explicit BusyUser(Chance& chance) : PreviewedMemos(chance.oneIn(2) ? 0.0 : 3600.0), m_chance(chance)
    {
        // What is previewed has something in it.
        writeMemo(Place{someStretch(), unusedStart()}, false);
        for (std::uint64_t count = chance.below(5); count > 0; --count)
            writeMemo(Place{m_chance.oneIn(4) ? Elsewhere : someStretch(), unusedStart()}, false);
        std::vector<std::shared_ptr<core::EventBase>> events;
        for (std::size_t stretch = 0; stretch < Elsewhere; ++stretch)
            events.push_back(carried(25 * Sources.at(stretch), 25 * Destinations.at(stretch), StretchLength));
        preview(events);
        for (Memo& memo : m_memos) {
            if (memo.film->place.stretch != Elsewhere)
                memo.written = memo.copy = memo.last = *memo.film;
            memo.isMarked = true;
        }
        m_done.clear();
        hook->whenCalled = [this](const std::string& call) {
            if (call == "edited" && m_isFollowed)
                followed = thrownBy([this] { m_project->onProjectEdited(*host.transaction()); });
        };
        requireContent();
    }

    void editSomething()
    {
        m_isFollowed = m_chance.oneIn(2);
        switch (m_chance.below(12)) {
        case 0:
            writeMemo(Place{static_cast<int>(m_chance.below(Elsewhere + 1)), unusedStart()}, m_chance.oneIn(2));
            break;
        case 1:
            pasteSomething();
            break;
        case 2:
            removeSomething();
            break;
        case 3:
            undoOrRedo();
            break;
        case 4:
            reopen();
            break;
        default:
            editMemo();
        }
        requireContent();
    }
    void endPreview()
    {
        m_project->model().setPreviewActive(false);
        host.edit(u"End", [&] { m_project->clearPreview(*host.transaction()); });
        std::set<int> groups;
        for (const Memo& memo : m_memos) {
            if (memo.film)
                groups.insert(memo.group);
        }
        // What the user has made of them is in the film, where he hasn't removed it.
        for (Memo& memo : m_memos) {
            if (memo.copy && !memo.isBehind() && (groups.contains(memo.group) || memo.copy == memo.written))
                memo.copy.reset();
        }
        requireContent();
    }

private:
    static constexpr int StretchLength = 250;
    static constexpr int Elsewhere = 3; ///< of the film, where no stretch is
    static constexpr std::array<int, Elsewhere + 1> Sources{10, 60, 45, 80};
    static constexpr std::array<int, Elsewhere> Destinations{30, 40, 55};

    struct Place {
        int stretch;
        int start; ///< in frames

        bool operator==(const Place&) const = default;
    };
    /// What can be edited of a memo.
    struct Side {
        std::string name;
        Place place;

        bool operator==(const Side&) const = default;
    };
    struct Memo {
        std::optional<Side> film;
        std::optional<Side> copy;
        std::optional<Side> written; ///< by the preview
        Side last;                   ///< of the copy, when it was written or followed
        bool isMarked = false;       ///< the copy; one that nobody has followed yet isn't
        Side before;                 ///< of the film, when the copy got what isn't followed yet
        int group = 0;               ///< of memos that have one id
        bool isShared = false;       ///< another one of the film has or had that id
        int length = 0;

        bool isBehind() const { return copy && (!isMarked || copy != last); }
    };
    using Memos = std::vector<Memo>;
    /// An edit of one memo.
    struct Edit {
        std::size_t memo;
        bool isOfCopy;
    };

    // What the user does. What would be told otherwise than by its order isn't done: which one of several memos of an id is
    // meant where nobody has followed.

    void writeMemo(const Place& place, bool isOfCopy)
    {
        const Side side{newName(), place};
        const bool isCopy = isOfCopy && place.stretch != Elsewhere;
        Memo memo;
        memo.group = ++m_groups;
        memo.length = m_chance.oneIn(2) ? 0 : 1 + static_cast<int>(m_chance.below(50));
        (isCopy ? memo.copy : memo.film) = side;
        begin();
        const double start = secondsOf(place, isCopy);
        const std::u16string name(side.name.begin(), side.name.end());
        if (memo.length > 0)
            addMemo(name.c_str(), start, start + memo.length / 25.0);
        else
            addMemo(name.c_str(), start);
        m_memos.push_back(memo);
        finish({m_memos.size() - 1, isCopy});
    }
    void pasteSomething()
    {
        if (m_memos.empty())
            return;
        const std::size_t index = m_chance.below(m_memos.size());
        const bool isOfCopy = m_memos[index].copy && m_chance.oneIn(2);
        const Place place{m_chance.oneIn(2) ? Elsewhere : someStretch(), unusedStart()};
        const bool isCopy = place.stretch != Elsewhere;
        if (!(isOfCopy || m_memos[index].film) || m_memos[index].isShared)
            return;
        if ((isOfCopy || !isCopy) && m_memos[index].isBehind())
            return;
        m_isFollowed = m_isFollowed || (isOfCopy && isCopy);
        Memo pasted;
        pasted.length = m_memos[index].length;
        const Side from = *(isOfCopy ? m_memos[index].copy : m_memos[index].film);
        (isCopy ? pasted.copy : pasted.film) = Side{from.name, place};
        pasted.group = m_memos[index].group;
        pasted.isShared = !isCopy;
        begin();
        paste(nodeOf(from, isOfCopy), secondsOf(place, isCopy));
        m_memos[index].isShared = m_memos[index].isShared || !isCopy;
        m_memos.push_back(pasted);
        finish({m_memos.size() - 1, isCopy});
    }
    void removeSomething()
    {
        if (m_memos.empty())
            return;
        const std::size_t index = m_chance.below(m_memos.size());
        const bool isOfCopy = m_memos[index].copy && m_chance.oneIn(2);
        const std::optional<Side>& side = isOfCopy ? m_memos[index].copy : m_memos[index].film;
        if (!side)
            return;
        begin();
        remove(nodeOf(*side, isOfCopy));
        Memo& memo = m_memos[index];
        if (isOfCopy && m_isFollowed && !memo.isBehind())
            memo.film.reset();
        (isOfCopy ? memo.copy : memo.film).reset();
        finish({index, false});
    }
    void editMemo()
    {
        if (m_memos.empty())
            return;
        const std::size_t index = m_chance.below(m_memos.size());
        const Memo& memo = m_memos[index];
        const bool isOfCopy = memo.copy && m_chance.oneIn(2);
        const std::optional<Side>& own = isOfCopy ? memo.copy : memo.film;
        if (!own)
            return;
        if (memo.isShared && isOfCopy)
            m_isFollowed = true;
        Side side = *own;
        // A memo that is taken back to where it was before its copy was edited can't be told from one that stayed there.
        const bool canBeTakenBack = memo.copy && memo.isMarked && (isOfCopy || !memo.isBehind());
        const bool isTakenBack = canBeTakenBack && m_chance.oneIn(3);
        const bool isName = m_chance.oneIn(2);
        if (isName)
            side.name = isTakenBack ? memo.last.name : newName();
        else if (!isTakenBack)
            side.place.start = unusedStart();
        else if (memo.last.place.stretch == side.place.stretch)
            side.place = memo.last.place;
        // To another stretch, while it is known whose copy it is.
        if (!isName && isOfCopy && m_isFollowed && !memo.isBehind() && memo.film && m_chance.oneIn(3))
            side.place = Place{someStretch(), unusedStart()};
        if (side == *own)
            return;
        change(index, isOfCopy, side);
    }
    void change(std::size_t index, bool isOfCopy, const Side& side)
    {
        const Side old = *(isOfCopy ? m_memos[index].copy : m_memos[index].film);
        begin();
        const auto node = nodeOf(old, isOfCopy);
        host.edit(u"Edit", [&] {
            if (side.name != old.name)
                requireOk(
                    node->setName(nullptr, text(std::u16string(side.name.begin(), side.name.end()).c_str()).get(), 0));
            else
                requireOk(node->setStart(nullptr, 0, PreviewedMemos::film(secondsOf(side.place, isOfCopy))));
        });
        Memo& memo = m_memos[index];
        if (isOfCopy && memo.film) {
            const bool wasBehind = memo.isBehind();
            if (!wasBehind || side.name != old.name)
                memo.before.name = memo.film->name;
            if (!wasBehind || side.place != old.place)
                memo.before.place = memo.film->place;
        }
        (isOfCopy ? memo.copy : memo.film) = side;
        finish({index, isOfCopy});
    }
    void undoOrRedo()
    {
        const bool isUndo = m_chance.oneIn(2);
        auto& from = isUndo ? m_done : m_undone;
        auto& to = isUndo ? m_undone : m_done;
        if (from.empty())
            return;
        RC_LOG() << (isUndo ? "undo" : "redo") << "\n";
        const bool isDone = isUndo ? host.undo() : host.redo();
        RC_ASSERT(isDone);
        to.push_back(std::exchange(m_memos, from.back()));
        from.pop_back();
    }
    void reopen()
    {
        RC_LOG() << "reopened\n";
        m_project->save();
        m_teller.reset();
        auto reopened = std::make_unique<Project>(host.context(), host.document());
        reopened->load();
        m_reopened = std::move(reopened);
        m_project = m_reopened.get();
        m_teller = std::make_unique<tests::ChangeTeller>(host.context(), *m_project);
        // Nobody knows any more what was edited last.
        for (Memo& memo : m_memos) {
            if (memo.film)
                memo.before = *memo.film;
        }
        m_done.clear();
        m_undone.clear();
    }

    // What has to come of it.

    void begin()
    {
        m_done.push_back(m_memos);
        m_undone.clear();
    }
    void finish(const Edit& edit)
    {
        RC_LOG() << (m_isFollowed ? "followed: " : "not followed: ") << testing::PrintToString(film()) << " "
                 << testing::PrintToString(copies()) << "\n";
        if (m_isFollowed) {
            for (std::size_t index = 0; index < m_memos.size(); ++index)
                follow(m_memos[index], edit.isOfCopy && edit.memo == index);
        }
    }
    void follow(Memo& memo, bool isCopyEdited)
    {
        if (!memo.copy)
            return;
        if (memo.film) {
            if (memo.copy->name != memo.last.name && memo.film->name == memo.before.name)
                memo.film->name = memo.copy->name;
            if (memo.copy->place != memo.last.place && memo.film->place == memo.before.place)
                memo.film->place = memo.copy->place;
        } else if (!memo.isMarked || isCopyEdited) {
            memo.film = memo.copy;
            memo.group = ++m_groups;
        } else {
            return;
        }
        memo.last = *memo.copy;
        memo.isMarked = true;
    }
    void requireContent()
    {
        RC_ASSERT(followed == Result::Ok);
        RC_ASSERT(sorted(film()) == linesOf(false));
        RC_ASSERT(sorted(copies()) == linesOf(true));
    }
    Content linesOf(bool isOfCopies) const
    {
        Content lines;
        for (const Memo& memo : m_memos) {
            const std::optional<Side>& side = isOfCopies ? memo.copy : memo.film;
            if (!side)
                continue;
            const double start = secondsOf(side->place, isOfCopies) - (isOfCopies ? Day : 0.0);
            std::ostringstream line;
            line << side->name << " " << std::round(start * 1000.0) / 1000.0;
            if (memo.length > 0)
                line << "-" << std::round((start + memo.length / 25.0) * 1000.0) / 1000.0;
            lines.push_back(line.str());
        }
        return sorted(std::move(lines));
    }
    static Content sorted(Content lines)
    {
        std::ranges::sort(lines);
        return lines;
    }

    TrackHost::Node nodeOf(const Side& side, bool isOfCopy)
    {
        const double start = PreviewedMemos::film(secondsOf(side.place, isOfCopy));
        for (const auto& node : childrenOf(*memos)) {
            if (ConstString(node->getName()).text8() == side.name && std::abs(node->getStart(nullptr) - start) < 0.001)
                return node;
        }
        RC_FAIL("There is no such memo.");
        return nullptr;
    }
    /// Of the film, and in the preview those of its copy.
    static double secondsOf(const Place& place, bool isOfCopy)
    {
        const auto stretch = static_cast<std::size_t>(place.stretch);
        return (isOfCopy ? Day + Destinations.at(stretch) : Sources.at(stretch)) + place.start / 25.0;
    }
    int someStretch() { return static_cast<int>(m_chance.below(Elsewhere)); }
    /// Where the longest memo is in its stretch whole.
    int unusedStart()
    {
        int start = 0;
        do {
            start = static_cast<int>(m_chance.below(StretchLength - 50));
        } while (!m_usedStarts.insert(start).second);
        return start;
    }
    std::string newName() { return std::to_string(++m_names); }

    Chance& m_chance;
    Project* m_project = &host.adapter;
    std::unique_ptr<Project> m_reopened;
    std::unique_ptr<tests::ChangeTeller> m_teller;
    bool m_isFollowed = false;
    Memos m_memos;
    std::vector<Memos> m_done;
    std::vector<Memos> m_undone;
    std::set<int> m_usedStarts;
    int m_names = 0;
    int m_groups = 0;
};

RC_GTEST_PROP(MemoSyncLaw, TheLastNameAndPlaceCountWhereverTheyWereGivenAndNothingRemovedReturns, ())
{
    SeededChance chance(*rc::gen::noShrink(rc::gen::resize(rc::kNominalSize, rc::gen::arbitrary<std::uint64_t>())));
    BusyUser user(chance);
    for (std::uint64_t count = 1 + chance.below(40); count > 0; --count)
        user.editSomething();

    user.endPreview();
}

} // namespace cadrel::host
