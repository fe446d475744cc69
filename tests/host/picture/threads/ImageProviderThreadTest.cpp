// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/picture/ImageProviderThread.h"

#include "tests/host/picture/FakeThumbnails.h"

#include <gtest/gtest.h>

#include <chrono>
#include <memory>
#include <optional>

using namespace Velmark;

namespace cadrel::host {

namespace {

constexpr juce::Point<int> Wanted{16, 9};

/// What has been fetched; without an image when the host gave none.
struct Fetched {
    bool success = false;
    juce::Image image;
};

/// The thread under test, and a host.
struct Drawing : tests::ThumbnailHost {
    Drawing() : thread(std::make_unique<ImageProviderThread>(&context)) {}
    ~Drawing()
    {
        if (thread)
            stop();
    }

    bool request(uint32 frame, juce::Point<int> size = Wanted) { return thread->request(size, {clip, frame}); }
    std::optional<Fetched> fetch()
    {
        Fetched fetched;
        if (!thread->fetch(fetched.image, fetched.success))
            return std::nullopt;
        return fetched;
    }
    /// Waits for what has been asked for.
    Fetched fetchInTime()
    {
        const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(60);
        while (std::chrono::steady_clock::now() < deadline) {
            if (const auto fetched = fetch())
                return *fetched;
            std::this_thread::yield();
        }
        ADD_FAILURE() << "the picture hasn't come";
        return {};
    }
    Fetched draw(uint32 frame)
    {
        EXPECT_TRUE(request(frame));
        return fetchInTime();
    }
    void stop()
    {
        EXPECT_TRUE(thread->stop());
        thread.reset();
    }

    std::unique_ptr<ImageProviderThread> thread;
};

} // namespace

TEST(ImageProviderThread, HasTheNameByWhichADebuggerShowsIt)
{
    Drawing drawing;

    EXPECT_EQ(drawing.thread->getThreadName(), juce::String("ThumbnailProvider"));
}

TEST(ImageProviderThread, StartsAtItsFirstRequest)
{
    Drawing drawing;
    EXPECT_TRUE(drawing.thread->canDraw());
    EXPECT_FALSE(drawing.fetch());
    EXPECT_FALSE(drawing.thread->isThreadRunning());

    EXPECT_TRUE(drawing.request(1));

    EXPECT_TRUE(drawing.thread->isThreadRunning());
    EXPECT_TRUE(drawing.fetchInTime().success);
    EXPECT_TRUE(drawing.draw(2).success);
}

TEST(ImageProviderThread, CanBeStoppedThoughItNeverStarted)
{
    Drawing drawing;

    drawing.stop();

    EXPECT_EQ(drawing.thumbnails.factoriesAlive, 0);
}

TEST(ImageProviderThread, LetsTheHostDrawTheFrameOfTheClipAtTheSize)
{
    Drawing drawing;

    drawing.draw(73);

    const auto calls = drawing.thumbnails.calls();
    ASSERT_EQ(calls.size(), 1U);
    EXPECT_EQ(calls[0].clip, drawing.clip.get());
    EXPECT_EQ(calls[0].frame, 73U);
    EXPECT_EQ(calls[0].wanted[0], 16);
    EXPECT_EQ(calls[0].wanted[1], 9);
}

TEST(ImageProviderThread, GivesThePictureInTheSizeAndTheColoursThatItCameIn)
{
    Drawing drawing;

    const Fetched fetched = drawing.draw(73);

    ASSERT_TRUE(fetched.success);
    EXPECT_EQ(fetched.image.getFormat(), juce::Image::ARGB);
    EXPECT_EQ(fetched.image.getBounds(), juce::Rectangle<int>(8, 4));
    EXPECT_EQ(fetched.image.getPixelAt(0, 0), juce::Colour(73, 0, 0));
    EXPECT_EQ(fetched.image.getPixelAt(7, 0), juce::Colour(73, 0, 70));
    EXPECT_EQ(fetched.image.getPixelAt(2, 3), juce::Colour(73, 30, 20));
}

TEST(ImageProviderThread, GivesSmallAndLargePicturesOneAfterTheOther)
{
    Drawing drawing;
    const int32 sizes[][2] = {{20, 10}, {3, 2}, {1, 1}, {25, 12}, {25, 1}};

    for (const auto& size : sizes) {
        std::copy_n(size, 2, drawing.thumbnails.size);
        const Fetched fetched = drawing.draw(5);

        EXPECT_EQ(fetched.image.getBounds(), juce::Rectangle<int>(size[0], size[1]));
        EXPECT_EQ(fetched.image.getPixelAt(size[0] - 1, size[1] - 1),
                  juce::Colour(5, static_cast<uint8>(10 * (size[1] - 1)), static_cast<uint8>(10 * (size[0] - 1))));
    }
}

TEST(ImageProviderThread, HasNothingToFetchUnlessItWasAsked)
{
    Drawing drawing;

    EXPECT_FALSE(drawing.fetch());

    drawing.draw(1);

    EXPECT_FALSE(drawing.fetch());
}

TEST(ImageProviderThread, TakesNoRequestUntilThePictureBeforeItIsFetched)
{
    Drawing drawing;
    tests::Gate gate;
    drawing.thumbnails.whenDrawing = gate.door();

    EXPECT_TRUE(drawing.request(1));
    EXPECT_FALSE(drawing.request(2));
    gate.waitUntilEntered();
    EXPECT_FALSE(drawing.request(3));
    EXPECT_FALSE(drawing.fetch());
    gate.open();

    EXPECT_EQ(drawing.fetchInTime().image.getPixelAt(0, 0).getRed(), 1);
    EXPECT_TRUE(drawing.request(4));
    gate.open();
    EXPECT_EQ(drawing.fetchInTime().image.getPixelAt(0, 0).getRed(), 4);
    EXPECT_EQ(drawing.thumbnails.calls().size(), 2U);
}

TEST(ImageProviderThread, TakesNoRequestWhileAFinishedPictureWaits)
{
    Drawing drawing;
    ASSERT_TRUE(drawing.request(1));
    // The picture is let go behind the last that the thread does with it.
    while (drawing.thumbnails.calls().empty() || drawing.thumbnails.imagesAlive > 0)
        std::this_thread::yield();

    EXPECT_FALSE(drawing.request(2));

    EXPECT_EQ(drawing.fetchInTime().image.getPixelAt(0, 0).getRed(), 1);
}

TEST(ImageProviderThread, KeepsTheClipForAsLongAsItNeedsIt)
{
    Drawing drawing;
    tests::Gate gate;
    drawing.thumbnails.whenDrawing = gate.door();
    const int32 before = drawing.clip->refCount();

    ASSERT_TRUE(drawing.request(1));
    gate.waitUntilEntered();
    EXPECT_EQ(drawing.clip->refCount(), before + 1);
    gate.open();
    drawing.fetchInTime();

    EXPECT_EQ(drawing.clip->refCount(), before);
}

TEST(ImageProviderThread, TellsOfEveryFailureOfTheHostAndGoesOn)
{
    Drawing drawing;
    tests::Thumbnails& host = drawing.thumbnails;
    struct Failure {
        const char* name;
        std::function<void()> begin;
        std::function<void()> end;
    };
    const Failure failures[] = {
        {"the source is refused", [&] { host.setSourceAnswer = ResultFalse; },
         [&] { host.setSourceAnswer = ResultOk; }},
        {"there is no picture", [&] { host.hasImage = false; }, [&] { host.hasImage = true; }},
        {"the size is refused", [&] { host.getSizeAnswer = ResultFalse; }, [&] { host.getSizeAnswer = ResultOk; }},
        {"the width is negative", [&] { host.size[0] = -8; }, [&] { host.size[0] = 8; }},
        {"the height is negative", [&] { host.size[1] = -4; }, [&] { host.size[1] = 4; }},
        {"the width is nothing", [&] { host.size[0] = 0; }, [&] { host.size[0] = 8; }},
        {"the height is nothing", [&] { host.size[1] = 0; }, [&] { host.size[1] = 4; }},
        {"the pixels are refused", [&] { host.readAnswer = ResultFalse; }, [&] { host.readAnswer = ResultOk; }},
    };

    for (const Failure& failure : failures) {
        failure.begin();
        const Fetched failed = drawing.draw(1);
        failure.end();

        EXPECT_FALSE(failed.success) << failure.name;
        EXPECT_FALSE(failed.image.isValid()) << failure.name;
        EXPECT_TRUE(drawing.draw(2).success) << failure.name;
        EXPECT_EQ(host.imagesAlive, 0) << failure.name;
    }
}

TEST(ImageProviderThread, GivesBackWhatTheObjectFactoryGave)
{
    Drawing drawing;
    drawing.draw(1);
    EXPECT_EQ(drawing.thumbnails.factoriesAlive, 1);

    drawing.stop();

    EXPECT_EQ(drawing.objectFactory->givenBack, 1);
    EXPECT_EQ(drawing.thumbnails.factoriesAlive, 0);
}

TEST(ImageProviderThread, AsksTheHostForItsThumbnailFactory)
{
    tests::ThumbnailHost host;
    std::string className;
    std::string typeName;
    host.objectFactory->create = [&](const char* askedClass, const char* askedType) -> FObject* {
        className = askedClass;
        typeName = askedType;
        return nullptr;
    };

    ImageProviderThread thread(&host.context);

    EXPECT_EQ(className, "VideoThumbnailFactory");
    EXPECT_EQ(typeName, "Video");
    EXPECT_TRUE(thread.stop());
}

TEST(ImageProviderThread, CanNotDrawWithoutAFactory)
{
    const auto canNotDraw = [](IHostContext* context) {
        ImageProviderThread thread(context);
        EXPECT_FALSE(thread.canDraw());
        EXPECT_TRUE(thread.stop());
    };

    tests::AlteredContext emptyHost(nullptr);
    canNotDraw(&emptyHost);

    tests::ThumbnailHost withoutThumbnails;
    withoutThumbnails.objectFactory->create = [](const char*, const char*) { return nullptr; };
    canNotDraw(&withoutThumbnails.context);
    EXPECT_EQ(withoutThumbnails.objectFactory->givenBack, 0);

    tests::ThumbnailHost withSomethingElse;
    withSomethingElse.objectFactory->create = [](const char*, const char*) -> FObject* { return new tests::FakeClip; };
    canNotDraw(&withSomethingElse.context);
    EXPECT_EQ(withSomethingElse.objectFactory->givenBack, 1);
}

TEST(ImageProviderThread, ServesWhatItCanOfRequestsThatComeFasterThanItDraws)
{
    Drawing drawing;
    drawing.thumbnails.size[0] = 64;
    drawing.thumbnails.size[1] = 36;
    uint32 accepted = 0;
    int refused = 0;
    int served = 0;

    for (uint32 frame = 0; served < 500; frame = (frame + 1) % 256) {
        if (const auto fetched = drawing.fetch()) {
            ASSERT_TRUE(fetched->success);
            ASSERT_EQ(fetched->image.getPixelAt(0, 0).getRed(), accepted);
            ASSERT_EQ(fetched->image.getPixelAt(25, 35).getRed(), accepted);
            ++served;
        }
        if (drawing.request(frame))
            accepted = frame;
        else
            ++refused;
    }

    EXPECT_GT(refused, 0);
}

TEST(ImageProviderThread, ServesRequestsThatComeOnlyWhileItDraws)
{
    Drawing drawing;
    tests::Gate gate;
    drawing.thumbnails.whenDrawing = gate.door();

    for (uint32 frame = 0; frame < 200; ++frame) {
        ASSERT_TRUE(drawing.request(frame));
        gate.waitUntilEntered();
        for (int again = 0; again < 5; ++again)
            ASSERT_FALSE(drawing.request(frame + 1));
        gate.open();
        ASSERT_EQ(drawing.fetchInTime().image.getPixelAt(0, 0).getRed(), frame);
    }
}

TEST(ImageProviderThread, FinishesThePictureInTheMiddleOfWhichItIsStopped)
{
    Drawing drawing;
    std::atomic<bool> hasBegun = false;
    std::atomic<bool> hasEnded = false;
    drawing.thumbnails.whenDrawing = [&] {
        hasBegun = true;
        while (!juce::Thread::currentThreadShouldExit())
            std::this_thread::yield();
        hasEnded = true;
    };
    ASSERT_TRUE(drawing.request(1));
    while (!hasBegun)
        std::this_thread::yield();

    drawing.stop();

    EXPECT_TRUE(hasEnded);
    EXPECT_EQ(drawing.thumbnails.imagesAlive, 0);
    EXPECT_EQ(drawing.thumbnails.factoriesAlive, 0);
}

TEST(ImageProviderThread, StopsAtWhateverMomentOfARequest)
{
    for (int round = 0; round < 200; ++round) {
        Drawing drawing;
        ASSERT_TRUE(drawing.request(1));
        for (int wait = 0; wait < round % 20; ++wait)
            std::this_thread::yield();

        drawing.stop();

        ASSERT_EQ(drawing.thumbnails.imagesAlive, 0);
        ASSERT_EQ(drawing.thumbnails.factoriesAlive, 0);
        ASSERT_EQ(drawing.clip->refCount(), 1);
    }
}

TEST(ImageProviderThread, DoesNotWaitForeverForAHostThatDoesNotComeBack)
{
    Drawing drawing;
    tests::Gate gate;
    drawing.thumbnails.whenDrawing = gate.door();
    ASSERT_TRUE(drawing.request(1));
    gate.waitUntilEntered();
    const auto begin = std::chrono::steady_clock::now();

    EXPECT_FALSE(drawing.thread->stop());

    EXPECT_GE(std::chrono::steady_clock::now() - begin, std::chrono::milliseconds(1990));
    EXPECT_EQ(drawing.thumbnails.factoriesAlive, 1);
    gate.open();
    drawing.stop();
    EXPECT_EQ(drawing.thumbnails.factoriesAlive, 0);
}

} // namespace cadrel::host
