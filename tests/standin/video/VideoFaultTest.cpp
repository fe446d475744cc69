// SPDX-License-Identifier: GPL-3.0-or-later

// Files that have no pictures, or not all of them.

#include "standin/video/PictureReader.h"
#include "standin/video/VideoError.h"
#include "standin/video/VideoFile.h"
#include "tests/support/NoPrivileges.h"
#include "tests/support/TempFolder.h"
#include "tests/support/video/TestVideos.h"

#include <gtest/gtest.h>

#include <chrono>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <optional>
#include <set>
#include <string>

#include <sys/stat.h>

namespace standin::tests {

namespace fs = std::filesystem;

using cadrel::tests::contentOf;
using cadrel::tests::TempFolder;
using Reason = VideoError::Reason;

namespace {

constexpr PictureSize Box{320, 320};
const std::string H264 = "-c:v libx264 -preset veryfast -pix_fmt yuv420p -g 24 ";
const VideoRecipe Film{"film.mp4", 200, "25", H264 + "-movflags +faststart "};

std::optional<Reason> reasonOf(const std::function<void()>& action)
{
    try {
        action();
    } catch (const VideoError& error) {
        return error.reason();
    }
    return std::nullopt;
}

std::optional<Reason> reasonToOpen(const fs::path& file)
{
    return reasonOf([&] { const VideoFile opened(file, inGoodTime()); });
}

/// A file that ffmpeg makes of what its inputs are.
fs::path madeFile(const TempFolder& folder, const std::string& name, const std::string& arguments)
{
    const fs::path file = folder / name;
    EXPECT_EQ(std::system(("ffmpeg -nostdin -v error -y " + arguments + " '" + file.string() + "'").c_str()), 0);
    return file;
}

} // namespace

TEST(VideoFault, AFileThatIsNotThereIsMissing)
{
    const TempFolder folder;

    EXPECT_EQ(reasonToOpen(folder / "none.mov"), Reason::Missing);
}

TEST(VideoFault, SoundHasNoPicture)
{
    const TempFolder folder;

    EXPECT_EQ(reasonToOpen(madeFile(folder, "sound.wav", "-f lavfi -i sine=duration=1")), Reason::NoPicture);
    EXPECT_EQ(reasonToOpen(madeFile(folder, "sound.mov", "-f lavfi -i sine=duration=1 -c:a pcm_s16le")),
              Reason::NoPicture);
}

TEST(VideoFault, ThePictureOfAnAlbumIsNoFilm)
{
    const TempFolder folder;
    const fs::path cover = madeFile(folder, "cover.png", "-f lavfi -i color=red:s=64x64 -frames:v 1");
    const fs::path album = madeFile(folder, "album.m4a",
                                    "-f lavfi -i sine=duration=1 -i '" + cover.string() +
                                        "' -map 0 -map 1 -c:a aac -c:v png -disposition:v attached_pic");

    EXPECT_EQ(reasonToOpen(album), Reason::NoPicture);
}

TEST(VideoFault, WhatIsNoVideoCantBeRead)
{
    const TempFolder folder;

    EXPECT_EQ(reasonToOpen(folder.write("empty.mov", "")), Reason::Unreadable);
    EXPECT_EQ(reasonToOpen(folder.write("text.mov", "This is a text, not a film.\n")), Reason::Unreadable);
}

TEST(VideoFault, WhatIsNoFileIsNotOpened)
{
    const TempFolder folder;

    EXPECT_EQ(reasonToOpen(folder.path()), Reason::NotOpened);
    EXPECT_EQ(reasonToOpen("/dev/zero"), Reason::NotOpened);
}

TEST(VideoFault, AFileThatNobodyMayReadIsNotOpened)
{
    const TempFolder folder;
    const fs::path file = folder.write("film.mp4", contentOf(videoOf(Film)));
    fs::permissions(folder.path(), fs::perms::all);
    fs::permissions(file, fs::perms::none);
    const cadrel::tests::NoPrivileges nobody;

    EXPECT_EQ(reasonToOpen(file), Reason::NotOpened);
}

TEST(VideoFault, PicturesOfAKindThatNobodyKnowsAreToldFromBrokenOnes)
{
    const TempFolder folder;
    std::string bytes = contentOf(videoOf(Film));
    const std::size_t kind = bytes.find("avc1", bytes.find("stsd"));
    ASSERT_NE(kind, std::string::npos);

    EXPECT_EQ(reasonToOpen(folder.write("film.mp4", bytes.replace(kind, 4, "none"))), Reason::UnknownKind);
}

TEST(VideoFault, APipeIsNotWaitedFor)
{
    const TempFolder folder;
    const fs::path pipe = folder / "pipe.mov";
    ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);

    EXPECT_EQ(reasonToOpen(pipe), Reason::NotOpened);
}

TEST(VideoFault, NoOtherFileIsOpenedThanTheOneThatIsNamed)
{
    const TempFolder folder;
    fs::copy_file(videoOf({"film.ts", 50, "25", H264}), folder / "film.ts");
    ASSERT_EQ(mkfifo((folder / "pipe.ts").c_str(), 0600), 0);
    ASSERT_EQ(reasonToOpen(folder / "film.ts"), std::nullopt);

    // One of another machine, one that would be waited for, and one that is good.
    for (const std::string& other : {std::string("http://127.0.0.1:9/film.ts"), (folder / "pipe.ts").string(),
                                     std::string("pipe.ts"), std::string("film.ts")}) {
        const std::string list = "#EXTM3U\n#EXT-X-TARGETDURATION:4\n#EXTINF:4,\n" + other + "\n#EXT-X-ENDLIST\n";
        EXPECT_EQ(reasonToOpen(folder.write("list.m3u8", list)), Reason::Unreadable) << other;
        EXPECT_EQ(reasonToOpen(folder.write("list.mov", list)), Reason::Unreadable) << other;
        EXPECT_EQ(reasonToOpen(folder.write("joined.mov", "ffconcat version 1.0\nfile '" + other + "'\n")),
                  Reason::Unreadable)
            << other;
    }
    EXPECT_EQ(reasonToOpen("http://127.0.0.1:9/film.mp4"), Reason::Missing);
}

TEST(VideoFault, TheNameOfAFileSaysNothingAboutOthers)
{
    const TempFolder folder;
    const std::string film = contentOf(videoOf(Film));

    for (const char* const name : {"take%03d.mp4", "http:film.mp4", "two\nlines.mp4", "\xd1\x84\xd0\xb8.mp4",
                                   "no text \xff.mp4", "none", "film.m3u8", "-film.mp4"})
        EXPECT_EQ(reasonToOpen(folder.write(name, film)), std::nullopt) << name;
    const fs::path still = madeFile(folder, "still.png", "-f lavfi -i color=red:s=64x64 -frames:v 1");
    EXPECT_EQ(reasonToOpen(folder.write("still%03d.png", contentOf(still))), std::nullopt);
}

TEST(VideoFault, AFileThatLostItsEndHasNoMoreThanIsLeft)
{
    const TempFolder folder;
    const std::string whole = contentOf(videoOf(Film));
    const fs::path half = folder.write("half.mp4", whole.substr(0, whole.size() * 6 / 10));
    VideoFile file(half, inGoodTime());

    const std::uint32_t count = file.frameCount({25, 1});

    EXPECT_GT(count, 50U);
    EXPECT_LT(count, 200U);
    for (std::uint32_t frame = 0; frame < count; frame += 7)
        EXPECT_EQ(numberIn(file.picture(frame, {25, 1}, Box, inGoodTime())), static_cast<int>(frame));
    EXPECT_EQ(reasonOf([&] { file.picture(count, {25, 1}, Box, inGoodTime()); }), Reason::PastTheEnd);
    EXPECT_EQ(reasonOf([&] { file.picture(199, {25, 1}, Box, inGoodTime()); }), Reason::PastTheEnd);
}

TEST(VideoFault, AFileThatLostItsIndexCantBeRead)
{
    const TempFolder folder;
    // The index of this one stands at its end.
    const std::string whole = contentOf(videoOf({"index-last.mp4", 100, "25", H264}));

    EXPECT_EQ(reasonToOpen(folder.write("half.mp4", whole.substr(0, whole.size() / 2))), Reason::Unreadable);
}

TEST(VideoFault, TheFramesAroundABrokenPartAreShownAndTheOthersToldToBeBroken)
{
    const TempFolder folder;
    for (const char* const name : {"film.mp4", "film.ts", "film.mkv"}) {
        std::string bytes = contentOf(videoOf({name, 200, "25", H264 + "-bf 2 "}));
        // A stretch in the middle is overwritten.
        const std::size_t middle = bytes.size() / 2;
        for (std::size_t at = middle; at < middle + 3000; ++at)
            bytes[at] = static_cast<char>(at * 37);
        const fs::path broken = folder.write(name, bytes);
        VideoFile file(broken, inGoodTime());
        int right = 0;
        int told = 0;
        for (std::uint32_t frame = 0; frame < 200; ++frame) {
            std::optional<int> number;
            const auto reason = reasonOf([&] { number = numberIn(file.picture(frame, {25, 1}, Box, inGoodTime())); });
            EXPECT_TRUE(number || reason == Reason::Broken) << name << frame;
            right += number == static_cast<int>(frame) ? 1 : 0;
            told += reason ? 1 : 0;
        }
        // The two B frames before a damaged picture are made of it, and come on the screen before the damage is known.
        EXPECT_GE(right + told, 200 - 2) << name;
        // There is a key picture at each 24 pictures.
        EXPECT_GE(right, 200 - 2 * 24) << name;
        EXPECT_GE(told, 1) << name;
        EXPECT_EQ(numberIn(file.picture(0, {25, 1}, Box, inGoodTime())), 0) << name;
    }
}

TEST(VideoFault, TimesThatNoFilmHasAreNone)
{
    const TempFolder folder;
    const std::string bytes = contentOf(madeFile(
        folder, "live.mkv", "-f lavfi -i testsrc=s=32x32:r=25 -frames:v 6 -c:v libx264 -bf 0 -f matroska -live 1"));
    // A group of pictures begins with its mark and length, and then its time, which is 0.
    const std::size_t group = bytes.find("\x1f\x43\xb6\x75");
    const std::size_t time = bytes.find(std::string("\xe7\x81\x00", 3), group);
    ASSERT_NE(time, std::string::npos);
    const auto startingAt = [&](const std::string& ticks) {
        return folder.write("late.mkv", bytes.substr(0, time) + "\xe7\x88" + ticks + bytes.substr(time + 3));
    };

    // The last one is 2 to the power of 59, and a time. After the others the pictures are counted. The group is longer than it
    // says then, and loses its last picture.
    for (const std::string& ticks :
         {std::string("\x7f\xff\xff\xff\xff\xff\xff\xf0"), std::string("\x10\x00\x00\x00\x00\x00\x10\x00", 8),
          std::string("\x08\x00\x00\x00\x00\x00\x00\x00", 8)}) {
        VideoFile late(startingAt(ticks), inGoodTime());
        EXPECT_EQ(late.frameCount({25, 1}), 5U);
        EXPECT_EQ(reasonOf([&] { late.picture(4, {25, 1}, Box, inGoodTime()); }), std::nullopt);
    }
}

TEST(VideoFault, AFileThatAsksForMoreMemoryThanThereMayBeCantBeRead)
{
    const TempFolder folder;
    std::string bytes = contentOf(videoOf(Film));
    // The table of the sizes of the pictures claims to have half a thousand million, each of its own size.
    const std::size_t table = bytes.find("stsz");
    ASSERT_NE(table, std::string::npos);
    bytes.replace(table + 8, 8, std::string("\x00\x00\x00\x00\x1f\xff\xff\x00", 8));

    EXPECT_EQ(reasonToOpen(folder.write("greedy.mp4", bytes)), Reason::Unreadable);
}

TEST(VideoFault, APictureOfTooManyPixelsIsNotRead)
{
    const TempFolder folder;
    // 67 million, and 37 million are the most.
    const fs::path large = madeFile(folder, "large.mov", "-f lavfi -i color=red:s=16384x4096 -frames:v 1 -c:v mjpeg");

    EXPECT_EQ(reasonToOpen(large), Reason::TooLarge);
}

TEST(VideoFault, WhatIsNotThereInTimeIsGivenUp)
{
    const fs::path path = videoOf(Film);
    const Deadline past = std::chrono::steady_clock::now() - std::chrono::seconds(1);

    EXPECT_EQ(reasonOf([&] { const VideoFile opened(path, past); }), Reason::TooSlow);
    VideoFile file(path, inGoodTime());
    EXPECT_EQ(reasonOf([&] { file.picture(100, {25, 1}, Box, past); }), Reason::TooSlow);
    EXPECT_EQ(numberIn(file.picture(100, {25, 1}, Box, inGoodTime())), 100);
}

TEST(VideoFault, AReaderThatCantStartAnewStaysWhole)
{
    const TempFolder folder;
    const fs::path path = folder.write("film.mp4", contentOf(videoOf(Film)));
    PictureReader reader(path, inGoodTime());
    const Ratio timeBase = reader.timeBase();
    const auto picture = owned(av_frame_alloc());

    reader.setDeadline(std::chrono::steady_clock::now() - std::chrono::seconds(1));
    EXPECT_EQ(reasonOf([&] { reader.rewind(); }), Reason::TooSlow);
    reader.setDeadline(inGoodTime());
    fs::remove(path);
    EXPECT_EQ(reasonOf([&] { reader.rewind(); }), Reason::Missing);

    EXPECT_EQ(reader.timeBase(), timeBase);
    EXPECT_TRUE(reader.seek(0));
    EXPECT_TRUE(reader.next(*picture));
}

TEST(VideoFault, WhatWasGivenUpGoesOnAtTheNextRequest)
{
    // One key picture, and so many pictures after it that they aren't decoded in a twentieth of a second.
    const VideoRecipe recipe{"one-group.mp4", 400, "25", "-c:v libx264 -preset ultrafast -g 400 ", 1280, 720};
    VideoFile file(videoOf(recipe), inGoodTime());
    const auto ask = [&](std::uint32_t frame) {
        return numberIn(
            file.picture(frame, {25, 1}, Box, std::chrono::steady_clock::now() + std::chrono::milliseconds(50)));
    };
    const Picture wanted = VideoFile(videoOf(recipe), inGoodTime()).picture(399, {25, 1}, Box, inGoodTime());

    int requests = 1;
    while (requests < 1000 && reasonOf([&] { ask(399); }) == Reason::TooSlow)
        ++requests;

    EXPECT_GT(requests, 1);
    EXPECT_EQ(ask(399), 399);
    EXPECT_TRUE(file.picture(399, {25, 1}, Box, inGoodTime()).pixels == wanted.pixels);
}

TEST(VideoError, EachReasonHasASentenceOfItsOwn)
{
    std::set<std::string> sentences;
    for (const Reason reason :
         {Reason::Missing, Reason::NotOpened, Reason::Unreadable, Reason::NoPicture, Reason::NoSound,
          Reason::UnknownKind, Reason::Broken, Reason::TooLarge, Reason::TooSlow, Reason::PastTheEnd}) {
        const std::string sentence = VideoError(reason).what();
        EXPECT_TRUE(sentence.ends_with(".")) << sentence;
        EXPECT_TRUE(sentences.insert(sentence).second) << sentence;
    }
}

} // namespace standin::tests
