// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/video/VideoTrackHandler.h"

#include "host/border/HostFailure.h"
#include "tests/support/host/FakeProject.h"
#include "tests/support/host/VideoHost.h"

#include <gtest/gtest.h>

#include <array>
#include <limits>
#include <vector>

using namespace Velmark;

namespace cadrel::host {

using tests::VideoHost;
using util::Result;
using Mode = gui::VideoTrackHandlerBase::Mode;

namespace {

struct CountingListener : gui::VideoTrackHandlerBase::Listener {
    void tracksChanged() override { ++calls; }

    int calls = 0;
};

/// The channels over the video tracks of a project.
struct VideoTrackHandlerTest : testing::Test {
    VideoTrackHandlerTest() { handler.addListener(&listener); }

    void rebuild()
    {
        handler.rebuild(&host.adapter);
        listener.calls = 0;
    }
    std::vector<std::wstring> names() { return {handler.getName(0), handler.getName(1)}; }
    std::vector<std::int32_t> modes() { return {handler.getMode(0), handler.getMode(1)}; }
    std::int32_t roleOf(const VideoHost::Node& node) { return host.handle(node).role(); }
    void remove(const VideoHost::Node& track)
    {
        host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), track.get())); });
    }

    VideoHost host{3600.0};
    VideoTrackHandler handler;
    CountingListener listener;
};

using Names = std::vector<std::wstring>;
using Modes = std::vector<std::int32_t>;

} // namespace

TEST_F(VideoTrackHandlerTest, HasTwoChannelsWithoutTracksAtFirst)
{
    EXPECT_EQ(handler.channelCount(), 2U);
    EXPECT_FALSE(handler.isAvailable(0) || handler.isAvailable(1));
    EXPECT_EQ(names(), (Names{L"", L""}));
    EXPECT_EQ(modes(), (Modes{-1, -1}));
}

TEST_F(VideoTrackHandlerTest, PutsTheFirstTwoVideoTracksOnItsChannels)
{
    host.addTrack(TypeWord::Audio, u"FX");
    const auto folder = host.addTrack(TypeWord::Folder, u"Pictures");
    host.addTrack(TypeWord::Video, u"inside", folder.get());
    host.addVideoTrack(u"second");
    host.addVideoTrack(u"third");

    rebuild();

    EXPECT_EQ(names(), (Names{L"inside", L"second"}));
    EXPECT_TRUE(handler.isAvailable(0) && handler.isAvailable(1));
}

TEST_F(VideoTrackHandlerTest, LeavesAChannelEmptyForWhichThereIsNoTrack)
{
    host.addVideoTrack(u"only");

    rebuild();

    EXPECT_EQ(names(), (Names{L"only", L""}));
    EXPECT_TRUE(handler.isAvailable(0));
    EXPECT_FALSE(handler.isAvailable(1));
    EXPECT_EQ(modes(), (Modes{Mode::None, Mode::None}));

    handler.rebuild(nullptr);
    EXPECT_FALSE(handler.isAvailable(0));
}

TEST_F(VideoTrackHandlerTest, OfMoreThanTwoTracksThoseWithARoleAreTaken)
{
    host.addVideoTrack(u"rushes");
    host.addVideoTrack(u"storyboard");
    const auto made = host.addVideoTrack(u"New Video", TrackRole::NewVideo);

    rebuild();
    EXPECT_EQ(names(), (Names{L"rushes", L"New Video"}));
    EXPECT_EQ(modes(), (Modes{Mode::None, Mode::New}));

    // Turned off it still has its role.
    host.handle(made).setRole(264);
    rebuild();
    EXPECT_EQ(names(), (Names{L"rushes", L"New Video"}));

    host.addVideoTrack(u"Old Video", TrackRole::OldVideo);
    host.addVideoTrack(u"another", TrackRole::OldVideo);
    rebuild();
    EXPECT_EQ(names(), (Names{L"New Video", L"Old Video"}));
}

TEST_F(VideoTrackHandlerTest, OfManyTracksWithARoleTheFirstOfEachPictureIsTaken)
{
    host.addVideoTrack(u"old", TrackRole::OldVideo);
    host.addVideoTrack(u"older", 266);
    host.addVideoTrack(u"oldest", TrackRole::OldVideo);
    host.addVideoTrack(u"New Video", TrackRole::NewVideo);
    host.addVideoTrack(u"newer", TrackRole::NewVideo);

    rebuild();

    EXPECT_EQ(names(), (Names{L"old", L"New Video"}));
}

TEST_F(VideoTrackHandlerTest, RefusesAChannelThatIsNotThere)
{
    host.addVideoTrack(u"first");
    host.addVideoTrack(u"second");
    host.addVideoTrack(u"third");
    rebuild();

    for (const std::size_t channel : {std::size_t{2}, std::numeric_limits<std::size_t>::max()}) {
        EXPECT_EQ(resultOf([&] { handler.isAvailable(channel); }), Result::InvalidArgument);
        EXPECT_EQ(resultOf([&] { handler.getName(channel); }), Result::InvalidArgument);
        EXPECT_EQ(resultOf([&] { handler.getMode(channel); }), Result::InvalidArgument);
        EXPECT_EQ(resultOf([&] { handler.setMode(channel, Mode::Old); }), Result::InvalidArgument);
    }
}

TEST_F(VideoTrackHandlerTest, ReadsTheModeFromTheRole)
{
    const auto first = host.addVideoTrack(u"first");
    const auto second = host.addVideoTrack(u"second");
    rebuild();
    EXPECT_EQ(modes(), (Modes{-1, -1})) << "Without a role nobody knows.";

    constexpr std::array<std::array<std::int32_t, 2>, 4> ModeOfRole{{{10, 0}, {8, 1}, {266, 2}, {264, 3}}};
    for (const auto& [role, mode] : ModeOfRole) {
        host.handle(first).setRole(role);
        host.handle(second).setRole(role);
        EXPECT_EQ(modes(), (Modes{mode, mode})) << role;
    }

    for (const std::int32_t other : {0, 7, 9, 256}) {
        host.handle(first).setRole(other);
        host.handle(second).setRole(other);
        EXPECT_EQ(modes(), (Modes{-1, -1})) << other;
    }

    host.handle(first).setRole(10);
    remove(second);
    EXPECT_EQ(modes(), (Modes{0, -1}));
}

TEST_F(VideoTrackHandlerTest, GivesTheOtherTrackTheOtherPicture)
{
    const auto first = host.addVideoTrack(u"first");
    const auto second = host.addVideoTrack(u"second");
    rebuild();

    handler.setMode(0, Mode::New);
    EXPECT_EQ(roleOf(first), 8);
    EXPECT_EQ(roleOf(second), 10);

    handler.setMode(0, Mode::Old);
    EXPECT_EQ(roleOf(first), 10);
    EXPECT_EQ(roleOf(second), 8) << "The two have changed places.";

    handler.setMode(1, Mode::Old);
    EXPECT_EQ(roleOf(first), 8);
    EXPECT_EQ(roleOf(second), 10);

    handler.setMode(1, Mode::New);
    EXPECT_EQ(roleOf(first), 10);
    EXPECT_EQ(roleOf(second), 8);
    EXPECT_EQ(listener.calls, 4);
}

TEST_F(VideoTrackHandlerTest, TheNewPictureIsOnNoTrackThatNobodyHasNamedForIt)
{
    // A run replaces all that stands on the track of the new picture.
    const auto first = host.addVideoTrack(u"first");
    const auto second = host.addVideoTrack(u"second");
    rebuild();

    handler.setMode(0, Mode::Old);
    EXPECT_EQ(modes(), (Modes{0, -1}));
    handler.setMode(1, Mode::Old);
    EXPECT_EQ(modes(), (Modes{-1, 0})) << "There is one old picture.";
    EXPECT_EQ(roleOf(first), -1);

    for (const std::int32_t other : {0, 7, 256, 8, 264}) {
        host.handle(first).setRole(other);
        host.handle(second).setRole(-1);
        handler.setMode(1, Mode::Old);
        EXPECT_EQ(roleOf(first), other);
    }
    host.handle(first).setRole(266);
    host.handle(second).setRole(264);
    handler.setMode(1, Mode::Old);
    EXPECT_EQ(roleOf(first), 264) << "The video on it stays the user's.";
}

TEST_F(VideoTrackHandlerTest, TurnsATrackOffByItself)
{
    const auto first = host.addVideoTrack(u"first", TrackRole::OldVideo);
    const auto second = host.addVideoTrack(u"second", TrackRole::NewVideo);
    rebuild();

    handler.setMode(0, Mode::OldOff);
    EXPECT_EQ(roleOf(first), 266);
    EXPECT_EQ(roleOf(second), 8);
    EXPECT_EQ(modes(), (Modes{2, 1}));

    handler.setMode(1, Mode::NewOff);
    EXPECT_EQ(roleOf(first), 266);
    EXPECT_EQ(roleOf(second), 264);
    EXPECT_EQ(modes(), (Modes{2, 3}));
    EXPECT_EQ(listener.calls, 2);
}

TEST_F(VideoTrackHandlerTest, ChangesTheOneTrackAloneWhereTheOtherIsDead)
{
    const auto first = host.addVideoTrack(u"first");
    const auto second = host.addVideoTrack(u"second");
    rebuild();
    remove(second);

    handler.setMode(0, Mode::Old);

    EXPECT_EQ(roleOf(first), 10);
    EXPECT_EQ(modes(), (Modes{0, -1}));
    EXPECT_EQ(listener.calls, 1);
}

TEST_F(VideoTrackHandlerTest, RefusesAModeThatATrackCanNotHave)
{
    const auto first = host.addVideoTrack(u"first");
    host.addVideoTrack(u"second");
    rebuild();

    for (const std::int32_t mode : {-1, 4, 8, 10})
        EXPECT_EQ(resultOf([&] { handler.setMode(0, mode); }), Result::InvalidArgument) << mode;

    EXPECT_EQ(roleOf(first), -1);
    EXPECT_EQ(listener.calls, 0);
}

TEST_F(VideoTrackHandlerTest, HasNoModeToSetWithoutATrack)
{
    const auto only = host.addVideoTrack(u"only");
    rebuild();

    EXPECT_EQ(resultOf([&] { handler.setMode(1, Mode::New); }), Result::NotAvailable);
    EXPECT_EQ(roleOf(only), -1);
    EXPECT_EQ(listener.calls, 0);
}

TEST_F(VideoTrackHandlerTest, ReportsARoleThatTheHostDoesNotTake)
{
    const auto project = makeCounted<tests::FakeProject>(0.0);
    const auto node = makeCounted<tests::FakeNode>();
    node->words = {TypeWord::Track, TypeWord::Video};
    node->setterResult = ResultFalse;
    project->children = {node};
    Project adapter(host.context(), project.get());
    handler.rebuild(&adapter);
    listener.calls = 0;

    EXPECT_EQ(resultOf([&] { handler.setMode(0, Mode::Old); }), Result::HostCallFailed);
    EXPECT_EQ(listener.calls, 0);
    handler.rebuild(nullptr);
}

TEST_F(VideoTrackHandlerTest, FindsTheTrackOfAMode)
{
    const auto newTrack = host.addVideoTrack(u"new", TrackRole::NewVideo);
    const auto oldTrack = host.addVideoTrack(u"old", TrackRole::OldVideo);
    rebuild();

    for (const bool lenient : {false, true}) {
        EXPECT_EQ(handler.trackFor(Mode::New, lenient), host.handle(newTrack));
        EXPECT_EQ(handler.trackFor(Mode::Old, lenient), host.handle(oldTrack));
    }
    EXPECT_FALSE(handler.trackFor(Mode::NewOff, false).isAlive());
    EXPECT_FALSE(handler.trackFor(Mode::OldOff, false).isAlive());
    EXPECT_EQ(handler.trackFor(Mode::NewOff, true), host.handle(newTrack));
    EXPECT_EQ(handler.trackFor(Mode::OldOff, true), host.handle(oldTrack));
}

TEST_F(VideoTrackHandlerTest, FindsATrackThatIsTurnedOffOnlyWhereItIsLenient)
{
    const auto oldTrack = host.addVideoTrack(u"old", 266);
    const auto newTrack = host.addVideoTrack(u"new", 264);
    rebuild();

    EXPECT_FALSE(handler.trackFor(Mode::Old, false).isAlive());
    EXPECT_FALSE(handler.trackFor(Mode::New, false).isAlive());
    EXPECT_EQ(handler.trackFor(Mode::Old, true), host.handle(oldTrack));
    EXPECT_EQ(handler.trackFor(Mode::New, true), host.handle(newTrack));
    EXPECT_EQ(handler.trackFor(Mode::OldOff, false), host.handle(oldTrack));
    EXPECT_EQ(handler.trackFor(Mode::NewOff, false), host.handle(newTrack));
}

TEST_F(VideoTrackHandlerTest, OfTwoTracksWithOnePictureTheFirstIsFound)
{
    const auto first = host.addVideoTrack(u"first", TrackRole::OldVideo);
    host.addVideoTrack(u"second", 266);
    rebuild();

    EXPECT_EQ(handler.trackFor(Mode::Old, false), host.handle(first));
    EXPECT_FALSE(handler.trackFor(Mode::OldOff, false).isAlive());
}

TEST_F(VideoTrackHandlerTest, OfTracksWithoutARoleTheFirstShowsTheOldPictureAndNoneIsTheNewOne)
{
    const auto first = host.addVideoTrack(u"first");
    host.addVideoTrack(u"second");
    rebuild();

    for (const bool lenient : {false, true}) {
        EXPECT_EQ(handler.trackFor(Mode::Old, lenient), host.handle(first));
        EXPECT_FALSE(handler.trackFor(Mode::New, lenient).isAlive());
        EXPECT_EQ(resultOf([&] { handler.trackFor(Mode::OldOff, lenient); }), Result::NotAvailable);
        EXPECT_EQ(resultOf([&] { handler.trackFor(Mode::NewOff, lenient); }), Result::NotAvailable);
        EXPECT_EQ(resultOf([&] { handler.trackFor(4, lenient); }), Result::InvalidArgument);
        EXPECT_EQ(resultOf([&] { handler.trackFor(-1, lenient); }), Result::InvalidArgument);
    }
}

TEST_F(VideoTrackHandlerTest, NeverTakesTheTrackOfTheOtherPictureForWantOfARole)
{
    host.addVideoTrack(u"first");
    const auto second = host.addVideoTrack(u"second", TrackRole::OldVideo);
    rebuild();

    EXPECT_FALSE(handler.trackFor(Mode::New, true).isAlive());
    EXPECT_EQ(handler.trackFor(Mode::Old, true), host.handle(second));

    host.handle(second).setRole(266);
    EXPECT_FALSE(handler.trackFor(Mode::New, true).isAlive());
}

TEST_F(VideoTrackHandlerTest, FollowsTracksThatComeAndGo)
{
    host.addVideoTrack(u"first");
    rebuild();
    host.adapter.addListener(&handler);

    const auto second = host.addVideoTrack(u"second");
    EXPECT_EQ(names(), (Names{L"first", L"second"}));
    EXPECT_EQ(listener.calls, 1);

    remove(second);
    EXPECT_EQ(names(), (Names{L"first", L""}));
    EXPECT_EQ(listener.calls, 2);

    host.adapter.removeListener(&handler);
}

TEST_F(VideoTrackHandlerTest, IsNotDisturbedByWhatHappensOnTheTracks)
{
    const auto first = host.addVideoTrack(u"first");
    const auto event = host.addClip(first, u"reel", 1.0, 2.0);
    rebuild();
    host.adapter.addListener(&handler);

    host.addClip(first, u"reel", 3.0, 4.0);
    host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), event.get())); });
    host.handle(first).setName(L"renamed");

    EXPECT_EQ(listener.calls, 0);
    EXPECT_EQ(handler.getName(0), L"renamed");
    host.adapter.removeListener(&handler);
}

TEST_F(VideoTrackHandlerTest, TellsItsListenersOfEveryRebuildUntilTheyLeave)
{
    handler.rebuild(&host.adapter);
    EXPECT_EQ(listener.calls, 1);
    handler.rebuild(nullptr);
    EXPECT_EQ(listener.calls, 2);

    handler.removeListener(&listener);
    handler.rebuild(&host.adapter);
    EXPECT_EQ(listener.calls, 2);
}

} // namespace cadrel::host
