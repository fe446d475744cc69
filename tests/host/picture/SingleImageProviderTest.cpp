// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/picture/SingleImageProvider.h"

#include "gui/picture/VideoProviderBase.h"
#include "tests/host/picture/FakeThumbnails.h"
#include "tests/support/PlainConverter.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <gtest/gtest.h>

#include <chrono>
#include <memory>
#include <stdexcept>
#include <string>
#include <tuple>
#include <vector>

using namespace Velmark;

namespace cadrel::host {

using gui::VideoProviderBase;
using util::Result;

namespace {

/// Writes down what the user is told.
class RecordingConverter : public cadrel::tests::PlainConverter {
public:
    std::wstring translate(const std::wstring& text) const override
    {
        messages.push_back(text);
        return isSilent ? std::wstring() : text;
    }

    mutable std::vector<std::wstring> messages;
    bool isSilent = false;
};

using Messages = std::vector<std::wstring>;

class FakeSource : public VideoSourceBase {
public:
    VideoFrame getFrame(bool lastFrame, double time) override
    {
        questions.emplace_back(lastFrame, time);
        if (fails)
            throw Result::OutOfRange;
        return answer;
    }
    void change() { notify(); }

    std::vector<std::tuple<bool, double>> questions;
    VideoFrame answer;
    bool fails = false;
};

class DeliveryProvider : public VideoProviderBase {
public:
    gui::VideoTrackHandlerBase& getTrackHandler() override { throw std::logic_error("there are no tracks here"); }

protected:
    void requestImage(std::size_t, int, int, bool, double) override {}
};

/// One side of a provider on a host that draws as the case says.
struct Side : tests::ThumbnailHost, VideoProviderBase::Listener {
    explicit Side(std::size_t which = VideoProviderBase::NewSide) : side(which)
    {
        util::StringUtil::setConverter(&converter);
        provider.addListener(this);
        source.answer = {clip, 73};
        images = std::make_unique<SingleImageProvider>(provider, &context, source, side);
    }
    ~Side() override
    {
        images.reset();
        util::StringUtil::setConverter(nullptr);
    }

    void imageChanged(std::size_t changed) override
    {
        ++deliveries;
        lastSide = changed;
    }
    juce::Image image() const { return provider.getImage(side); }
    /// Which frame the picture shows that was delivered last; -1 for a message.
    int frameShown() const
    {
        const juce::Image picture = image();
        return picture.getBounds() == juce::Rectangle<int>(8, 4) ? picture.getPixelAt(0, 0).getRed() : -1;
    }

    void request(double time = 10.0) { images->requestImage(160, 90, false, time); }
    static void waitUntil(const std::function<bool()>& isReached, const std::function<void()>& serve)
    {
        const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(60);
        while (!isReached()) {
            ASSERT_LT(std::chrono::steady_clock::now(), deadline);
            serve();
            std::this_thread::yield();
        }
    }
    void pollUntil(const std::function<bool()>& isReached)
    {
        waitUntil(isReached, [this] { images->poll(); });
    }
    void pollUntilDelivered(int count)
    {
        pollUntil([&] { return deliveries >= count; });
        EXPECT_EQ(deliveries, count);
    }

    juce::ScopedJuceInitialiser_GUI fonts;
    RecordingConverter converter;
    std::size_t side;
    DeliveryProvider provider;
    FakeSource source;
    std::unique_ptr<SingleImageProvider> images;
    int deliveries = 0;
    std::size_t lastSide = 99;
};

bool isBlack(const juce::Image& image)
{
    for (int y = 0; y < image.getHeight(); ++y) {
        for (int x = 0; x < image.getWidth(); ++x) {
            if (image.getPixelAt(x, y) != juce::Colours::black)
                return false;
        }
    }
    return true;
}

} // namespace

TEST(SingleImageProvider, ShowsThatItIsLoadingAndThenThePicture)
{
    Side side;

    side.request();
    EXPECT_EQ(side.deliveries, 0);
    side.images->poll();
    EXPECT_EQ(side.deliveries, 1);
    EXPECT_EQ(side.converter.messages, (Messages{L"Loading"}));
    EXPECT_EQ(side.image().getBounds(), juce::Rectangle<int>(160, 90));

    side.pollUntilDelivered(2);
    EXPECT_EQ(side.frameShown(), 73);
    EXPECT_EQ(side.image().getPixelAt(2, 3), juce::Colour(73, 30, 20));
    EXPECT_EQ(side.converter.messages.size(), 1U);
}

TEST(SingleImageProvider, DeliversToItsOwnSide)
{
    for (const std::size_t which : {VideoProviderBase::OldSide, VideoProviderBase::NewSide}) {
        Side side(which);

        side.request();
        side.images->poll();

        EXPECT_EQ(side.lastSide, which);
        EXPECT_TRUE(side.provider.getImage(which).isValid());
        EXPECT_FALSE(side.provider.getImage(1 - which).isValid());
        side.pollUntilDelivered(2);
        EXPECT_EQ(side.lastSide, which);
    }
}

TEST(SingleImageProvider, AsksTheSourceForTheTimeAndTheHostForTheSize)
{
    Side side;

    side.images->requestImage(160, 90, true, 3612.5);
    side.pollUntilDelivered(2);

    EXPECT_EQ(side.source.questions, (std::vector<std::tuple<bool, double>>{{true, 3612.5}}));
    const auto calls = side.thumbnails.calls();
    ASSERT_EQ(calls.size(), 1U);
    EXPECT_EQ(calls[0].clip, side.clip.get());
    EXPECT_EQ(calls[0].frame, 73U);
    EXPECT_EQ(calls[0].wanted[0], 160);
    EXPECT_EQ(calls[0].wanted[1], 90);
}

TEST(SingleImageProvider, AsksForTheSizeThatIsWantedWhateverSizeCameBefore)
{
    Side side;
    side.request();
    side.pollUntilDelivered(2);

    side.source.change();
    side.pollUntilDelivered(4);

    const auto calls = side.thumbnails.calls();
    ASSERT_EQ(calls.size(), 2U);
    EXPECT_EQ(calls[1].wanted[0], 160);
    EXPECT_EQ(calls[1].wanted[1], 90);
}

TEST(SingleImageProvider, DeliversNothingWhenNothingHappens)
{
    Side side;
    for (int poll = 0; poll < 10; ++poll)
        side.images->poll();
    EXPECT_EQ(side.deliveries, 0);
    EXPECT_TRUE(side.source.questions.empty());

    side.request();
    side.pollUntilDelivered(2);
    for (int poll = 0; poll < 10; ++poll)
        side.images->poll();

    EXPECT_EQ(side.deliveries, 2);
    EXPECT_EQ(side.source.questions.size(), 1U);
}

TEST(SingleImageProvider, SaysOnceThatThereIsNoVideoAtATimeWithoutAClip)
{
    Side side;
    side.source.answer = {};

    side.request();
    for (int poll = 0; poll < 10; ++poll)
        side.images->poll();

    EXPECT_EQ(side.converter.messages, (Messages{L"No video available."}));
    EXPECT_EQ(side.deliveries, 1);
    EXPECT_TRUE(side.thumbnails.calls().empty());
}

TEST(SingleImageProvider, SaysThatThereIsNoVideoWhenTheSourceFails)
{
    Side side;
    side.source.fails = true;

    side.request();
    side.images->poll();

    EXPECT_EQ(side.converter.messages, (Messages{L"No video available."}));
}

TEST(SingleImageProvider, SaysThatThereIsNoVideoWhenTheHostGivesNone)
{
    Side side;
    side.thumbnails.hasImage = false;

    side.request();
    side.pollUntilDelivered(2);

    EXPECT_EQ(side.converter.messages, (Messages{L"Loading", L"No video available."}));
    EXPECT_EQ(side.image().getBounds(), juce::Rectangle<int>(160, 90));
}

TEST(SingleImageProvider, SaysThatThereIsNoVideoOnAHostThatDrawsNone)
{
    Side side;
    tests::AlteredContext emptyHost(nullptr);
    side.images = std::make_unique<SingleImageProvider>(side.provider, &emptyHost, side.source, side.side);

    side.request();
    side.images->poll();
    side.images->poll();

    EXPECT_EQ(side.converter.messages, (Messages{L"No video available."}));
    EXPECT_TRUE(side.source.questions.empty());
}

TEST(SingleImageProvider, ARequestWhileTheThreadIsBusyIsMadeOnALaterIdle)
{
    Side side;
    tests::Gate gate;
    side.thumbnails.whenDrawing = gate.door();
    side.request();
    side.images->poll();
    gate.waitUntilEntered();

    side.source.answer = {side.clip, 74};
    side.request(11.0);
    for (int poll = 0; poll < 3; ++poll)
        side.images->poll();
    EXPECT_EQ(side.thumbnails.calls().size(), 1U);
    EXPECT_EQ(side.converter.messages.back(), L"Loading");
    gate.open();
    side.pollUntil([&] { return side.thumbnails.calls().size() == 2; });
    gate.open();
    side.pollUntil([&] { return side.frameShown() >= 0; });

    EXPECT_EQ(side.frameShown(), 74);
    EXPECT_EQ(side.thumbnails.calls().size(), 2U);
}

TEST(SingleImageProvider, APictureThatComesLateForANewerRequestIsNotShown)
{
    Side side;
    tests::Gate gate;
    side.thumbnails.whenDrawing = gate.door();
    side.request();
    side.images->poll();
    gate.waitUntilEntered();
    std::vector<int> shown;

    side.source.answer = {side.clip, 74};
    side.request(11.0);
    gate.open();
    side.pollUntil([&] {
        shown.push_back(side.frameShown());
        return side.thumbnails.calls().size() == 2;
    });
    gate.open();
    side.pollUntil([&] { return side.frameShown() >= 0; });

    EXPECT_EQ(std::count(shown.begin(), shown.end(), 73), 0);
    EXPECT_EQ(side.frameShown(), 74);
}

TEST(SingleImageProvider, LetsGoOfAPictureThatNobodySeesAndAsksForItAgainLater)
{
    Side side;
    side.request();
    side.images->poll();
    side.source.answer = {};

    // Until it has been taken away, the thread holds its clip.
    side.waitUntil([&] { return side.clip->refCount() == 1; }, [&] { side.images->discard(); });
    EXPECT_EQ(side.deliveries, 1);
    EXPECT_EQ(side.thumbnails.calls().size(), 1U);

    side.source.answer = {side.clip, 73};
    side.pollUntil([&] { return side.frameShown() >= 0; });
    EXPECT_EQ(side.frameShown(), 73);
    EXPECT_EQ(side.thumbnails.calls().size(), 2U);
}

TEST(SingleImageProvider, AsksForNothingAfterwardsWhenItHasLetGoOfNothing)
{
    Side side;
    side.images->discard();
    side.images->poll();
    EXPECT_EQ(side.deliveries, 0);

    side.request();
    side.pollUntilDelivered(2);
    side.images->discard();
    side.images->poll();
    EXPECT_EQ(side.deliveries, 2);
}

TEST(SingleImageProvider, APictureThatComesLateDoesNotReplaceTheMessageThatThereIsNone)
{
    Side side;
    tests::Gate gate;
    side.thumbnails.whenDrawing = gate.door();
    side.request();
    side.images->poll();
    gate.waitUntilEntered();

    side.source.answer = {};
    side.request(11.0);
    side.images->poll();
    EXPECT_EQ(side.converter.messages.back(), L"No video available.");
    gate.open();
    // Until it has been taken away, the thread holds its clip.
    side.pollUntil([&] { return side.clip->refCount() == 1; });
    EXPECT_EQ(side.deliveries, 2);
    EXPECT_EQ(side.frameShown(), -1);
    side.source.answer = {side.clip, 75};
    side.request(12.0);
    side.pollUntil([&] { return side.thumbnails.calls().size() == 2; });
    gate.open();
    side.pollUntil([&] { return side.frameShown() >= 0; });

    EXPECT_EQ(side.frameShown(), 75);
}

TEST(SingleImageProvider, AsksAgainWhenTheSourceHasChanged)
{
    Side side;
    side.request(10.0);
    side.pollUntilDelivered(2);

    side.source.answer = {side.clip, 80};
    side.source.change();
    side.pollUntilDelivered(4);

    EXPECT_EQ(side.frameShown(), 80);
    EXPECT_EQ(side.source.questions, (std::vector<std::tuple<bool, double>>{{false, 10.0}, {false, 10.0}}));
}

TEST(SingleImageProvider, DoesNotAskBeforeTheFirstRequest)
{
    Side side;

    side.source.change();
    side.images->poll();

    EXPECT_EQ(side.deliveries, 0);
    EXPECT_TRUE(side.source.questions.empty());
}

TEST(SingleImageProvider, DrawsItsMessagesInWhiteOnBlackInTheUsersLanguage)
{
    Side side;
    side.source.answer = {};
    side.request();
    side.images->poll();

    EXPECT_EQ(side.image().getFormat(), juce::Image::ARGB);
    EXPECT_FALSE(isBlack(side.image()));
    const juce::Image ground = side.image().getClippedImage({0, 0, 160, 20});
    EXPECT_TRUE(isBlack(ground));

    side.converter.isSilent = true;
    side.request();
    side.images->poll();

    EXPECT_TRUE(isBlack(side.image()));
}

TEST(SingleImageProvider, AMessageLeavesThePicturesAloneThatWereDeliveredBefore)
{
    Side side;
    side.source.answer = {};
    side.request();
    side.images->poll();
    const juce::Image former = side.image();
    const juce::Image copy = former.createCopy();

    side.converter.isSilent = true;
    side.request();
    side.images->poll();

    EXPECT_NE(side.image(), former);
    EXPECT_EQ(former.getPixelAt(80, 45), copy.getPixelAt(80, 45));
    EXPECT_FALSE(isBlack(former));
}

TEST(SingleImageProvider, HearsNothingMoreOfASourceOnceItIsGone)
{
    Side side;
    side.request();
    side.images.reset();

    side.source.change();

    EXPECT_EQ(side.deliveries, 0);
}

TEST(SingleImageProvider, EndsInTheMiddleOfAPicture)
{
    Side side;
    std::atomic<bool> hasBegun = false;
    side.thumbnails.whenDrawing = [&] {
        hasBegun = true;
        while (!juce::Thread::currentThreadShouldExit())
            std::this_thread::yield();
    };
    side.request();
    side.images->poll();
    while (!hasBegun)
        std::this_thread::yield();

    side.images.reset();

    EXPECT_EQ(side.thumbnails.imagesAlive, 0);
    EXPECT_EQ(side.thumbnails.factoriesAlive, 0);
    EXPECT_EQ(side.deliveries, 1);
}

TEST(SingleImageProvider, LeavesAThreadAloneThatTheHostDoesNotGiveBack)
{
    juce::Thread* thread = nullptr;
    Side side;
    tests::Gate gate;
    side.thumbnails.whenDrawing = [&thread, door = gate.door()] {
        thread = juce::Thread::getCurrentThread();
        door();
    };
    side.request();
    side.images->poll();
    gate.waitUntilEntered();

    side.images.reset();

    // Nobody owns it any more but this case.
    const std::unique_ptr<juce::Thread> leftAlone(thread);
    ASSERT_NE(leftAlone, nullptr);
    EXPECT_TRUE(leftAlone->isThreadRunning());
    EXPECT_EQ(side.thumbnails.factoriesAlive, 1);
    gate.open();
    EXPECT_TRUE(leftAlone->waitForThreadToExit(-1));
}

} // namespace cadrel::host
