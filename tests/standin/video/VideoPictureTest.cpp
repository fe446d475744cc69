// SPDX-License-Identifier: GPL-3.0-or-later

// What a picture looks like: its shape, its colours, and which one it is at another rate.

#include "standin/video/VideoFile.h"

#include "standin/video/VideoError.h"
#include "tests/support/TempFolder.h"
#include "tests/support/video/TestVideos.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <string>
#include <utility>
#include <vector>

namespace standin::tests {

using cadrel::tests::TempFolder;

namespace {

constexpr PictureSize Box{320, 320};
const std::string H264 = "-c:v libx264 -preset veryfast -pix_fmt yuv420p ";

Picture pictureOf(const VideoRecipe& recipe, std::uint32_t frame = 0, Ratio rate = {24, 1})
{
    return VideoFile(videoOf(recipe), inGoodTime()).picture(frame, rate, Box, inGoodTime());
}

/// Red, green, blue, alpha.
std::array<int, 4> colourAt(const Picture& picture, int x, int y)
{
    const std::uint8_t* const pixel =
        picture.pixels.data() + static_cast<std::ptrdiff_t>(y * picture.size.width + x) * 4;
    return {pixel[2], pixel[1], pixel[0], pixel[3]};
}

/// A video of one colour, which an expression of ffmpeg's draws in the planes Y, U and V.
VideoRecipe flat(const std::string& name, int luma, int blue, int red, const std::string& options, int width = 320,
                 int height = 192)
{
    const std::string filter = "-vf \"format=yuv444p,geq=lum=" + std::to_string(luma) + ":cb=" + std::to_string(blue) +
                               ":cr=" + std::to_string(red) + "\" ";
    return {name, 2, "24", filter + options, width, height};
}

void expectColour(const Picture& picture, int red, int green, int blue)
{
    const auto colour = colourAt(picture, picture.size.width / 2, picture.size.height / 2);
    EXPECT_NEAR(colour[0], red, 3);
    EXPECT_NEAR(colour[1], green, 3);
    EXPECT_NEAR(colour[2], blue, 3);
    EXPECT_EQ(colour[3], 255);
}

Picture turnedClockwise(const Picture& picture)
{
    Picture turned{{picture.size.height, picture.size.width}, std::vector<std::uint8_t>(picture.pixels.size())};
    for (int y = 0; y < picture.size.height; ++y) {
        for (int x = 0; x < picture.size.width; ++x) {
            const int turnedX = picture.size.height - 1 - y;
            std::copy_n(picture.pixels.begin() + (y * picture.size.width + x) * 4, 4,
                        turned.pixels.begin() + (x * turned.size.width + turnedX) * 4);
        }
    }
    return turned;
}

const std::string Lossless = "-c:v libx264 -qp 0 -pix_fmt yuv444p ";

} // namespace

TEST(VideoPicture, FitsTheBoxInItsOwnShape)
{
    EXPECT_EQ(pictureOf({"plain.mp4", 4, "24", H264}).size, (PictureSize{320, 192}));
}

TEST(VideoPicture, HeedsTheShapeOfThePixels)
{
    // Pixels of 2:1 make 640 by 192 of 320 by 192.
    EXPECT_EQ(pictureOf({"wide.mp4", 4, "24", "-vf setsar=2/1 " + H264}).size, (PictureSize{320, 96}));
    EXPECT_EQ(pictureOf({"narrow.mkv", 4, "24", "-vf setsar=1/2 " + H264}).size, (PictureSize{267, 320}));
}

TEST(VideoPicture, ATurnedFilmStandsUpright)
{
    const std::filesystem::path stored = videoOf({"stored.mp4", 4, "24", H264 + "-x264-params keyint=1 "});
    const TempFolder folder;
    // The degrees count against the clock.
    for (const auto& [degrees, quarterTurns] : {std::pair{90, 3}, {180, 2}, {270, 1}}) {
        const std::filesystem::path turned = folder / (std::to_string(degrees) + ".mov");
        ASSERT_EQ(std::system(("ffmpeg -nostdin -v error -i '" + stored.string() + "' -c copy -metadata:s:v rotate=" +
                               std::to_string(degrees) + " '" + turned.string() + "'")
                                  .c_str()),
                  0);

        Picture picture = VideoFile(turned, inGoodTime()).picture(3, {24, 1}, Box, inGoodTime());

        EXPECT_EQ(picture.size, degrees == 180 ? (PictureSize{320, 192}) : (PictureSize{192, 320}));
        // Turned on to a whole turn, it shows its number again.
        for (int turn = quarterTurns; turn < 4; ++turn)
            picture = turnedClockwise(picture);
        EXPECT_EQ(numberIn(picture), 3) << degrees;
    }
}

TEST(VideoPicture, VideoLevelsAreSpreadToFullOnes)
{
    expectColour(pictureOf(flat("white.mp4", 235, 128, 128, Lossless)), 255, 255, 255);
    expectColour(pictureOf(flat("black.mp4", 16, 128, 128, Lossless)), 0, 0, 0);
    // (126 - 16) * 255 / 219 = 128.1
    expectColour(pictureOf(flat("grey.mp4", 126, 128, 128, Lossless)), 128, 128, 128);
}

TEST(VideoPicture, FullLevelsStayAsTheyAre)
{
    expectColour(pictureOf(flat("full.mp4", 235, 128, 128, Lossless + "-color_range pc ")), 235, 235, 235);
    expectColour(pictureOf(flat("full-black.mp4", 16, 128, 128, Lossless + "-color_range pc ")), 16, 16, 16);
}

TEST(VideoPicture, TheMatrixOfTheFileCounts)
{
    // Y 126, Cb 128, Cr 168: R = 128 + 40 * 255 / 224 * 2 (1 - Kr), G = 128 - 40 * 255 / 224 * 2 (1 - Kr) Kr / Kg, B = 128.
    // 40 * 255 / 224 = 45.5. BT.709 has Kr 0.2126 and Kg 0.7152, BT.601 has Kr 0.299 and Kg 0.587.
    expectColour(pictureOf(flat("709.mp4", 126, 128, 168, Lossless + "-colorspace bt709 ")), 200, 107, 128);
    expectColour(pictureOf(flat("601.mp4", 126, 128, 168, Lossless + "-colorspace smpte170m ")), 192, 96, 128);
}

TEST(VideoPicture, AMatrixThatIsNotToldGoesByTheSize)
{
    expectColour(pictureOf(flat("small.mp4", 126, 128, 168, Lossless)), 192, 96, 128);
    expectColour(pictureOf(flat("large.mp4", 126, 128, 168, Lossless, 1280, 720)), 200, 107, 128);
}

TEST(VideoPicture, AMatrixThatNobodyKnowsCountsAsNone)
{
    const TempFolder folder;
    std::string bytes = cadrel::tests::contentOf(
        videoOf(flat("named.mov", 126, 128, 168, "-c:v prores_ks -profile:v 0 -pix_fmt yuv422p10le ")));
    // The head of a frame begins eight bytes after the start of the frame, four after its mark. Its byte 16 is the matrix.
    constexpr std::size_t MatrixAfterMark = 4 + 16;
    std::size_t frames = 0;
    for (std::size_t mark = bytes.find("icpf"); mark != std::string::npos; mark = bytes.find("icpf", mark + 1)) {
        bytes[mark + MatrixAfterMark] = static_cast<char>(142);
        ++frames;
    }
    ASSERT_EQ(frames, 2U);

    VideoFile file(folder.write("unknown.mov", bytes), inGoodTime());

    expectColour(file.picture(1, {24, 1}, Box, inGoodTime()), 192, 96, 128);
}

TEST(VideoPicture, FieldsOfADecodedPictureMayHoldAnyNumber)
{
    const auto picture = owned(av_frame_alloc());
    picture->width = 64;
    picture->height = 48;
    picture->format = AV_PIX_FMT_YUV420P;
    ASSERT_EQ(av_frame_get_buffer(picture.get(), 0), 0);
    const auto fill = [&](int plane, std::uint8_t value) {
        std::fill_n(picture->data[plane], picture->linesize[plane] * (plane == 0 ? 48 : 24), value);
    };
    fill(0, 126);
    fill(1, 128);
    fill(2, 168);
    for (const int number : {142, 255, -1}) {
        std::memcpy(&picture->colorspace, &number, sizeof(number));
        std::memcpy(&picture->color_range, &number, sizeof(number));

        expectColour(PictureDrawing().draw(*picture, {1, 1}, {}, Box), 192, 96, 128);
    }
}

TEST(VideoPicture, TenBitsAreShownInEight)
{
    const VideoRecipe recipe{"ten.mov", 50, "24", "-c:v libx264 -preset veryfast -pix_fmt yuv422p10le "};
    VideoFile file(videoOf(recipe), inGoodTime());

    EXPECT_EQ(numberIn(file.picture(37, {24, 1}, Box, inGoodTime())), 37);
    // White in 10 bits is 940.
    expectColour(pictureOf(flat("ten-white.mov", 235, 128, 128, "-c:v libx264 -qp 0 -pix_fmt yuv444p10le ")), 255, 255,
                 255);
}

TEST(VideoPicture, AFilmOfAnotherRateShowsWhatIsOnTheScreenThen)
{
    const VideoRecipe recipe{"pal.mp4", 100, "25", H264};
    VideoFile file(videoOf(recipe), inGoodTime());
    // The middle of frame n of 24 is at (n + 1/2) / 24; the picture there is the last before: 0 -> 0 (0.52 pictures),
    // 11 -> 11 (11.98), 12 -> 13 (13.02), 95 -> 99 (99.48).
    const Ratio rate{24, 1};

    ASSERT_EQ(file.frameCount(rate), 96U);
    for (const auto& [frame, number] : {std::pair{0U, 0}, {11U, 11}, {12U, 13}, {95U, 99}})
        EXPECT_EQ(numberIn(file.picture(frame, rate, Box, inGoodTime())), number) << frame;
    // At 50, each picture stands at two frames.
    ASSERT_EQ(file.frameCount({50, 1}), 200U);
    for (const std::uint32_t frame : {0U, 1U, 2U, 3U, 198U, 199U})
        EXPECT_EQ(numberIn(file.picture(frame, {50, 1}, Box, inGoodTime())), static_cast<int>(frame / 2)) << frame;
}

TEST(VideoPicture, AFilmThatWasSpedUpKeepsStepOverALongTime)
{
    // A film of 23.976 in a project of 24: at frame 3000 the film has lost three frames.
    const VideoRecipe recipe{"long.mov", 3300, "24000/1001", "-c:v libx264 -preset ultrafast -pix_fmt yuv420p -g 48 "};
    VideoFile file(videoOf(recipe), inGoodTime());

    // Picture of frame n: the last whose number is below (n + 1/2) * 1000 / 1001; 3000.5 -> 2997.50, 500.5 -> 500, excluded.
    EXPECT_EQ(numberIn(file.picture(3000, {24, 1}, Box, inGoodTime())), 2997);
    EXPECT_EQ(numberIn(file.picture(499, {24, 1}, Box, inGoodTime())), 499);
    EXPECT_EQ(numberIn(file.picture(500, {24, 1}, Box, inGoodTime())), 499);
    EXPECT_EQ(numberIn(file.picture(501, {24, 1}, Box, inGoodTime())), 500);
    EXPECT_EQ(numberIn(file.picture(3299, exactRate(23.976), Box, inGoodTime())), 3299);
}

TEST(VideoPicture, AtRatesWithManyFramesEachHasItsOwn)
{
    const VideoRecipe recipe{"fast.mov", 240, "60000/1001", H264 + "-timecode '01:00:59;56' "};
    VideoFile file(videoOf(recipe), inGoodTime());
    const Ratio rate = exactRate(59.94);

    EXPECT_EQ(file.rate(), rate);
    ASSERT_EQ(file.frameCount(rate), 240U);
    for (const std::uint32_t frame : {0U, 1U, 119U, 120U, 238U, 239U})
        EXPECT_EQ(numberIn(file.picture(frame, rate, Box, inGoodTime())), static_cast<int>(frame));
}

TEST(VideoPicture, BesideSoundTheFilmStartsWithItsFirstPicture)
{
    const std::string sound = "-f lavfi -i sine=duration=5 -map 0:v -map 1:a -shortest ";
    for (const char* const name : {"sound.mp4", "sound.ts", "sound.mkv"}) {
        VideoFile file(videoOf({name, 100, "25", sound + H264 + "-output_ts_offset 7.3 "}), inGoodTime());

        ASSERT_EQ(file.frameCount({25, 1}), 100U) << name;
        for (const std::uint32_t frame : {0U, 1U, 50U, 99U})
            EXPECT_EQ(numberIn(file.picture(frame, {25, 1}, Box, inGoodTime())), static_cast<int>(frame)) << name;
    }
}

} // namespace standin::tests
