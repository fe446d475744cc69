// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/picture/VideoProviderBase.h"

#include "core/time/Timecode.h"
#include "tests/support/core/TestProject.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <functional>
#include <stdexcept>
#include <tuple>
#include <vector>

namespace cadrel::gui {

using core::Timecode;
using util::Result;

namespace {

constexpr std::size_t NoSide = 2;

/// Writes down what it is asked for.
class RecordingProvider : public VideoProviderBase {
public:
    using Request = std::tuple<std::size_t, int, int, bool, double>; ///< side, width, height, last frame, seconds

    VideoTrackHandlerBase& getTrackHandler() override { throw std::logic_error("there are no tracks here"); }

    std::vector<Request> requests;
    std::size_t refusedSide = NoSide;

protected:
    void requestImage(std::size_t side, int width, int height, bool lastFrame, double time) override
    {
        if (side == refusedSide)
            throw Result::HostCallFailed;
        requests.emplace_back(side, width, height, lastFrame, time);
    }
};

using Requests = std::vector<RecordingProvider::Request>;

struct RecordingListener : VideoProviderBase::Listener {
    void imageChanged(std::size_t side) override
    {
        sides.push_back(side);
        if (whenCalled)
            whenCalled();
    }

    std::vector<std::size_t> sides;
    std::function<void()> whenCalled;
};

Result::Type resultOf(const std::function<void()>& operation)
{
    try {
        operation();
    } catch (Result::Type result) {
        return result;
    }
    return Result::Ok;
}

} // namespace

TEST(VideoProviderBase, AsksForBothPicturesAtTheStartWhenItIsGivenASize)
{
    RecordingProvider provider;

    provider.setImageSize(284, 71);

    EXPECT_EQ(provider.requests, (Requests{{0, 284, 71, false, 0.0}, {1, 284, 71, false, 0.0}}));
}

TEST(VideoProviderBase, AsksForTheOtherPictureOfANewSizeAlsoWhenOneIsRefused)
{
    RecordingProvider provider;
    provider.refusedSide = VideoProviderBase::OldSide;
    EXPECT_EQ(resultOf([&] { provider.setImageSize(284, 71); }), Result::HostCallFailed);
    EXPECT_EQ(provider.requests, (Requests{{1, 284, 71, false, 0.0}}));

    provider.refusedSide = VideoProviderBase::NewSide;
    provider.requests.clear();
    EXPECT_EQ(resultOf([&] { provider.setImageSize(568, 142); }), Result::HostCallFailed);
    EXPECT_EQ(provider.requests, (Requests{{0, 568, 142, false, 0.0}}));
}

TEST(VideoProviderBase, HasAnEmptyPictureOfTheSizeUntilOneComes)
{
    RecordingProvider provider;
    EXPECT_FALSE(provider.getImage(VideoProviderBase::OldSide).isValid());

    provider.setImageSize(284, 71);

    for (const std::size_t side : {VideoProviderBase::OldSide, VideoProviderBase::NewSide}) {
        EXPECT_EQ(provider.getImage(side).getFormat(), juce::Image::ARGB);
        EXPECT_EQ(provider.getImage(side).getBounds(), juce::Rectangle<int>(284, 71));
        EXPECT_TRUE(provider.getImage(side).getPixelAt(283, 70).isTransparent());
    }
}

TEST(VideoProviderBase, AsksForOnePictureAtATimeOfTheProjectsRate)
{
    tests::TestProject project(core::Framerate(24, 0));
    RecordingProvider provider;
    provider.setImageSize(100, 50);
    provider.requests.clear();

    provider.setTime(VideoProviderBase::NewSide, Timecode(1, 0, 2, 12));

    EXPECT_EQ(provider.requests, (Requests{{1, 100, 50, false, 3602.5}}));
}

TEST(VideoProviderBase, KeepsTheTimeOfEachSide)
{
    tests::TestProject project;
    RecordingProvider provider;
    provider.setImageSize(100, 50);
    provider.setTime(VideoProviderBase::OldSide, Timecode(0, 0, 7, 0));
    provider.setTime(VideoProviderBase::NewSide, Timecode(0, 0, 9, 5));
    provider.requests.clear();

    provider.setImageSize(100, 51);

    EXPECT_EQ(provider.requests, (Requests{{0, 100, 51, false, 7.0}, {1, 100, 51, false, 9.2}}));
}

TEST(VideoProviderBase, SaysWithEachRequestWhetherItIsForTheLastFrame)
{
    tests::TestProject project;
    RecordingProvider provider;
    provider.setImageSize(100, 50);
    provider.requests.clear();

    provider.setLastFrame(true);
    EXPECT_TRUE(provider.requests.empty());
    provider.setTime(VideoProviderBase::OldSide, Timecode(0, 0, 7, 0));
    provider.setLastFrame(false);
    provider.setTime(VideoProviderBase::OldSide, Timecode(0, 0, 7, 0));

    EXPECT_EQ(provider.requests, (Requests{{0, 100, 50, true, 7.0}, {0, 100, 50, false, 7.0}}));
}

TEST(VideoProviderBase, DoesNothingForTheSizeThatItHas)
{
    tests::TestProject project;
    RecordingProvider provider;
    provider.setImageSize(100, 50);
    const juce::Image picture(juce::Image::ARGB, 89, 50, true);
    provider.deliverImage(picture, VideoProviderBase::NewSide);
    provider.requests.clear();

    provider.setImageSize(100, 50);

    EXPECT_TRUE(provider.requests.empty());
    EXPECT_EQ(provider.getImage(VideoProviderBase::NewSide), picture);
}

TEST(VideoProviderBase, AsksForTheSizeThatWasSetWhateverSizeHasCome)
{
    tests::TestProject project;
    RecordingProvider provider;
    provider.setImageSize(100, 50);
    provider.deliverImage(juce::Image(juce::Image::ARGB, 89, 50, true), VideoProviderBase::NewSide);
    provider.requests.clear();

    provider.setTime(VideoProviderBase::NewSide, Timecode(0, 0, 1, 0));

    EXPECT_EQ(provider.requests, (Requests{{1, 100, 50, false, 1.0}}));
}

TEST(VideoProviderBase, RefusesASizeBelowOne)
{
    RecordingProvider provider;

    EXPECT_EQ(resultOf([&] { provider.setImageSize(0, 50); }), Result::OutOfRange);
    EXPECT_EQ(resultOf([&] { provider.setImageSize(100, 0); }), Result::OutOfRange);
    EXPECT_EQ(resultOf([&] { provider.setImageSize(-1, -1); }), Result::OutOfRange);
    EXPECT_EQ(resultOf([&] { provider.setImageSize(1, 1); }), Result::Ok);
    EXPECT_EQ(provider.getImage(VideoProviderBase::OldSide).getBounds(), juce::Rectangle<int>(1, 1));
}

TEST(VideoProviderBase, CanNotAskForAPictureBeforeItHasASize)
{
    tests::TestProject project;
    RecordingProvider provider;

    const auto setTime = [&] { provider.setTime(VideoProviderBase::OldSide, Timecode(0, 0, 7, 0)); };
    EXPECT_EQ(resultOf(setTime), Result::NotAvailable);
    EXPECT_TRUE(provider.requests.empty());

    // The time is kept all the same.
    provider.setImageSize(100, 50);
    EXPECT_EQ(provider.requests, (Requests{{0, 100, 50, false, 7.0}, {1, 100, 50, false, 0.0}}));
}

TEST(VideoProviderBase, DoesNotKnowATimeWithoutARate)
{
    RecordingProvider provider;
    provider.setImageSize(100, 50);
    provider.requests.clear();

    const auto setTime = [&] { provider.setTime(VideoProviderBase::OldSide, Timecode(0, 0, 7, 0)); };
    EXPECT_EQ(resultOf(setTime), Result::NotAvailable);
    EXPECT_TRUE(provider.requests.empty());
}

TEST(VideoProviderBase, ShowsItsListenersTheSideOfWhichAPictureHasCome)
{
    RecordingProvider provider;
    RecordingListener listener;
    provider.addListener(&listener);
    provider.addListener(&listener);
    const juce::Image picture(juce::Image::RGB, 16, 9, true);

    provider.deliverImage(picture, VideoProviderBase::NewSide);
    EXPECT_EQ(listener.sides, (std::vector<std::size_t>{1}));
    EXPECT_EQ(provider.getImage(VideoProviderBase::NewSide), picture);
    EXPECT_FALSE(provider.getImage(VideoProviderBase::OldSide).isValid());

    provider.notifyImageChanged(VideoProviderBase::OldSide);
    EXPECT_EQ(listener.sides, (std::vector<std::size_t>{1, 0}));

    provider.removeListener(&listener);
    provider.notifyImageChanged(VideoProviderBase::OldSide);
    EXPECT_EQ(listener.sides.size(), 2U);
}

TEST(VideoProviderBase, AListenerMayLeaveWhileItIsTold)
{
    RecordingProvider provider;
    RecordingListener listeners[2];
    for (RecordingListener& listener : listeners) {
        listener.whenCalled = [&] { provider.removeListener(&listener); };
        provider.addListener(&listener);
    }

    provider.notifyImageChanged(VideoProviderBase::OldSide);
    provider.notifyImageChanged(VideoProviderBase::OldSide);

    EXPECT_EQ(listeners[0].sides.size(), 1U);
    EXPECT_EQ(listeners[1].sides.size(), 1U);
}

TEST(VideoProviderBase, HasTwoSides)
{
    tests::TestProject project;
    RecordingProvider provider;
    provider.setImageSize(100, 50);
    provider.requests.clear();
    RecordingListener listener;
    provider.addListener(&listener);

    EXPECT_EQ(resultOf([&] { provider.setTime(NoSide, Timecode(0, 0, 7, 0)); }), Result::InvalidArgument);
    EXPECT_EQ(resultOf([&] { provider.getImage(NoSide); }), Result::InvalidArgument);
    EXPECT_EQ(resultOf([&] { provider.deliverImage({}, NoSide); }), Result::InvalidArgument);
    EXPECT_TRUE(provider.requests.empty());
    EXPECT_TRUE(listener.sides.empty());
}

} // namespace cadrel::gui
