// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/changes/ChangeLog.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Project.h"
#include "tests/app/ProgramRun.h"
#include "tests/support/TempFolder.h"
#include "tests/support/video/TestVideos.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <string>

namespace cadrel::tests {

namespace fs = std::filesystem;

using standin::MediaClip;

namespace {

/// A project of 24 frames a second in a folder of its own.
struct StoredPool {
    void add(MediaClip::Kind kind, const char16_t* path, double length)
    {
        project->pool().add(Velmark::makeCounted<MediaClip>(kind, path, length));
    }
    Outcome show() const
    {
        standin::ProjectFile::write(*project, folder / "reel.stage");
        return runCadrel({"show", (folder / "reel.stage").string(), "--media"});
    }

    TempFolder folder;
    standin::ChangeLog log;
    Velmark::Counted<standin::Project> project = Velmark::makeCounted<standin::Project>(log);
};

/// The line that begins with the word.
std::string lineOf(const std::string& text, const std::string& word)
{
    const std::size_t start = text.find("\n" + word + " ");
    return start == std::string::npos ? "" : text.substr(start + 1, text.find('\n', start + 1) - start - 1);
}

bool has(const std::string& text, const std::string& part)
{
    return text.find(part) != std::string::npos;
}

} // namespace

TEST(ShowMedia, TellsRateAndLengthOfWhatIsThereAndWhatIsMissing)
{
    StoredPool pool;
    pool.add(MediaClip::Kind::Video, u"film.mov", 10.0);
    pool.add(MediaClip::Kind::Video, u"Video/lost.mov", 10.0);
    pool.add(MediaClip::Kind::Audio, u"tone.wav", 2.0);
    pool.add(MediaClip::Kind::Video, u"text.mov", 1.0);
    fs::copy_file(standin::tests::videoOf({"shown.mov", 60, "24000/1001", "-c:v libx264 -pix_fmt yuv420p "}),
                  pool.folder / "film.mov");
    pool.folder.write("text.mov", "no film");
    ASSERT_EQ(runProgram("/usr/bin/ffmpeg", {"-nostdin", "-v", "error", "-f", "lavfi", "-i",
                                             "sine=duration=2:sample_rate=44100", (pool.folder / "tone.wav").string()})
                  .status,
              0);

    const Outcome outcome = pool.show();

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(outcome.out.substr(0, outcome.out.find('\n')), "Media   4 clips: 1 missing, 1 that can't be used");
    // 60 frames of 23.976 take 60.06 of 24, of which 60 have their middle before the end.
    const std::string film = lineOf(outcome.out, "film");
    EXPECT_TRUE(has(film, "00:00:10:00") && has(film, "00:00:02:12") && has(film, "23.976 fps")) << film;
    EXPECT_TRUE(has(film, (pool.folder / "film.mov").string())) << film;
    const std::string lost = lineOf(outcome.out, "lost");
    EXPECT_TRUE(has(lost, "missing, looked for " + (pool.folder / "Video/lost.mov").string() + ", " +
                              (pool.folder / "lost.mov").string()))
        << lost;
    const std::string tone = lineOf(outcome.out, "tone");
    EXPECT_TRUE(has(tone, "44100 Hz") && has(tone, "00:00:02:00")) << tone;
    EXPECT_TRUE(has(lineOf(outcome.out, "text"), "text.mov: The file has no picture or sound that can be read."))
        << outcome.out;
}

TEST(ShowMedia, RefusesWhatGoesWithTracks)
{
    const StoredPool pool;

    EXPECT_EQ(runCadrel({"show", "reel.stage", "--media", "--track", "DIA 1"}).status, 2);
    EXPECT_EQ(runCadrel({"show", "reel.stage", "--media", "--json", "-"}).status, 2);
}

TEST(ShowMedia, RefusesAProjectThatIsNotThere)
{
    const Outcome outcome = runCadrel({"show", "/nowhere/reel.stage", "--media"});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_TRUE(has(outcome.err, "/nowhere/reel.stage")) << outcome.err;
}

} // namespace cadrel::tests
