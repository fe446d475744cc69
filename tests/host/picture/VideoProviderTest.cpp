// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/picture/VideoProvider.h"

#include "host/border/HostFailure.h"
#include "standin/services/ThumbnailFactory.h"
#include "tests/support/host/VideoHost.h"

#include <gtest/gtest.h>

#include <array>
#include <chrono>
#include <cstdint>
#include <functional>
#include <string>
#include <thread>
#include <vector>

using namespace Velmark;

namespace cadrel::host {

using core::Timecode;
using core::VideoList;
using gui::VideoProviderBase;
using tests::VideoHost;
using util::Result;
using Mode = gui::VideoTrackHandlerBase::Mode;

namespace {

constexpr int Width = 64;
constexpr int Height = 36;

/// The picture that the host draws of a frame.
juce::Image pictureOf(IMediaClip& clip, std::uint32_t frame)
{
    standin::ThumbnailFactory factory;
    const int32 size[2] = {Width, Height};
    const int32 whole[4] = {0, 0, Width, Height};
    std::vector<std::uint8_t> pixels(4 * Width * Height);
    factory.setSource(&clip, size);
    const auto drawn = Counted<IThumbnailImage>::adopt(factory.getImage(frame));
    drawn->read(pixels.data(), 4 * Width, whole, 0);

    juce::Image image(juce::Image::ARGB, Width, Height, true);
    for (int y = 0; y < Height; ++y) {
        for (int x = 0; x < Width; ++x) {
            const std::uint8_t* const pixel = &pixels[static_cast<std::size_t>(4 * (y * Width + x))];
            image.setPixelAt(x, y, juce::Colour(pixel[2], pixel[1], pixel[0], pixel[3]));
        }
    }
    return image;
}

bool isSame(const juce::Image& a, const juce::Image& b)
{
    if (a.getBounds() != b.getBounds())
        return false;
    for (int y = 0; y < a.getHeight(); ++y) {
        for (int x = 0; x < a.getWidth(); ++x) {
            if (a.getPixelAt(x, y) != b.getPixelAt(x, y))
                return false;
        }
    }
    return true;
}

/// A project whose old picture stands on a track and whose new one is in the list, both from ten seconds after the beginning
/// of the project's clock on. With a clock that begins at 0 and with one that begins at 01:00:00:00.
class VideoProviderTest : public testing::TestWithParam<double>, public VideoProviderBase::Listener {
protected:
    VideoProviderTest()
    {
        host.addVideoEvent(oldTrack, oldReel, 10.0, 14.0);
        host.adapter.model().videoList().add(VideoList::Entry("/picture/reel3_v12.mov", at(10.0), Timecode(0, 0, 4, 0)),
                                             false);
        provider.addListener(this);
    }
    ~VideoProviderTest() override { provider.setProject(nullptr); }

    void imageChanged(std::size_t side) override { ++deliveries.at(side); }

    Timecode at(double hostTime) const { return Timecode(host.clock(hostTime)); }
    void pollUntil(const std::function<bool()>& isReached)
    {
        const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(60);
        while (!isReached()) {
            ASSERT_LT(std::chrono::steady_clock::now(), deadline);
            provider.poll();
            std::this_thread::yield();
        }
    }
    /// Waits for the picture of a side; the message that it is loading comes before.
    void expectPicture(std::size_t side, IMediaClip& clip, std::uint32_t frame)
    {
        const juce::Image expected = pictureOf(clip, frame);
        pollUntil([&] { return isSame(provider.getImage(side), expected); });
    }
    std::size_t newEvents() { return standin::tests::childrenOf(*newTrack).size(); }
    void apply(bool write, double offset)
    {
        host.edit(u"Apply", [&] { provider.apply(write, *host.transaction(), offset); });
    }

    juce::ScopedJuceInitialiser_GUI fonts;
    VideoHost host{GetParam()};
    const VideoHost::Node oldTrack = host.addVideoTrack(u"old", TrackRole::OldVideo);
    const VideoHost::Node newTrack = host.addVideoTrack(u"new", TrackRole::NewVideo);
    standin::MediaClip& oldReel = host.addVideo(u"/picture/reel3_v07.mov", 4.0);
    standin::MediaClip& newReel = host.addVideo(u"/picture/reel3_v12.mov", 4.0);
    VideoProvider provider{host.context()};
    std::array<int, 2> deliveries = {};
};

INSTANTIATE_TEST_SUITE_P(Origins, VideoProviderTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(VideoProviderTest, ShowsTheOldPictureFromTheTrackAndTheNewOneFromTheList)
{
    provider.setProject(&host.adapter);
    provider.setImageSize(Width, Height);

    provider.setTime(VideoProviderBase::OldSide, at(11.0));
    provider.setTime(VideoProviderBase::NewSide, at(12.0));

    expectPicture(VideoProviderBase::OldSide, oldReel, 25);
    expectPicture(VideoProviderBase::NewSide, newReel, 50);
}

TEST_P(VideoProviderTest, ShowsThatThereIsNoVideoWithoutAProject)
{
    provider.setImageSize(Width, Height);

    provider.poll();
    provider.poll();

    EXPECT_EQ(deliveries, (std::array{1, 1})) << "the message, once on each side";
}

TEST_P(VideoProviderTest, DeliversNothingBeforeItIsPolled)
{
    provider.setProject(&host.adapter);
    provider.setImageSize(Width, Height);
    provider.setTime(VideoProviderBase::OldSide, at(11.0));

    EXPECT_EQ(deliveries, (std::array{0, 0}));
}

TEST_P(VideoProviderTest, DrawsNothingWhileNobodyLooksAtIt)
{
    provider.setProject(&host.adapter);
    provider.setImageSize(Width, Height);
    const juce::Image empty = provider.getImage(VideoProviderBase::OldSide);
    provider.removeListener(this);
    provider.setTime(VideoProviderBase::OldSide, at(11.0));
    provider.poll();
    provider.setProject(nullptr);
    provider.setProject(&host.adapter);
    provider.poll();
    EXPECT_EQ(provider.getImage(VideoProviderBase::OldSide), empty);

    provider.addListener(this);
    expectPicture(VideoProviderBase::OldSide, oldReel, 25);
}

TEST_P(VideoProviderTest, AsksAgainWhenThePictureOfItsProjectChanges)
{
    provider.setProject(&host.adapter);
    provider.setImageSize(Width, Height);
    provider.setTime(VideoProviderBase::OldSide, at(21.0));
    provider.setTime(VideoProviderBase::NewSide, at(21.0));
    pollUntil([&] { return deliveries == std::array{1, 1}; });

    host.addVideoEvent(oldTrack, oldReel, 20.0, 24.0);
    host.adapter.model().videoList().setStart("/picture/reel3_v12.mov", at(20.0));

    expectPicture(VideoProviderBase::OldSide, oldReel, 25);
    expectPicture(VideoProviderBase::NewSide, newReel, 25);
}

TEST_P(VideoProviderTest, AsksAgainWhenATrackGetsTheOldPicture)
{
    host.addVideoEvent(newTrack, newReel, 10.0, 14.0);
    provider.setProject(&host.adapter);
    provider.setImageSize(Width, Height);
    provider.setTime(VideoProviderBase::OldSide, at(11.0));
    expectPicture(VideoProviderBase::OldSide, oldReel, 25);

    provider.getTrackHandler().setMode(1, Mode::Old);

    expectPicture(VideoProviderBase::OldSide, newReel, 25);
}

TEST_P(VideoProviderTest, ShowsThePicturesOfTheProjectThatItIsGiven)
{
    VideoHost other{GetParam()};
    const auto otherTrack = other.addVideoTrack(u"old", TrackRole::OldVideo);
    standin::MediaClip& otherReel = other.addVideo(u"/picture/reel9.mov", 4.0);
    other.addVideoEvent(otherTrack, otherReel, 10.0, 14.0);
    provider.setProject(&host.adapter);
    provider.setImageSize(Width, Height);
    provider.setTime(VideoProviderBase::OldSide, at(11.0));
    expectPicture(VideoProviderBase::OldSide, oldReel, 25);

    provider.setProject(&other.adapter);
    EXPECT_EQ(provider.getTrackHandler().getName(0), L"old");
    EXPECT_FALSE(provider.getTrackHandler().isAvailable(1));
    expectPicture(VideoProviderBase::OldSide, otherReel, 25);

    provider.setProject(nullptr);
    EXPECT_FALSE(provider.getTrackHandler().isAvailable(0));
}

TEST_P(VideoProviderTest, HearsNothingMoreOfTheProjectThatIsTakenAway)
{
    provider.setProject(&host.adapter);
    provider.setProject(nullptr);
    provider.setImageSize(Width, Height);
    provider.poll();
    deliveries = {};

    host.addVideoEvent(oldTrack, oldReel, 20.0, 24.0);
    host.adapter.model().videoList().clear();
    host.addVideoTrack(u"third");
    provider.poll();

    EXPECT_EQ(deliveries, (std::array{0, 0}));
    EXPECT_FALSE(provider.getTrackHandler().isAvailable(0));
}

TEST_P(VideoProviderTest, LeavesItsProjectWhenItGoes)
{
    {
        VideoProvider another(host.context());
        another.setProject(&host.adapter);
    }

    // Nobody is there to be told; under the sanitizer a call would show.
    host.addVideoTrack(u"third");
    host.adapter.model().videoList().clear();

    EXPECT_TRUE(host.adapter.model().videoList().isEmpty());
}

TEST_P(VideoProviderTest, WritesTheNewVideosOnTheirTrack)
{
    provider.setProject(&host.adapter);

    apply(true, 86400.0);

    ASSERT_EQ(newEvents(), 1U);
    const auto event = standin::tests::childrenOf(*newTrack).front();
    EXPECT_EQ(event->getStart(nullptr), 86410.0);
    EXPECT_EQ(event->getEnd(nullptr), 86414.0);
    EXPECT_EQ(query<IClipEvent>(event)->getClip(), static_cast<IMediaClip*>(&newReel));
}

TEST_P(VideoProviderTest, WritesOnATrackThatWasMadeInTheSameEdit)
{
    host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), newTrack.get())); });
    host.addVideoTrack(u"rushes");
    provider.setProject(&host.adapter);
    VideoHost::Node made;

    host.edit(u"Apply", [&] {
        made = host.addVideoTrack(u"New Video", TrackRole::NewVideo);
        provider.apply(true, *host.transaction(), 0.0);
    });

    EXPECT_EQ(standin::tests::childrenOf(*made).size(), 1U);
}

TEST_P(VideoProviderTest, LooksForTheTracksAloneWhereItIsNotToWrite)
{
    provider.setProject(&host.adapter);
    const std::string before = host.dump();

    apply(false, 86400.0);

    EXPECT_EQ(host.dump(), before);
}

TEST_P(VideoProviderTest, WritesNothingWithoutAProject)
{
    const std::string before = host.dump();

    apply(true, 0.0);

    EXPECT_EQ(host.dump(), before);
}

TEST_P(VideoProviderTest, ReportsWhatTheHostRefuses)
{
    provider.setProject(&host.adapter);

    // No transaction is open.
    EXPECT_EQ(resultOf([&] { provider.apply(true, *host.transaction(), 0.0); }), Result::HostCallFailed);
}

} // namespace cadrel::host
