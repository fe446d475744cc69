// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/ThumbnailFactory.h"

#include "standin/services/BitmapFont.h"
#include "tests/support/standin/TestHost.h"

#include <gtest/gtest.h>

#include <atomic>
#include <set>
#include <string>
#include <thread>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

/// A host with a video "A1" of 24 frames and a sound, and a thumbnail factory of it.
struct ThumbnailHost : TestHost {
    ThumbnailHost() { project.pool().add(video); }

    int32 setSource(IMediaClip* clip, int32 width, int32 height)
    {
        const int32 size[2] = {width, height};
        return factory->setSource(clip, size);
    }
    Counted<IThumbnailImage> image(uint32 frame) { return Counted<IThumbnailImage>::adopt(factory->getImage(frame)); }

    Counted<MediaClip> video = makeCounted<MediaClip>(MediaClip::Kind::Video, u"/picture/A1.mov", 1.0);
    Counted<ThumbnailFactory> factory = makeCounted<ThumbnailFactory>();
};

/// The picture as text: "#" for a white pixel, "." for one of the ground.
std::vector<std::string> rowsOf(IThumbnailImage& image)
{
    int32 size[2] = {};
    EXPECT_EQ(image.getSize(size), ResultOk);
    const auto width = static_cast<std::size_t>(size[0]);
    std::vector<uint8> pixels(width * static_cast<std::size_t>(size[1]) * 4);
    const int32 whole[4] = {0, 0, size[0], size[1]};
    EXPECT_EQ(image.read(pixels.data(), size[0] * 4, whole, 0), ResultOk);
    std::vector<std::string> rows;
    for (std::size_t offset = 0; offset < pixels.size(); offset += 4) {
        if (offset % (width * 4) == 0)
            rows.emplace_back();
        rows.back() += pixels[offset] == 0xff ? '#' : '.';
    }
    return rows;
}

} // namespace

TEST(ThumbnailFactory, DrawsTheNameOfTheClipAndTheNumberOfTheFrame)
{
    ThumbnailHost host;
    ASSERT_EQ(host.setSource(host.video.get(), 14, 19), ResultOk);

    const std::vector<std::string> expected = {
        "..............", //
        "..............", //
        "..###....#....", //
        ".#...#..##....", //
        ".#...#...#....", //
        ".#...#...#....", //
        ".#####...#....", //
        ".#...#...#....", //
        ".#...#..###...", //
        "..............", //
        "..............", //
        "....#####.....", //
        "........#.....", //
        ".......#......", //
        "......#.......", //
        ".....#........", //
        ".....#........", //
        ".....#........", //
        "..............", //
    };
    auto rows = rowsOf(*host.image(7));
    // The text stands in the middle, give or take a pixel: only what it says counts here.
    EXPECT_EQ(rows.size(), 19U);
    while (!rows.empty() && rows.front() == expected.front())
        rows.erase(rows.begin());
    while (!rows.empty() && rows.back() == expected.back())
        rows.pop_back();
    EXPECT_EQ(rows, std::vector<std::string>(expected.begin() + 2, expected.end() - 1));
}

TEST(ThumbnailFactory, DrawsAsLargeAsThePictureAllows)
{
    ThumbnailHost host;
    // Three times the space that two characters and two lines need.
    ASSERT_EQ(host.setSource(host.video.get(), 36, 54), ResultOk);

    const auto rows = rowsOf(*host.image(7));

    // The bar of the 7 is the longest stroke: five times three pixels, three rows high.
    int bars = 0;
    for (const std::string& row : rows)
        bars += row.find(std::string(15, '#')) != std::string::npos ? 1 : 0;
    // The bar of the 7 and the bar of the A.
    EXPECT_EQ(bars, 6);
}

TEST(ThumbnailFactory, ThePictureIsFlatAndOpaqueAroundTheText)
{
    ThumbnailHost host;
    ASSERT_EQ(host.setSource(host.video.get(), 160, 90), ResultOk);
    const auto image = host.image(0);
    std::vector<uint8> pixels(160 * 90 * 4);
    const int32 whole[4] = {0, 0, 160, 90};
    ASSERT_EQ(image->read(pixels.data(), 160 * 4, whole, 0), ResultOk);

    const std::vector<uint8> ground(pixels.begin(), pixels.begin() + 4);
    for (std::size_t offset = 0; offset < pixels.size(); offset += 4) {
        const std::vector<uint8> pixel(pixels.begin() + static_cast<std::ptrdiff_t>(offset),
                                       pixels.begin() + static_cast<std::ptrdiff_t>(offset) + 4);
        ASSERT_TRUE(pixel == ground || pixel == std::vector<uint8>(4, 0xff)) << offset;
        ASSERT_EQ(pixel[3], 0xff) << offset;
    }
    EXPECT_NE(ground, std::vector<uint8>(4, 0xff));
}

TEST(ThumbnailFactory, ThePicturesOfTwoFramesAndOfTwoNamesDiffer)
{
    ThumbnailHost host;
    ASSERT_EQ(host.setSource(host.video.get(), 160, 90), ResultOk);
    const auto first = rowsOf(*host.image(0));
    EXPECT_EQ(rowsOf(*host.image(0)), first);
    EXPECT_NE(rowsOf(*host.image(1)), first);

    host.video->setName(nullptr, text(u"B1").get(), 0);
    ASSERT_EQ(host.setSource(host.video.get(), 160, 90), ResultOk);
    EXPECT_NE(rowsOf(*host.image(0)), first);
}

TEST(ThumbnailFactory, CutsOffAtItsEndWhatIsTooLongForThePicture)
{
    ThumbnailHost host;
    host.video->setName(nullptr, text(u"A1").get(), 0);
    ASSERT_EQ(host.setSource(host.video.get(), 12, 18), ResultOk);
    const auto twoCharacters = rowsOf(*host.image(7));

    host.video->setName(nullptr, text(u"A1 and much more than fits").get(), 0);
    ASSERT_EQ(host.setSource(host.video.get(), 12, 18), ResultOk);

    EXPECT_EQ(rowsOf(*host.image(7)), twoCharacters);
}

TEST(ThumbnailFactory, DrawsInAPictureThatIsTooSmallForText)
{
    ThumbnailHost host;
    const int32 sizes[][2] = {{1, 1}, {1, 200}, {200, 1}, {3, 5}};

    for (const auto& size : sizes) {
        ASSERT_EQ(host.setSource(host.video.get(), size[0], size[1]), ResultOk);
        EXPECT_EQ(rowsOf(*host.image(23)).size(), static_cast<std::size_t>(size[1]));
    }
}

TEST(ThumbnailFactory, HasTheFramesOfTheClipAndNoMore)
{
    ThumbnailHost host;
    ASSERT_EQ(host.setSource(host.video.get(), 16, 9), ResultOk);

    EXPECT_TRUE(host.image(23));
    EXPECT_FALSE(host.image(24));
    EXPECT_FALSE(host.image(0xffffffff));

    host.project.setFrameRate({25.0, 0});
    ASSERT_EQ(host.setSource(host.video.get(), 16, 9), ResultOk);
    EXPECT_TRUE(host.image(24));
    EXPECT_FALSE(host.image(25));
}

TEST(ThumbnailFactory, HasNothingWithoutASource)
{
    ThumbnailHost host;
    EXPECT_FALSE(host.image(0));

    ASSERT_EQ(host.setSource(host.video.get(), 16, 9), ResultOk);
    EXPECT_NE(host.setSource(nullptr, 16, 9), ResultOk);
    EXPECT_FALSE(host.image(0));
}

TEST(ThumbnailFactory, RefusesWhatIsNoVideoOrNoSize)
{
    ThumbnailHost host;
    MediaClip& sound = host.addMedia(u"/sound/door.wav", 5.0);

    EXPECT_NE(host.setSource(&sound, 16, 9), ResultOk);
    EXPECT_NE(host.factory->setSource(host.video.get(), nullptr), ResultOk);
    EXPECT_NE(host.setSource(host.video.get(), 0, 9), ResultOk);
    EXPECT_NE(host.setSource(host.video.get(), 16, -1), ResultOk);
    EXPECT_NE(host.setSource(host.video.get(), 8193, 1), ResultOk);
    EXPECT_EQ(host.setSource(host.video.get(), 8192, 1), ResultOk);
}

TEST(ThumbnailFactory, APictureIsReadInParts)
{
    ThumbnailHost host;
    ASSERT_EQ(host.setSource(host.video.get(), 14, 19), ResultOk);
    const auto image = host.image(7);
    const auto rows = rowsOf(*image);
    constexpr int32 Stride = 40;
    std::vector<uint8> pixels(Stride * 3, 0x77);

    // Columns 1 to 9, rows 4 to 6.
    const int32 part[4] = {1, 4, 10, 7};
    ASSERT_EQ(image->read(pixels.data(), Stride, part, 0), ResultOk);

    for (std::size_t row = 0; row < 3; ++row) {
        std::string text;
        for (std::size_t column = 0; column < 9; ++column)
            text += pixels[row * Stride + column * 4] == 0xff ? '#' : '.';
        EXPECT_EQ(text, rows[4 + row].substr(1, 9));
        EXPECT_EQ(pixels[row * Stride + 36], 0x77) << "What lies between the rows isn't written to.";
    }
}

TEST(ThumbnailFactory, APictureRefusesToBeReadBeyondItsEdges)
{
    ThumbnailHost host;
    ASSERT_EQ(host.setSource(host.video.get(), 16, 9), ResultOk);
    const auto image = host.image(0);
    std::vector<uint8> pixels(100 * 100 * 4);
    const int32 bad[][4] = {{-1, 0, 16, 9}, {0, -1, 16, 9}, {0, 0, 17, 9}, {0, 0, 16, 10}, {5, 0, 4, 9}, {0, 5, 16, 4}};
    const int32 whole[4] = {0, 0, 16, 9};

    for (const auto& rect : bad)
        EXPECT_NE(image->read(pixels.data(), 400, rect, 0), ResultOk);
    EXPECT_NE(image->read(pixels.data(), 63, whole, 0), ResultOk);
    EXPECT_NE(image->read(pixels.data(), -64, whole, 0), ResultOk);
    EXPECT_NE(image->read(nullptr, 64, whole, 0), ResultOk);
    EXPECT_NE(image->read(pixels.data(), 64, nullptr, 0), ResultOk);
    EXPECT_NE(image->getSize(nullptr), ResultOk);
    EXPECT_EQ(image->read(pixels.data(), 64, whole, 0), ResultOk);
}

TEST(ThumbnailFactory, DrawsOnAThreadWhileTheClipIsRenamedAndTheRateChanges)
{
    ThumbnailHost host;
    std::atomic<bool> isDone = false;
    std::thread drawing([&] {
        const int32 size[2] = {32, 18};
        const auto factory = makeCounted<ThumbnailFactory>();
        while (!isDone) {
            EXPECT_EQ(factory->setSource(host.video.get(), size), ResultOk);
            EXPECT_TRUE(Counted<IThumbnailImage>::adopt(factory->getImage(20)));
        }
    });

    for (int round = 0; round < 500; ++round) {
        host.video->setName(nullptr, text(round % 2 == 0 ? u"a much longer name than before" : u"A1").get(), 0);
        host.project.setFrameRate({round % 2 == 0 ? 25.0 : 24.0, 0});
    }
    isDone = true;
    drawing.join();

    EXPECT_EQ(host.video->caption().name, u"A1");
    EXPECT_EQ(host.video->caption().frameCount, 24U);
}

TEST(ObjectFactory, MakesThumbnailFactoriesAndTakesThemBack)
{
    Application application;
    const auto objects = service<IObjectFactory>(application.context());

    FUnknown* const object = objects->createObject(IObjectFactory::ThumbnailClass, IObjectFactory::ThumbnailType);
    ASSERT_NE(object, nullptr);
    auto factory = query<IThumbnailFactory>(object);
    EXPECT_TRUE(factory);

    EXPECT_EQ(objects->releaseObject(object), ResultOk);
    EXPECT_EQ(factory->addRef(), 2) << "Only the reference that it gave is dropped.";
    factory->release();
    EXPECT_NE(objects->releaseObject(object), ResultOk) << "Not twice.";
}

TEST(ObjectFactory, TakesAnObjectBackAsAnyOfItsInterfaces)
{
    Application application;
    const auto objects = service<IObjectFactory>(application.context());
    FUnknown* const object = objects->createObject(IObjectFactory::ThumbnailClass, IObjectFactory::ThumbnailType);
    const auto factory = query<IThumbnailFactory>(object);
    ASSERT_NE(static_cast<void*>(factory.get()), static_cast<void*>(object));

    EXPECT_EQ(objects->releaseObject(factory.get()), ResultOk);

    EXPECT_EQ(factory->addRef(), 2) << "Only the reference that it gave is dropped.";
    factory->release();
    EXPECT_NE(objects->releaseObject(object), ResultOk) << "Not twice.";
}

TEST(ObjectFactory, MakesNothingElse)
{
    Application application;
    const auto objects = service<IObjectFactory>(application.context());

    EXPECT_EQ(objects->createObject(IObjectFactory::ThumbnailClass, "Audio"), nullptr);
    EXPECT_EQ(objects->createObject("AudioThumbnailFactory", IObjectFactory::ThumbnailType), nullptr);
    EXPECT_EQ(objects->createObject(nullptr, IObjectFactory::ThumbnailType), nullptr);
    EXPECT_EQ(objects->createObject(IObjectFactory::ThumbnailClass, nullptr), nullptr);
}

TEST(ObjectFactory, TakesNothingBackThatItHasNotMade)
{
    Application application;
    const auto objects = service<IObjectFactory>(application.context());
    const auto foreign = makeCounted<FObject>();

    EXPECT_NE(objects->releaseObject(foreign.get()), ResultOk);
    EXPECT_NE(objects->releaseObject(nullptr), ResultOk);
    EXPECT_EQ(foreign->refCount(), 1);
}

TEST(BitmapFont, ShowsABoxForWhatItDoesNotKnow)
{
    for (const char16_t character : {u'\x1f', u'\x7f', u'\u00e4', u'\uffff', u'\0'}) {
        for (int column = 0; column < BitmapFont::Width; ++column) {
            for (int row = 0; row < BitmapFont::Height; ++row) {
                const bool isEdge = column == 0 || column == 4 || row == 0 || row == 6;
                EXPECT_EQ(BitmapFont::isSet(character, column, row), isEdge);
            }
        }
    }
}

TEST(BitmapFont, NoTwoCharactersLookAlike)
{
    std::set<std::string> looks;
    for (char16_t character = u' '; character <= u'~'; ++character) {
        std::string look;
        for (int pixel = 0; pixel < BitmapFont::Width * BitmapFont::Height; ++pixel)
            look += BitmapFont::isSet(character, pixel % BitmapFont::Width, pixel / BitmapFont::Width) ? '#' : '.';
        EXPECT_TRUE(looks.insert(look).second) << static_cast<char>(character);
    }
}

} // namespace standin::tests
