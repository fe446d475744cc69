// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/PictureRun.h"

#include <gtest/gtest.h>

#include <cstdint>

namespace standin::tests {

namespace {

/// Frame n lasts from 40 n to 40 n + 40 milliseconds, which are the ticks.
const FrameClock Clock({25, 1}, {1, 1000}, 0);

AvOwner<AVFrame> pictureAt(std::int64_t ticks)
{
    auto picture = owned(av_frame_alloc());
    picture->width = 64;
    picture->height = 64;
    picture->format = AV_PIX_FMT_GRAY8;
    picture->best_effort_timestamp = ticks;
    EXPECT_EQ(av_frame_get_buffer(picture.get(), 1), 0);
    return picture;
}

/// Pictures at 40, 80 and 120.
PictureRun threePictures()
{
    PictureRun run;
    for (const std::int64_t ticks : {40, 80, 120})
        run.add(pictureAt(ticks));
    return run;
}

std::int64_t timeAt(const PictureRun& run, std::uint32_t frame)
{
    const AVFrame* const found = run.find(frame, Clock);
    return found ? found->best_effort_timestamp : -1;
}

} // namespace

TEST(PictureRun, ShowsAtAFrameTheLastPictureThatComesBeforeItsMiddle)
{
    PictureRun run;
    run.add(pictureAt(40));
    run.add(pictureAt(59));
    run.add(pictureAt(60));
    run.add(pictureAt(120));

    EXPECT_EQ(timeAt(run, 1), 59);
    EXPECT_EQ(timeAt(run, 2), 60);
}

TEST(PictureRun, DoesNotKnowWhatComesBeforeItOrAfterItsLastPicture)
{
    const PictureRun run = threePictures();

    EXPECT_EQ(timeAt(run, 0), -1);
    EXPECT_EQ(timeAt(run, 2), 80);
    EXPECT_EQ(timeAt(run, 3), -1) << "Another picture may come before the middle of frame 3.";
    EXPECT_EQ(timeAt(PictureRun(), 0), -1);
}

TEST(PictureRun, TheLastPictureOfTheFileStays)
{
    PictureRun run = threePictures();

    run.setAtEnd();

    EXPECT_EQ(timeAt(run, 3), 120);
    EXPECT_EQ(timeAt(run, 99), 120);
}

TEST(PictureRun, DropsWhatComesBeforeATimeButNotTheLast)
{
    PictureRun run = threePictures();

    run.dropBefore(80);
    EXPECT_EQ(run.start(), 80);
    run.dropBefore(81);
    EXPECT_EQ(run.start(), 120);
    run.dropBefore(1000);
    EXPECT_EQ(run.start(), 120);
    EXPECT_EQ(run.last(), 120);
    EXPECT_EQ(run.size(), 1U);
}

TEST(PictureRun, CountsTheMemoryOfItsPictures)
{
    PictureRun run;
    EXPECT_EQ(run.bytes(), 0U);
    run.add(pictureAt(40));
    const std::size_t one = run.bytes();
    EXPECT_GE(one, 64U * 64U);

    run.add(pictureAt(80));
    EXPECT_EQ(run.bytes(), 2 * one);
    run.dropFirst();
    EXPECT_EQ(run.bytes(), one);
    EXPECT_EQ(run.start(), 80);
    run.clear();
    EXPECT_EQ(run.bytes(), 0U);
    EXPECT_TRUE(run.isEmpty());
}

TEST(PictureRun, ForgetsItsEndWhenItIsCleared)
{
    PictureRun run = threePictures();
    run.setAtEnd();

    run.clear();

    EXPECT_FALSE(run.isAtEnd());
}

} // namespace standin::tests
