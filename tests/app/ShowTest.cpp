// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/ProgramRun.h"
#include "tests/app/SoundProject.h"

#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <string>
#include <sys/stat.h>
#include <vector>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

json showAsJson(std::vector<std::string> arguments)
{
    arguments.insert(arguments.begin(), "show");
    arguments.insert(arguments.end(), {"--json", "-"});
    const Outcome outcome = runCadrel(arguments);
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    return json::parse(outcome.out);
}

TEST(Show, PrintsTheFactsTheTreeTheContentAndThePool)
{
    const TempFolder folder;
    const std::string file = folder.write("scene.stage", soundProject());

    const Outcome outcome = runCadrel({"show", file});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.err, "");
    EXPECT_EQ(
        outcome.out,
        "Project      scene.stage\n"
        "Frame rate   24 fps\n"
        "Time origin  01:00:00:00\n"
        "End          01:01:00:00, content to 01:00:14:00\n"
        "Locators     01:00:02:00 - 01:00:06:12\n"
        "Cycle        01:00:10:00 - 01:00:12:00\n"
        "Position     01:00:02:00\n"
        "Tracks       4: 2 audio, 1 marker, 1 folder\n"
        "Content      4 clips, 1 part, 2 markers, 3 automation points\n"
        "Pool         2 clips: 2 audio, 0 video\n"
        "\n"
        "track     kind    state     events  automation\n"
        "Dialogue  folder\n"
        "  DIA 1   audio   selected       4  volume 2, curve 40 1\n"
        "FX        audio   locked         1\n"
        "Memos     marker                 2\n"
        "\n"
        "DIA 1 (audio, in Dialogue, selected)\n"
        "  kind    in              out          length          name    clip  from\n"
        "  clip    01:00:02:00     01:00:06:12  00:00:04:12     line 1  42A   00:00:01:06\n"
        "  part    01:00:10:00     01:00:14:00  00:00:04:00     pair\n"
        "    clip  01:00:10:12     01:00:11:00  00:00:00:12     a       42A   00:00:00:00\n"
        "      selected\n"
        "    clip  01:00:12:00     01:00:13:00  00:00:01:00     b       42A   00:00:08:00\n"
        "  volume, 2 points: 01:00:02:00 0.750, 01:00:06:12 0.500\n"
        "  curve 40, 1 point: 01:00:03:00 1.000\n"
        "\n"
        "FX (audio, locked)\n"
        "  kind    in              out          length          name    clip  from\n"
        "  clip    01:00:03:00.25  01:00:04:00  00:00:00:23.75  step    feet  00:00:00:00\n"
        "\n"
        "Memos (marker)\n"
        "  Cadrel's track: Memos\n"
        "  kind    in              out          length          name\n"
        "  marker  01:00:01:00                                  too loud\n"
        "    reel A012C004\n"
        "  range   01:00:03:00     01:00:04:00  00:00:01:00     listen to this one again with the director present\n"
        "\n"
        "clip  kind   length       file\n"
        "42A   audio  00:00:30:00  Audio/42A.wav\n"
        "feet  audio  00:00:10:00  Audio/feet take 1.wav\n");
}

TEST(Show, JsonHasTheFactsWithSecondsBesideTimecodes)
{
    const TempFolder folder;

    const json project = showAsJson({folder.write("scene.stage", soundProject())});

    EXPECT_EQ(project.at("file"), "scene.stage");
    EXPECT_EQ(project.at("name"), "");
    EXPECT_EQ(project.at("frameRate"),
              json::parse(R"({"label": "24 fps", "framesPerSecond": 24, "dropFrame": false, "pulledDown": false})"));
    EXPECT_EQ(project.at("timeOrigin"), json::parse(R"({"seconds": 3600, "timecode": "01:00:00:00"})"));
    EXPECT_EQ(project.at("end"), json::parse(R"({"seconds": 60, "timecode": "01:01:00:00"})"));
    EXPECT_EQ(project.at("locators"), json::parse(R"({"left": {"seconds": 2, "timecode": "01:00:02:00"},
                                                      "right": {"seconds": 6.5, "timecode": "01:00:06:12"}})"));
    EXPECT_EQ(project.at("cycle"), json::parse(R"({"left": {"seconds": 10, "timecode": "01:00:10:00"},
                                                   "right": {"seconds": 12, "timecode": "01:00:12:00"}})"));
    EXPECT_EQ(project.at("position"), json::parse(R"({"seconds": 2, "timecode": "01:00:02:00"})"));
    EXPECT_EQ(project.at("attributes"), json::object());
    EXPECT_EQ(project.at("pool").at(1),
              json::parse(R"({"number": 7, "kind": "audio", "name": "feet", "file": "Audio/feet take 1.wav",
                              "length": {"seconds": 10, "timecode": "00:00:10:00"}})"));
}

TEST(Show, JsonHasTheTracksFromTopToBottomWithAllThatLiesOnThem)
{
    const TempFolder folder;

    const json tracks = showAsJson({folder.write("scene.stage", soundProject())}).at("tracks");

    ASSERT_EQ(tracks.size(), 4U);
    EXPECT_EQ(tracks[0], json::parse(R"({"name": "Dialogue", "kind": "folder", "folders": [], "locked": false,
        "selected": false, "attributes": {}, "events": [], "automation": []})"));
    EXPECT_EQ(tracks[1].at("folders"), json({"Dialogue"}));
    EXPECT_EQ(tracks[1].at("selected"), true);
    EXPECT_EQ(tracks[1].at("events").at(0), json::parse(R"({"kind": "clip", "name": "line 1",
        "start": {"seconds": 2, "timecode": "01:00:02:00"}, "end": {"seconds": 6.5, "timecode": "01:00:06:12"},
        "length": {"seconds": 4.5, "timecode": "00:00:04:12"}, "clip": {"number": 3, "name": "42A"},
        "sourceOffset": {"seconds": 1.25, "timecode": "00:00:01:06"}, "selected": false, "attributes": {}})"));
    // What is in a part has the times of the project, too.
    EXPECT_EQ(tracks[1].at("events").at(1).at("events").at(1).at("start"),
              json::parse(R"({"seconds": 12, "timecode": "01:00:12:00"})"));
    EXPECT_EQ(tracks[1].at("automation"), json::parse(R"([
        {"curve": 1, "name": "volume", "points": [
            {"seconds": 2, "timecode": "01:00:02:00", "value": 0.75},
            {"seconds": 6.5, "timecode": "01:00:06:12", "value": 0.5}]},
        {"curve": 40, "name": "curve 40", "points": [{"seconds": 3, "timecode": "01:00:03:00", "value": 1}]}])"));
    EXPECT_EQ(tracks[2].at("locked"), true);
    EXPECT_EQ(tracks[3].at("attributes"), json::parse(R"({"Cadrel:MarkerType": 7})"));
    EXPECT_EQ(tracks[3].at("events").at(0), json::parse(R"({"kind": "marker", "name": "too loud",
        "start": {"seconds": 1, "timecode": "01:00:01:00"}, "end": {"seconds": 1, "timecode": "01:00:01:00"},
        "length": {"seconds": 0, "timecode": "00:00:00:00"}, "selected": false,
        "attributes": {"CadrEventUserId": 3, "User:STR_MAReel": "A012C004"}})"));
    EXPECT_EQ(tracks[3].at("events").at(1).at("kind"), "range");
}

TEST(Show, JsonGoesToAFileBesideTheText)
{
    const TempFolder folder;
    const std::string file = folder.write("scene.stage", soundProject());

    const Outcome outcome = runCadrel({"show", file, "--json", folder / "scene.json"});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.out, runCadrel({"show", file}).out);
    EXPECT_EQ(json::parse(contentOf(folder / "scene.json")), showAsJson({file}));
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"scene.json", "scene.stage"}));
}

TEST(Show, OneTrackIsShownAlone)
{
    const TempFolder folder;
    const std::string file = folder.write("scene.stage", soundProject());

    const Outcome outcome = runCadrel({"show", file, "--track", "FX"});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.out, "FX (audio, locked)\n"
                           "  kind  in              out          length          name  clip  from\n"
                           "  clip  01:00:03:00.25  01:00:04:00  00:00:00:23.75  step  feet  00:00:00:00\n");
    EXPECT_EQ(showAsJson({file, "--track", "FX"}).at("tracks").size(), 1U);
}

TEST(Show, AFolderIsShownWithAllThatIsInIt)
{
    const TempFolder folder;
    const std::string file = folder.write("scene.stage", soundProject());

    const json tracks = showAsJson({file, "--track", "Dialogue"}).at("tracks");

    ASSERT_EQ(tracks.size(), 2U);
    EXPECT_EQ(tracks[0].at("name"), "Dialogue");
    EXPECT_EQ(tracks[1].at("name"), "DIA 1");
    EXPECT_EQ(runCadrel({"show", file, "--track", "Dialogue"}).out, runCadrel({"show", file, "--track", "DIA 1"}).out);
}

TEST(Show, AllTracksOfANameAreShown)
{
    const TempFolder folder;
    const std::string file = folder.write("twice.stage", projectWith(R"({"kind": "audio", "name": "FX", "events": []},
                                      {"kind": "audio", "name": "MX", "events": []},
                                      {"kind": "folder", "name": "Late",
                                       "tracks": [{"kind": "audio", "name": "FX", "locked": true, "events": []}]})"));

    EXPECT_EQ(runCadrel({"show", file, "--track", "FX"}).out, "FX (audio)\n"
                                                              "  empty\n"
                                                              "\n"
                                                              "FX (audio, in Late, locked)\n"
                                                              "  empty\n");
}

TEST(Show, AnUnknownTrackIsRefusedWithTheNamesThatThereAre)
{
    const TempFolder folder;
    const std::string file = folder.write("scene.stage", soundProject());
    const std::string none = folder.write("none.stage", projectWith(""));

    const Outcome outcome = runCadrel({"show", file, "--track", "dia 1"});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.out, "");
    EXPECT_EQ(outcome.err,
              "cadrel: " + file + ": has no track \"dia 1\"; give one of \"Dialogue\", \"DIA 1\", \"FX\", \"Memos\"\n");
    EXPECT_EQ(runCadrel({"show", none, "--track", "A"}).err,
              "cadrel: " + none + ": has no track \"A\"; it has no tracks at all\n");
}

TEST(Show, OfManyTrackNamesTheFirstAreGiven)
{
    const TempFolder folder;
    std::string tracks;
    for (int number = 1; number <= 42; ++number)
        tracks += std::string(number == 1 ? "" : ", ") + R"({"kind": "audio", "name": "A)" + std::to_string(number) +
                  R"(", "events": []})";

    const Outcome outcome = runCadrel({"show", folder.write("many.stage", projectWith(tracks)), "--track", "A43"});

    EXPECT_NE(outcome.err.find("\"A39\", \"A40\", and 2 more\n"), std::string::npos) << outcome.err;
}

TEST(Show, OfALongCurveTheEndsAreShownAndAllOfItInTheJson)
{
    const TempFolder folder;
    const auto fileWith = [&folder](int points) {
        std::string list;
        for (int index = 0; index < points; ++index)
            list += std::string(index == 0 ? "" : ", ") + R"({"time": )" + std::to_string(index) + R"(, "value": 0.5})";
        return folder.write("curve.stage", projectWith(R"({"kind": "audio", "name": "FX", "curves": [{"number": 2,
            "automates": "pan", "points": [)" + list + R"(]}], "events": []})"));
    };

    EXPECT_NE(runCadrel({"show", fileWith(8)})
                  .out.find("pan, 8 points: 00:00:00:00 0.500, 00:00:01:00 0.500, "
                            "00:00:02:00 0.500, 00:00:03:00 0.500, 00:00:04:00 0.500, "
                            "00:00:05:00 0.500, 00:00:06:00 0.500, 00:00:07:00 0.500\n"),
              std::string::npos);
    const std::string nine = fileWith(9);
    EXPECT_NE(runCadrel({"show", nine})
                  .out.find("pan, 9 points: 00:00:00:00 0.500, 00:00:01:00 0.500, "
                            "00:00:02:00 0.500, 00:00:03:00 0.500, ... 3 more ..., "
                            "00:00:07:00 0.500, 00:00:08:00 0.500\n"),
              std::string::npos);
    EXPECT_EQ(showAsJson({nine}).at("tracks").at(0).at("automation").at(0).at("points").size(), 9U);
}

/// The line of a fact.
std::string factOf(const std::string& project, const std::string& title)
{
    const TempFolder folder;
    const std::string text = std::string("\n").append(runCadrel({"show", folder.write("scene.stage", project)}).out);
    const std::size_t start = text.find("\n" + title);
    return start == std::string::npos ? text : text.substr(start + 1, text.find('\n', start + 1) - start - 1);
}

TEST(Show, TheFrameRateIsNamedWithItsDropFrameAndPullDown)
{
    EXPECT_EQ(factOf(projectAt(30, true, true, 0), "Frame rate"), "Frame rate   29.97 dfps (drop-frame, pulled down)");
    EXPECT_EQ(factOf(projectAt(30, true, false, 0), "Frame rate"), "Frame rate   30 dfps (drop-frame)");
    EXPECT_EQ(factOf(projectAt(24, false, true, 0), "Frame rate"), "Frame rate   23.98 fps (pulled down)");
    EXPECT_EQ(factOf(projectAt(48, false, false, 0), "Frame rate"), "Frame rate   48 fps");
    EXPECT_EQ(factOf(projectAt(23.976, false, false, 0), "Frame rate"), "Frame rate   23.976 fps");
}

TEST(Show, DropFrameLeavesOutTheFirstTwoNumbersOfAMinute)
{
    // 1800 frames at 30 a second.
    EXPECT_EQ(factOf(projectAt(30, true, true, 60), "Time origin"), "Time origin  00:01:00;02");
    EXPECT_EQ(factOf(projectAt(30, false, true, 60), "Time origin"), "Time origin  00:01:00:00");
}

TEST(Show, TheHoursCountOnBehindADayAndWhatLiesBeforeMidnightHasAMinus)
{
    EXPECT_EQ(factOf(projectAt(24, false, false, 86400 + 7200 + 0.5), "Time origin"), "Time origin  26:00:00:12");
    EXPECT_EQ(factOf(projectAt(24, false, false, -0.5), "Time origin"), "Time origin  -00:00:00:12");
    EXPECT_EQ(factOf(projectAt(25, false, false, -1e-9), "Time origin"), "Time origin  00:00:00:00");
    EXPECT_EQ(factOf(projectAt(30, true, true, 86400.0 * 2589408 / 2592000), "Time origin"),
              "Time origin  24:00:00;00");
}

TEST(Show, WhatLiesBetweenFramesHasHundredthsBehindIt)
{
    const double frame = 1.0 / 25;

    EXPECT_EQ(factOf(projectAt(25, false, false, 10.0625 * frame), "Time origin"), "Time origin  00:00:00:10.06");
    EXPECT_EQ(factOf(projectAt(25, false, false, 10.996 * frame), "Time origin"), "Time origin  00:00:00:11");
}

TEST(Show, AttributesOfOthersAreShownAsTheyAre)
{
    const TempFolder folder;
    const std::string file = folder.write(
        "stored.stage",
        projectWith(R"({"kind": "marker", "name": "M", "attributes": {"Cadrel:MarkerType": 99, "Cadrel:LockState": 1}},
                       {"kind": "video", "name": "V", "attributes": {"Cadrel:VideoType": 266, "Cadrel:LockState": 0}})",
                    R"("attributes": {"Other": {"Data": "AAECAw=="}, "Number": 5},)"));

    const std::string shown = runCadrel({"show", file}).out;

    EXPECT_NE(shown.find("Attributes   Number 5\n"
                         "             Other (Data of 4 bytes)\n"),
              std::string::npos)
        << shown;
    EXPECT_NE(shown.find("M (marker)\n  held locked for a preview\n  Cadrel:MarkerType 99\n"), std::string::npos)
        << shown;
    // 266 is 256 and the role 10.
    EXPECT_NE(shown.find("V (video)\n  Cadrel's track: Old Video, with a video of your own\n  empty\n"),
              std::string::npos)
        << shown;
    EXPECT_EQ(showAsJson({file}).at("attributes"), json::parse(R"({"Other": {"Data": {"bytes": 4}}, "Number": 5})"));
    EXPECT_EQ(showAsJson({file}).at("lastRun"), json());
}

TEST(Show, TheCutsAndSettingsOfTheLastRunAreShown)
{
    const TempFolder folder;
    const std::string project = folder.write("scene.stage", soundProject());
    const std::string result = folder / "result.stage";
    ASSERT_EQ(runCadrel({"apply", project, "--old", folder.write("old.edl", oldCut()), "--new",
                         folder.write("new.edl", newCut()), "--preserve", "01:00:00:00", "01:00:20:00", "-o", result,
                         "--force"})
                  .status,
              0);

    const std::string shown = runCadrel({"show", result}).out;
    const json lastRun = showAsJson({result}).at("lastRun");

    EXPECT_NE(shown.find("Old cut      old.edl: 3 events, all valid\n"
                         "New cut      new.edl: 4 events, all valid\n"
                         "Change EDL   1 event, all valid\n"),
              std::string::npos)
        << shown;
    EXPECT_NE(shown.find("Settings     project       --preserve 01:00:00:00 01:00:20:00\n"
                         "             default       --tracks all --match roll --heal normal --vfx none "),
              std::string::npos)
        << shown;
    EXPECT_EQ(shown.find("CaDr"), std::string::npos) << shown;
    EXPECT_EQ(lastRun.at("old"), (json{{"files", {"old.edl"}}, {"events", 3}, {"invalid", 0}}));
    EXPECT_EQ(lastRun.at("new"), (json{{"files", {"new.edl"}}, {"events", 4}, {"invalid", 0}}));
    EXPECT_EQ(lastRun.at("settings").at("preserve"),
              (json{{"value", {"01:00:00:00", "01:00:20:00"}}, {"from", "project"}}));
    EXPECT_EQ(lastRun.at("settings").size(), 16U);
}

TEST(Show, StoredDataThatCantBeReadIsTold)
{
    const TempFolder folder;
    const std::string file = folder.write(
        "stored.stage", projectWith("", R"("attributes": {"CaDr": {"CaDrData": "AAECAw=="}, "CaDs": 5},)"));

    const Outcome outcome = runCadrel({"show", file});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_NE(outcome.out.find("Last run     Cadrel's data in it is damaged: its checksum doesn't fit\n"),
              std::string::npos)
        << outcome.out;
    EXPECT_EQ(showAsJson({file}).at("lastRun"),
              (json{{"unreadable", "Cadrel's data in it is damaged: its checksum doesn't fit"}}));
}

TEST(Show, TheProjectIsShownUnderItsName)
{
    const TempFolder folder;
    const std::string file = folder.write("r3.stage", projectWith("", R"("name": "Reel \u2462",)"));

    EXPECT_TRUE(runCadrel({"show", file}).out.starts_with("Project      r3.stage\nName         Reel \xe2\x91\xa2\n"));
    EXPECT_EQ(showAsJson({file}).at("name"), "Reel \xe2\x91\xa2");
}

TEST(Show, AnEmptyProjectIsShown)
{
    const TempFolder folder;
    const std::string file = folder.write("none.stage", projectWith(""));

    const Outcome outcome = runCadrel({"show", file});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_TRUE(outcome.out.ends_with("Position     00:00:00:00\n"
                                      "Tracks       0\n"
                                      "Content      0 clips, 0 parts, 0 markers, 0 automation points\n"
                                      "Pool         0 clips: 0 audio, 0 video\n"))
        << outcome.out;
    EXPECT_EQ(showAsJson({file}).at("tracks"), json::array());
}

TEST(Show, NamesWithForeignLettersKeepTheColumnsAndWhatControlsATerminalIsShownHarmless)
{
    const TempFolder folder;
    const std::string file =
        folder.write("names.stage", projectWith(R"({"kind": "audio", "name": "M\u00fcller \u001b[31m", "events": [
            {"kind": "clip", "start": 0, "end": 1, "name": "T\u00fcr \u266b"},
            {"kind": "clip", "start": 1, "end": 2, "name": "\u202eabc"},
            {"kind": "clip", "start": 2, "end": 3},
            {"kind": "clip", "start": 3, "end": 4, "name": ")" +
                                                std::string(50, 'N') + R"("}]})"));

    EXPECT_EQ(
        runCadrel({"show", file, "--track", "M\xc3\xbcller \x1b[31m"}).out,
        "M\xc3\xbcller ?[31m (audio)\n"
        "  kind  in           out          length       name                                      clip       from\n"
        "  clip  00:00:00:00  00:00:01:00  00:00:01:00  T\xc3\xbcr \xe2\x99\xab                                     "
        "(no clip)  00:00:00:00\n"
        "  clip  00:00:01:00  00:00:02:00  00:00:01:00  ?abc                                      (no clip)  "
        "00:00:00:00\n"
        "  clip  00:00:02:00  00:00:03:00  00:00:01:00  (no name)                                 (no clip)  "
        "00:00:00:00\n"
        "  clip  00:00:03:00  00:00:04:00  00:00:01:00  NNNNNNNNNNNNNNNNNNNNNNNNNNNNNNNNNNNNNNN\xe2\x80\xa6  (no clip) "
        " 00:00:00:00\n");
    EXPECT_EQ(showAsJson({file}).at("tracks").at(0).at("name"), "M\xc3\xbcller \x1b[31m");
}

TEST(Show, ColourIsForTerminalsOnly)
{
    const TempFolder folder;
    const std::string file = folder.write("scene.stage", soundProject());

    const Outcome onTerminal = runCadrelOnTerminal({"show", file});
    const Outcome withoutColour = runCadrelOnTerminal({"show", file}, "NO_COLOR=1");

    EXPECT_EQ(onTerminal.status, 0);
    EXPECT_NE(onTerminal.out.find("\033[1mDIA 1\033[0m (audio, in Dialogue, \033[32mselected\033[0m)"),
              std::string::npos)
        << onTerminal.out;
    EXPECT_NE(onTerminal.out.find("reading scene.stage\r\033[K"), std::string::npos) << onTerminal.out;
    EXPECT_EQ(withoutColour.out.find("\033[1m"), std::string::npos) << withoutColour.out;
    EXPECT_EQ(runCadrel({"show", file}).out.find('\033'), std::string::npos);
}

/// The work stops with 1 and one line: program, file, what is wrong, what to do.
void expectStopped(const Outcome& outcome, const std::string& file, const std::string& problem)
{
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.out, "");
    EXPECT_EQ(outcome.err, "cadrel: " + file + ": " + problem + "\n");
}

/// Likewise for a file whose content is at fault; the line holds `fault`.
void expectBroken(const std::string& file, const std::string& fault)
{
    const Outcome outcome = runCadrel({"show", file});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.out, "");
    EXPECT_TRUE(outcome.err.starts_with("cadrel: " + file + ": ")) << outcome.err;
    EXPECT_TRUE(outcome.err.ends_with("; take an intact copy, or the version of Cadrel that wrote it\n"))
        << outcome.err;
    EXPECT_EQ(outcome.err.find('\n'), outcome.err.size() - 1) << outcome.err;
    EXPECT_NE(outcome.err.find(fault), std::string::npos) << outcome.err;
    // The name stands there once.
    EXPECT_EQ(outcome.err.find(file, outcome.err.find(file) + 1), std::string::npos) << outcome.err;
}

TEST(BadProject, AFileThatIsNoFile)
{
    const TempFolder folder;
    std::filesystem::create_directory(folder / "reel");
    const std::string pipe = folder / "pipe";
    ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
    const auto expect = [](const std::string& file, const std::string& problem) {
        expectStopped(runCadrel({"show", file}), file, problem);
    };

    expect(folder / "none.stage", "no such file; check the name and the folder");
    expect("", "no such file; check the name and the folder");
    expect(folder / "reel", "is a folder without a session; give the project file in it");
    expect("/dev/zero", "is a device; give a project file");
    expect(pipe, "is a pipe; write it into a file first");
}

TEST(BadProject, AFileWithoutTheRightToRead)
{
    const TempFolder folder;
    const std::string file = folder.write("secret.stage", soundProject());
    std::filesystem::permissions(file, std::filesystem::perms::none);
    giveToUnprivileged(folder.path());

    expectStopped(runCadrelUnprivileged({"show", file}), file,
                  "you may not read it; ask its owner for the right to read");
}

TEST(BadProject, AFileOfAnotherKind)
{
    const TempFolder folder;
    std::string bytes;
    for (int byte = 0; byte < 4096; ++byte)
        bytes += static_cast<char>(byte * 7);

    expectBroken(folder.write("empty.stage", ""), "line 1");
    expectBroken(folder.write("picture.mov", bytes), "line 1");
    expectBroken(folder.write("cut.edl", "TITLE: OLD\n"), "line 1");
    expectBroken(folder.write("other.json", "{\"events\": []}"), "format");
}

TEST(BadProject, AProjectThatBreaksOff)
{
    const TempFolder folder;
    const std::string text = soundProject();

    expectBroken(folder.write("half.stage", text.substr(0, text.size() / 2)), "line ");
}

TEST(BadProject, AProjectOfANewerVersion)
{
    const TempFolder folder;
    std::string text = soundProject();
    text.replace(text.find("\"version\": 1"), 12, "\"version\": 9");

    expectBroken(folder.write("newer.stage", text), "newer version");
}

TEST(BadProject, ANameCantForgeASecondLine)
{
    const TempFolder folder;
    const std::string file = folder.write("a\nb.stage", "{}");

    const Outcome outcome = runCadrel({"show", file});

    EXPECT_TRUE(outcome.err.starts_with("cadrel: " + (folder / "a?b.stage").string() + ": format")) << outcome.err;
    EXPECT_EQ(outcome.err.find('\n'), outcome.err.size() - 1) << outcome.err;
}

TEST(BadProject, AFaultWithItsPlace)
{
    const TempFolder folder;
    const std::string file = folder.write("clip.stage", projectWith(R"({"kind": "audio", "name": "FX", "events": [
        {"kind": "clip", "start": 0, "end": 1, "clip": 12}]})"));

    expectBroken(file, "tracks[0].events[0].clip");
}

TEST(BadProject, ARateAtWhichNoTimecodeCounts)
{
    const TempFolder folder;
    const std::string file = folder.write("rate.stage", projectAt(24, true, false, 0));

    expectBroken(file, "dropFrame: is true, but timecode is drop-frame at 30 frames per second (29.97) alone");
}

TEST(BadProject, ALineOf100Megabytes)
{
    const TempFolder folder;
    const std::string file = folder / "long.stage";
    const std::string text = soundProject();
    const std::size_t name = text.find("DIA 1");
    {
        std::ofstream stream(file, std::ios::binary);
        stream << text.substr(0, name);
        const std::string part(1000000, 'N');
        for (int count = 0; count < 100; ++count)
            stream << part;
        stream << text.substr(name + 5);
    }

    const Outcome outcome = runCadrel({"show", file});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.err, "");
    EXPECT_NE(outcome.out.find("\n" + std::string(39, 'N') + "… (audio, in Dialogue, selected)\n"), std::string::npos);
}

TEST(BadProject, NamesOfFilesWithBlanksAndForeignLettersAreGood)
{
    const TempFolder folder;
    const std::string file = folder.write("Rolle 3 \xc3\xa4lt \xe6\x96\xb0.stage", soundProject());

    const Outcome outcome = runCadrel({"show", file});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_TRUE(outcome.out.starts_with("Project      Rolle 3 \xc3\xa4lt \xe6\x96\xb0.stage\n")) << outcome.out;
}

TEST(BadProject, ANameThatIsNoUtf8)
{
    const TempFolder folder;
    const std::string file = folder.write("caf\xe9.stage", soundProject());

    expectStopped(runCadrel({"show", file}), (folder / "caf\xc3\xa9.stage").string(),
                  "the name is no UTF-8 text; rename the file or its folder");
}

TEST(BadProject, WrongUsage)
{
    const TempFolder folder;
    const std::string file = folder.write("scene.stage", soundProject());

    EXPECT_EQ(runCadrel({"show"}).err, "cadrel: PROJECT is required; see --help\n");
    EXPECT_EQ(runCadrel({"show"}).status, 2);
    EXPECT_EQ(runCadrel({"show", file, file}).status, 2);
    EXPECT_EQ(runCadrel({"show", file, "--track", ""}).status, 2);
    EXPECT_EQ(runCadrel({"show", file, "--json", ""}).status, 2);
    EXPECT_EQ(runCadrel({"show", file, "--json", file}).status, 2);
    EXPECT_EQ(contentOf(file), soundProject());
}

TEST(BadProject, AnOutputThatTakesNothing)
{
    const TempFolder folder;
    const std::string file = folder.write("scene.stage", soundProject());

    expectStopped(runCadrel({"show", file}, "/dev/full"), "standard output",
                  "can't be written; see whether the disk is full");
    expectStopped(runCadrel({"show", file, "--json", "-"}, "/dev/full"), "standard output",
                  "can't be written; see whether the disk is full");
    expectStopped(runCadrel({"show", file, "--json", folder / "none/a.json"}), folder / "none/a.json",
                  "the folder does not exist; make it or give another");
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"scene.stage"}));
}

} // namespace
