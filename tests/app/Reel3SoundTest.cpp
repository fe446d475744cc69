// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/ProgramRun.h"
#include "tests/support/TreePaths.h"

#include <algorithm>
#include <cmath>
#include <gtest/gtest.h>
#include <map>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

const std::string Reel3 = treePath("examples/reel3/");

json jsonOf(std::vector<std::string> arguments)
{
    arguments.insert(arguments.end(), {"--json", "-"});
    const Outcome outcome = runCadrel(arguments);
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    return json::parse(outcome.out);
}

/// The tracks of the sound project, and what the tests ask of them.
class Reel3Sound : public testing::Test {
protected:
    const json& project() const { return m_project; }

    const json& track(const std::string& name) const
    {
        const json& tracks = m_project.at("tracks");
        return *std::find_if(tracks.begin(), tracks.end(),
                             [&name](const json& track) { return track["name"] == name; });
    }

    /// Of the audio tracks in folders, without the locked ones; those in parts, too.
    std::vector<json> soundClips() const
    {
        std::vector<json> clips;
        for (const json& track : m_project.at("tracks")) {
            if (track.at("kind") == "audio" && !track.at("locked"))
                appendClips(track, clips);
        }
        return clips;
    }

    /// The times at which the picture is cut, in frames from the start of the reel.
    std::vector<double> pictureCuts() const
    {
        std::vector<double> cuts;
        const json picture = jsonOf({"list", Reel3 + "reel3_v07.edl"});
        for (const json& event : picture.at("events")) {
            const std::string in = event.at("dstIn");
            cuts.push_back(((std::stoi(in.substr(0, 2)) - 3) * 3600 + std::stoi(in.substr(3, 2)) * 60 +
                            std::stoi(in.substr(6, 2))) *
                               24.0 +
                           std::stoi(in.substr(9, 2)));
        }
        return cuts;
    }

private:
    static void appendClips(const json& parent, std::vector<json>& clips)
    {
        for (const json& event : parent.at("events")) {
            if (event.at("kind") == "clip")
                clips.push_back(event);
            else
                appendClips(event, clips);
        }
    }

    const json m_project = jsonOf({"show", Reel3 + "reel3.stage"});
};

double frameOf(const json& time)
{
    return time.at("seconds").get<double>() * 24.0;
}

TEST_F(Reel3Sound, IsMadeAgainByteForByte)
{
    const TempFolder folder;
    const std::string file = folder / "reel3.stage";

    const Outcome outcome = runProgram(programPath("make_reel3"), {Reel3 + "reel3_v07.edl", file});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    // Not EXPECT_EQ, which would print both.
    EXPECT_TRUE(contentOf(file) == contentOf(Reel3 + "reel3.stage"));
}

TEST_F(Reel3Sound, BeginsAtTheThirdHourOfTheReelAndFillsIt)
{
    EXPECT_EQ(project().at("timeOrigin"), json::parse(R"({"seconds": 10800, "timecode": "03:00:00:00"})"));
    EXPECT_EQ(project().at("frameRate").at("label"), "24 fps");
    EXPECT_EQ(track("Old Video").at("events").at(0).at("end").at("timecode"), "03:15:30:21");
}

TEST_F(Reel3Sound, Has300ClipsOnTwelveTracksInFolders)
{
    const json& tracks = project().at("tracks");
    const auto isLaid = [](const json& track) {
        return track.at("kind") == "audio" && !track.at("locked") && track.at("folders").size() == 1U;
    };

    EXPECT_EQ(std::count_if(tracks.begin(), tracks.end(), isLaid), 12);
    EXPECT_EQ(soundClips().size(), 300U);
}

TEST_F(Reel3Sound, HasItsTracksInTheFoldersOfASoundEdit)
{
    std::map<std::string, std::vector<std::string>> folders;
    for (const json& track : project().at("tracks")) {
        if (track.at("folders").size() == 1U)
            folders[track.at("folders").at(0)].push_back(track.at("name"));
    }

    EXPECT_EQ(folders.at("Dialogue"), (std::vector<std::string>{"DIA 1", "DIA 2", "DIA 3"}));
    EXPECT_EQ(folders.at("Effects"), (std::vector<std::string>{"FX 1", "FX 2", "FX 3"}));
    EXPECT_EQ(folders.at("Foley"), (std::vector<std::string>{"Feet", "Props"}));
    EXPECT_EQ(folders.at("Atmospheres"), (std::vector<std::string>{"ATM 1", "ATM 2"}));
    EXPECT_EQ(folders.at("Music"), (std::vector<std::string>{"MX 1", "MX 2"}));
}

TEST_F(Reel3Sound, IsMixedAndHasMemos)
{
    const json& volume = track("MX 1").at("automation").at(0);
    const json& memos = track("Memos").at("events");

    EXPECT_EQ(volume.at("name"), "volume");
    EXPECT_GE(volume.at("points").size(), 10U);
    EXPECT_GE(memos.size(), 5U);
    EXPECT_TRUE(std::all_of(memos.begin(), memos.end(), [](const json& memo) { return memo.at("name") != ""; }));
}

TEST_F(Reel3Sound, HasTheTracksThatAConformKnowsByTheirRole)
{
    EXPECT_EQ(track("Old Video").at("attributes"), json::parse(R"({"Cadrel:VideoType": 10})"));
    EXPECT_EQ(track("Memos").at("attributes"), json::parse(R"({"Cadrel:MarkerType": 7})"));
    EXPECT_EQ(track("Cadrel Markers").at("attributes"), json::parse(R"({"Cadrel:FolderType": 9})"));
    EXPECT_EQ(track("Guide").at("locked"), true);
    EXPECT_EQ(track("DIA 1").at("selected"), true);
}

TEST_F(Reel3Sound, LiesOverThePictureCutsAndNotOnThem)
{
    const std::vector<double> cuts = pictureCuts();
    std::ptrdiff_t over = 0;
    std::ptrdiff_t on = 0;
    for (const json& clip : soundClips()) {
        const double start = frameOf(clip.at("start"));
        const double end = frameOf(clip.at("end"));
        const auto isIn = [&](double cut) { return start < cut && cut < end; };
        const auto isAt = [&](double cut) { return std::abs(cut - start) < 0.01 || std::abs(cut - end) < 0.01; };
        over += std::any_of(cuts.begin(), cuts.end(), isIn) ? 1 : 0;
        on += std::any_of(cuts.begin(), cuts.end(), isAt) ? 1 : 0;
    }

    EXPECT_GE(over, 250);
    // Music is cut with the picture at times.
    EXPECT_LE(on, 5);
}

TEST_F(Reel3Sound, NoClipReachesBeyondItsFile)
{
    const json& pool = project().at("pool");
    for (const json& clip : soundClips()) {
        const auto file = std::find_if(pool.begin(), pool.end(), [&clip](const json& candidate) {
            return candidate.at("number") == clip.at("clip").at("number");
        });
        ASSERT_NE(file, pool.end());
        EXPECT_LE(clip.at("sourceOffset").at("seconds").get<double>() + clip.at("length").at("seconds").get<double>(),
                  file->at("length").at("seconds").get<double>())
            << clip;
    }
}

TEST_F(Reel3Sound, DialogueIsInSyncWithThePictureOfItsShot)
{
    // Shot 45A: its sound file is the longer by the run-up before the first frame that the cut uses, 09:48:38:08.
    const json events = jsonOf({"list", Reel3 + "reel3_v07.edl"}).at("events");
    const auto picture =
        std::find_if(events.begin(), events.end(), [](const json& event) { return event["dstIn"] == "03:07:11:17"; });
    ASSERT_EQ(picture->at("clip"), "45A-2 MAREN MS");
    ASSERT_EQ(picture->at("srcIn"), "09:48:52:18");
    const json& clips = track("DIA 1").at("events");
    const double cut = (7 * 60 + 11) * 24 + 17;
    const auto sound = std::find_if(clips.begin(), clips.end(), [cut](const json& clip) {
        return frameOf(clip.at("start")) <= cut && frameOf(clip.at("end")) > cut;
    });
    ASSERT_NE(sound, clips.end());

    // Recording starts at the full second at or before 15 seconds ahead of 09:48:38:08, which is 09:48:23:00.
    const double fromFileStart = frameOf(sound->at("sourceOffset")) + cut - frameOf(sound->at("start"));

    EXPECT_NEAR(fromFileStart, (52 - 23) * 24 + 18, 0.01);
}

TEST_F(Reel3Sound, CanBeReadInATextEditor)
{
    const std::string text = contentOf(Reel3 + "reel3.stage");

    EXPECT_LT(text.size(), 400000U);
    std::size_t longest = 0;
    for (std::size_t start = 0; start < text.size();) {
        const std::size_t end = text.find('\n', start);
        longest = std::max(longest, end - start);
        start = end + 1;
    }
    EXPECT_LT(longest, 200U);
}

TEST_F(Reel3Sound, TheProgramThatMakesItTellsWhatItCantRead)
{
    const TempFolder folder;
    const Outcome outcome = runProgram(programPath("make_reel3"), {folder / "none.edl", folder / "reel3.stage"});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.err, "make_reel3: " + (folder / "none.edl").string() + ": can't be read\n");
    EXPECT_EQ(runProgram(programPath("make_reel3"), {}).status, 2);
    EXPECT_TRUE(folder.names().empty());
}

} // namespace
