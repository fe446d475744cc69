// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/VideoThumbnailFactory.h"

#include "standin/base/FilePath.h"
#include "standin/services/ThumbnailImage.h"
#include "standin/video/VideoError.h"
#include "standin/video/Videos.h"
#include "tests/support/TempFolder.h"
#include "tests/support/standin/TestHost.h"
#include "tests/support/video/TestVideos.h"

#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <string>
#include <vector>

#include <sys/stat.h>

using namespace Velmark;

namespace standin::tests {

namespace fs = std::filesystem;

using cadrel::tests::contentOf;
using cadrel::tests::TempFolder;
using cadrel::tests::writeFile;

namespace {

constexpr int Width = 320;
constexpr int Height = 240;
const VideoRecipe Film{"thumbnails.mp4", 96, "24", "-c:v libx264 -preset veryfast -pix_fmt yuv420p -g 24 "};
const VideoRecipe OtherFilm{"others.mp4", 200, "24", "-c:v libx264 -preset veryfast -pix_fmt yuv420p -g 24 "};

/// A stored project in a folder, with clips whose files may be there, and a thumbnail factory.
struct VideoHost : TestHost {
    VideoHost() { project.setPath((folder / "reel.stage").u16string()); }

    Picture draw(MediaClip& clip, uint32 frame)
    {
        const int32 wanted[2] = {Width, Height};
        EXPECT_EQ(factory->setSource(&clip, wanted), ResultOk);
        const auto image = Counted<IThumbnailImage>::adopt(factory->getImage(frame));
        Picture picture;
        if (!image)
            return picture;
        int32 size[2] = {};
        EXPECT_EQ(image->getSize(size), ResultOk);
        picture.size = {size[0], size[1]};
        picture.pixels.resize(static_cast<std::size_t>(size[0] * size[1] * 4));
        const int32 all[4] = {0, 0, size[0], size[1]};
        EXPECT_EQ(image->read(picture.pixels.data(), size[0] * 4, all, 0), ResultOk);
        return picture;
    }
    int numberAt(MediaClip& clip, uint32 frame) { return numberIn(draw(clip, frame)); }

    /// Whether the picture is the reason and those paths, after the name of the clip.
    void expectReason(MediaClip& clip, uint32 frame, VideoError::Reason reason, const std::vector<fs::path>& paths)
    {
        const std::string sentence = VideoError(reason).what();
        std::vector<std::u16string> paragraphs{clip.name(), std::u16string(sentence.begin(), sentence.end())};
        for (const fs::path& path : paths)
            paragraphs.push_back(path.u16string());
        const auto expected =
            makeCounted<ThumbnailImage>(Width, Height, ThumbnailImage::linesOf(paragraphs, Width, Height));
        std::vector<std::uint8_t> pixels(Width * Height * 4);
        const int32 all[4] = {0, 0, Width, Height};
        expected->read(pixels.data(), Width * 4, all, 0);
        const Picture drawn = draw(clip, frame);
        EXPECT_EQ(drawn.size, (PictureSize{Width, Height}));
        EXPECT_TRUE(drawn.pixels == pixels);
    }

    TempFolder folder;
    Counted<VideoThumbnailFactory> factory = makeCounted<VideoThumbnailFactory>();
};

} // namespace

TEST(VideoThumbnailFactory, DrawsTheFrameOfTheFile)
{
    VideoHost host;
    MediaClip& clip = host.addVideo(videoOf(Film).u16string().c_str(), 4.0);

    EXPECT_EQ(host.draw(clip, 0).size, (PictureSize{320, 192})) << "It fits what was asked for, and isn't stretched.";
    for (const uint32 frame : {0U, 1U, 40U, 41U, 95U})
        EXPECT_EQ(host.numberAt(clip, frame), static_cast<int>(frame));
}

TEST(VideoThumbnailFactory, HasTheFramesOfTheClipAndNoMore)
{
    VideoHost host;
    MediaClip& clip = host.addVideo(videoOf(Film).u16string().c_str(), 2.0);

    EXPECT_EQ(host.numberAt(clip, 47), 47);
    EXPECT_TRUE(host.draw(clip, 48).pixels.empty());
    EXPECT_FALSE(makeCounted<VideoThumbnailFactory>()->getImage(0));
}

TEST(VideoThumbnailFactory, CountsFramesOfTheProject)
{
    VideoHost host;
    MediaClip& clip = host.addVideo(videoOf(Film).u16string().c_str(), 4.0);
    host.project.setFrameRate({48.0, 0});

    EXPECT_EQ(host.numberAt(clip, 80), 40);
    EXPECT_EQ(host.numberAt(clip, 191), 95);
}

TEST(VideoThumbnailFactory, RefusesWhatIsNoVideoOrNoSize)
{
    VideoHost host;
    MediaClip& video = host.addVideo(videoOf(Film).u16string().c_str(), 4.0);
    const int32 sizes[][2] = {{0, 9}, {16, -1}, {8193, 1}};
    const int32 size[2] = {16, 9};

    for (const auto& bad : sizes)
        EXPECT_NE(host.factory->setSource(&video, bad), ResultOk);
    EXPECT_NE(host.factory->setSource(&video, nullptr), ResultOk);
    EXPECT_NE(host.factory->setSource(nullptr, size), ResultOk);
    EXPECT_NE(host.factory->setSource(&host.addMedia(u"/sound/door.wav", 5.0), size), ResultOk);
    EXPECT_EQ(host.factory->getImage(0), nullptr);
}

TEST(VideoThumbnailFactory, TellsWhichFilesItHasLookedFor)
{
    VideoHost host;
    const fs::path folder = host.folder.path();
    MediaClip& absolute = host.addVideo(u"/nowhere/A.mov", 4.0);
    MediaClip& relative = host.addVideo(u"Video/B.mov", 4.0);
    MediaClip& beside = host.addVideo(u"C.mov", 4.0);
    MediaClip& foreign = host.addVideo(u"D:\\Video\\D.mov", 4.0);

    host.expectReason(absolute, 0, VideoError::Reason::Missing, {"/nowhere/A.mov", folder / "A.mov"});
    host.expectReason(relative, 0, VideoError::Reason::Missing, {folder / "Video/B.mov", folder / "B.mov"});
    host.expectReason(beside, 0, VideoError::Reason::Missing, {folder / "C.mov"});
    host.expectReason(foreign, 0, VideoError::Reason::Missing, {folder / "D:\\Video\\D.mov", folder / "D.mov"});
}

TEST(VideoThumbnailFactory, FindsAFileThatHasMovedBesideTheProject)
{
    VideoHost host;
    MediaClip& absolute = host.addVideo(u"/nowhere/film.mp4", 4.0);
    MediaClip& relative = host.addVideo(u"Video/film.mp4", 4.0);

    fs::copy_file(videoOf(Film), host.folder / "film.mp4");

    EXPECT_EQ(host.numberAt(absolute, 12), 12);
    EXPECT_EQ(host.numberAt(relative, 13), 13);

    fs::create_directory(host.folder / "Video");
    fs::copy_file(videoOf({"other-rate.mp4", 48, "12", Film.options}), host.folder / "Video" / "film.mp4");
    EXPECT_EQ(host.numberAt(relative, 13), 6) << "What the project names comes before what lies beside it.";
}

TEST(VideoThumbnailFactory, LooksBesideTheProjectWhereItIsStoredNow)
{
    VideoHost host;
    const TempFolder other;
    MediaClip& clip = host.addVideo(u"film.mp4", 4.0);
    fs::copy_file(videoOf(Film), other / "film.mp4");
    host.expectReason(clip, 0, VideoError::Reason::Missing, {host.folder / "film.mp4"});

    host.project.setPath((other / "reel.stage").u16string());

    EXPECT_EQ(host.numberAt(clip, 12), 12);
}

TEST(VideoThumbnailFactory, TellsWhyThereIsNoPicture)
{
    VideoHost host;
    const fs::path text = host.folder.write("text.mov", "no film");
    const fs::path sound = host.folder / "sound.wav";
    ASSERT_EQ(std::system(("ffmpeg -nostdin -v error -f lavfi -i sine=duration=1 '" + sound.string() + "'").c_str()),
              0);
    const fs::path film = videoOf(Film);

    host.expectReason(host.addVideo(u"text.mov", 4.0), 0, VideoError::Reason::Unreadable, {text});
    host.expectReason(host.addVideo(u"sound.wav", 4.0), 0, VideoError::Reason::NoPicture, {sound});
    host.expectReason(host.addVideo(film.u16string().c_str(), 5.0), 96, VideoError::Reason::PastTheEnd, {film});
}

TEST(VideoThumbnailFactory, GivesUpWhatTakesTooLongBeforeItsModuleDoes)
{
    VideoHost host;
    const fs::path one = host.folder / "one.mjpeg";
    ASSERT_EQ(
        std::system(
            ("ffmpeg -nostdin -v error -f lavfi -i testsrc2=s=4096x2304 -frames:v 1 '" + one.string() + "'").c_str()),
        0);
    // Nothing tells how long this is, so that all of it has to be decoded.
    std::string many;
    const std::string picture = contentOf(one);
    for (int number = 0; number < 400; ++number)
        many += picture;
    const fs::path slow = host.folder.write("slow.mjpeg", many);
    constexpr std::chrono::seconds PatienceOfTheModule{2};

    const auto begun = std::chrono::steady_clock::now();
    host.expectReason(host.addVideo(u"slow.mjpeg", 4.0), 90, VideoError::Reason::TooSlow, {slow});

    EXPECT_LT(std::chrono::steady_clock::now() - begun, PatienceOfTheModule);
    EXPECT_EQ(host.numberAt(host.addVideo(videoOf(Film).u16string().c_str(), 4.0), 40), 40);
}

TEST(VideoThumbnailFactory, DoesNotWaitForWhatComesThroughAPipe)
{
    VideoHost host;
    const fs::path pipe = host.folder / "pipe.mov";
    ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);

    host.expectReason(host.addVideo(u"pipe.mov", 4.0), 0, VideoError::Reason::NotOpened, {pipe});

    EXPECT_EQ(host.numberAt(host.addVideo(videoOf(Film).u16string().c_str(), 4.0), 40), 40);
}

TEST(VideoThumbnailFactory, NoticesThatTheOpenFileWasDeletedAndCameBack)
{
    VideoHost host;
    const fs::path file = host.folder / "film.mp4";
    fs::copy_file(videoOf(Film), file);
    MediaClip& clip = host.addVideo(u"film.mp4", 4.0);
    ASSERT_EQ(host.numberAt(clip, 10), 10);

    fs::remove(file);
    host.expectReason(clip, 11, VideoError::Reason::Missing, {file});
    fs::copy_file(videoOf(Film), file);
    EXPECT_EQ(host.numberAt(clip, 12), 12);
}

TEST(VideoThumbnailFactory, NoticesThatTheOpenFileWasCutShort)
{
    VideoHost host;
    const fs::path file = host.folder.write("film.mp4", contentOf(videoOf(Film)));
    MediaClip& clip = host.addVideo(u"film.mp4", 4.0);
    ASSERT_EQ(host.numberAt(clip, 10), 10);

    // The index of this file stands at its end.
    fs::resize_file(file, fs::file_size(file) / 2);

    host.expectReason(clip, 10, VideoError::Reason::Unreadable, {file});
}

TEST(VideoThumbnailFactory, NoticesThatTheOpenFileWasReplaced)
{
    VideoHost host;
    const fs::path file = host.folder / "film.mp4";
    fs::copy_file(videoOf(Film), file);
    MediaClip& clip = host.addVideo(u"film.mp4", 8.0);
    host.expectReason(clip, 150, VideoError::Reason::PastTheEnd, {file});

    fs::copy_file(videoOf(OtherFilm), host.folder / "new.mp4");
    fs::rename(host.folder / "new.mp4", file);
    EXPECT_EQ(host.numberAt(clip, 150), 150);

    writeFile(file, contentOf(videoOf(Film)));
    EXPECT_EQ(host.numberAt(clip, 95), 95);
    host.expectReason(clip, 150, VideoError::Reason::PastTheEnd, {file});
}

TEST(VideoThumbnailFactory, ChangesFromOneFileToTheOtherAtACut)
{
    VideoHost host;
    MediaClip& one = host.addVideo(videoOf(Film).u16string().c_str(), 4.0);
    MediaClip& other = host.addVideo(videoOf(OtherFilm).u16string().c_str(), 8.0);

    EXPECT_EQ(host.numberAt(one, 95), 95);
    EXPECT_EQ(host.numberAt(other, 0), 0);
    EXPECT_EQ(host.numberAt(one, 94), 94);
    EXPECT_EQ(host.numberAt(other, 191), 191);
}

TEST(Videos, BringAVideoIntoThePoolWithItsTrueLengthAndRate)
{
    Videos videos;
    Application application(Terminal(), &videos);
    Project& project = application.createProject();
    const fs::path file = videoOf({"imported.mov", 301, "30000/1001", Film.options});
    const auto path = makeCounted<FilePath>(file.u16string());

    const auto clip = query<IMediaClip>(project.pool().import(path.get()));

    ASSERT_TRUE(clip);
    // 301 * 1001 / 30000 seconds are 241.04 frames of 24, of which 241 have their middle before the end.
    EXPECT_EQ(clip->getFrameCount(), 241U);
    EXPECT_EQ(project.pool().count(TypeWord::Video), 1);
    EXPECT_EQ(project.pool().clipWith(1)->fileRate(), 30000.0 / 1001.0);
    EXPECT_EQ(project.pool().clipWith(1)->path(), file.u16string());
    EXPECT_TRUE(project.hasChanges());
    EXPECT_EQ(query<IMediaClip>(project.pool().import(path.get())), clip) << "Only once.";
    EXPECT_EQ(project.pool().count(TypeWord::Video), 1);
}

TEST(Videos, CountInFramesOfTheProjectThatIsPulledDown)
{
    Videos videos;
    Application application(Terminal(), &videos);
    Project& project = application.createProject();
    project.setFrameRate({29.97, FrameRateInfo::Flag::DropFrame});
    const auto path = makeCounted<FilePath>(videoOf({"imported.mov", 301, "30000/1001", Film.options}).u16string());

    const auto clip = query<IMediaClip>(project.pool().import(path.get()));

    ASSERT_TRUE(clip);
    EXPECT_EQ(clip->getFrameCount(), 301U);
}

TEST(Videos, RefuseWhatIsNoFilm)
{
    const TempFolder folder;
    Videos videos;
    Application application(Terminal(), &videos);
    Project& project = application.createProject();
    const auto import = [&](const fs::path& file) {
        return project.pool().import(makeCounted<FilePath>(file.u16string()).get());
    };

    EXPECT_EQ(import("/nowhere/film.mov"), nullptr);
    EXPECT_EQ(import(""), nullptr);
    const fs::path file = folder.write("film.mp4", "not yet a film");
    EXPECT_EQ(import(file), nullptr);
    EXPECT_EQ(import(file), nullptr);
    EXPECT_EQ(project.pool().count(TypeWord::Video), 0);

    writeFile(file, contentOf(videoOf(Film)));
    EXPECT_NE(import(file), nullptr) << "It is looked at again once it has changed.";
}

TEST(Videos, MakeTheThumbnailFactoryOfTheHost)
{
    Videos videos;
    Application application(Terminal(), &videos);
    const auto objects = service<IObjectFactory>(application.context());

    FUnknown* const object = objects->createObject(IObjectFactory::ThumbnailClass, IObjectFactory::ThumbnailType);

    EXPECT_NE(dynamic_cast<VideoThumbnailFactory*>(object), nullptr);
    EXPECT_EQ(objects->releaseObject(object), ResultOk);
}

} // namespace standin::tests
