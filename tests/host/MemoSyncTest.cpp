#include "host/MemoSync.h"

#include "core/Cut.h"
#include "host/HostFailure.h"
#include "host/Project.h"
#include "tests/core/EventMaking.h"
#include "tests/core/TestProject.h"
#include "tests/core/ThrownResult.h"
#include "tests/host/TrackHost.h"
#include "velmark/Attributes.h"
#include "velmark/Module.h"
#include "velmark/String.h"

#include <gtest/gtest.h>

#include <cmath>
#include <functional>
#include <optional>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

using namespace Velmark;
using cadrel::tests::makeEvent;
using cadrel::tests::thrownBy;
using cadrel::util::Result;
using standin::tests::childrenOf;
using standin::tests::text;

namespace cadrel::host {

using tests::TrackHost;

namespace {

using Content = std::vector<std::string>;

/// The film begins at 01:00:00:00, where the clock of the project begins itself or an hour later. The tests give seconds of
/// the film, and in the preview those of its copy.
///
///     film       |----- 10 ===== 20 --------------- 30 ===== 40 -----
///                         source                     destination
class MemoSyncTest : public testing::TestWithParam<double> {
protected:
    static constexpr double Day = 86400.0;

    MemoSyncTest() : calls(), hook(makeCounted<standin::tests::Recorder>(calls))
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
    ~MemoSyncTest() override { service<IProjectManager>(host.context())->removeNotification(hook.get()); }

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
    static std::shared_ptr<core::EventBase> tenSeconds()
    {
        return event("01:00:10:00", "01:00:20:00", "01:00:30:00", "01:00:40:00");
    }

    /// Previews the events, one after the other, and lets the user look at them.
    void preview(const std::vector<std::shared_ptr<core::EventBase>>& events)
    {
        host.adapter.model().settings().setCreateDestinationMarkers(false);
        host.edit(u"Preview", [&] {
            host.adapter.createMarkerTracks(*host.transaction());
            for (const auto& previewed : events)
                host.adapter.processCut(*host.transaction(), *host.adapter.makeCut(previewed));
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

    /// The memos of the real programme, "name start-end"; of a point "name time". To the thousandth.
    Content film() { return content(0.0, Day - 3600.0); }
    /// Their copies.
    Content copies() { return content(Day, 2.0 * Day); }

    std::vector<std::string> calls;
    Counted<standin::tests::Recorder> hook;
    /// What became of the last edit.
    Result::Type followed = Result::Ok;
    cadrel::tests::TestProject timecodes;
    TrackHost host{GetParam()};
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
    Project reopened(host.context(), host.document(), nullptr);
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
    EXPECT_EQ(film(), (Content{"splash 14", "cue 15"}));

    remove(copyOf(u"gunshot"));
    EXPECT_EQ(film(), Content{"splash 14"});
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
    remove(memoOf(u"cue"));

    // Outside of a transaction nothing can be written.
    const auto copy = copyOf(u"cue");
    requireOk(copy->setName(nullptr, text(u"gunshot").get(), 0));
    host.teller.whenTold = [&] {
        EXPECT_EQ(thrownBy([&] { host.adapter.onProjectEdited(*host.transaction()); }), Result::HostCallFailed);
    };
    host.application.idle();
    host.teller.whenTold = nullptr;
}

} // namespace cadrel::host
