// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/ProgramRun.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

/// A cut, a dissolve in two lines and an audio event of twice the speed.
std::string mixedFilm()
{
    return "001  A001  V  C  10:00:00:00 10:00:04:00 01:00:00:00 01:00:04:00\n"
           "* FROM CLIP NAME: ONE\n"
           "002  A001  V  C  10:00:04:00 10:00:04:00 01:00:04:00 01:00:04:00\n"
           "002  A002  V  D  012  11:00:00:00 11:00:02:00 01:00:04:00 01:00:06:00\n"
           "* FROM CLIP NAME: ONE\n"
           "* TO CLIP NAME: TWO\n"
           "003  A003  A  C  12:00:00:00 12:00:04:12 01:00:06:00 01:00:08:06\n";
}

json listAsJson(std::vector<std::string> arguments)
{
    arguments.insert(arguments.begin(), "list");
    arguments.insert(arguments.end(), {"--json", "-"});
    const Outcome outcome = runCadrel(arguments);
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    return json::parse(outcome.out);
}

TEST(List, ShowsATableWithTheFlawsUnderTheirEventsAndTheTotals)
{
    const TempFolder folder;
    const std::string file = folder.write("film.edl", mixedFilm());

    const Outcome outcome = runCadrel({"list", file});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.err, "");
    EXPECT_EQ(outcome.out, //
              "state   event  roll  clip  file      trans  src in       src out      dst in       dst out      speed\n"
              "ok      001    A001  ONE   film.edl  C      10:00:00:00  10:00:04:00  01:00:00:00  01:00:04:00   1.00\n"
              "ok      002    A001  ONE   film.edl  C      10:00:04:00  10:00:04:00  01:00:04:00  01:00:04:00   1.00\n"
              "ok      002    A002  TWO   film.edl  D 012  11:00:00:00  11:00:02:00  01:00:04:00  01:00:06:00   1.00\n"
              "format  003    A003        film.edl  C      12:00:00:00  12:00:04:12  01:00:06:00  01:00:08:06   2.00\n"
              "          Not a video event.\n"
              "\n"
              "Events      4, 1 invalid\n"
              "            3 cuts, 1 dissolve, 0 wipes, 0 retimed\n"
              "Programme   01:00:00:00 - 01:00:06:00, 00:00:06:00 long\n"
              "Frame rate  24 fps\n");
}

TEST(List, ATransitionThatIsLongerThanItsEventIsShown)
{
    // Of one second each: as long as its event, a frame longer, and far longer.
    const TempFolder folder;
    const std::string file =
        folder.write("film.edl", "001  A001  V  D  024  10:00:00:00 10:00:01:00 01:00:00:00 01:00:01:00\n"
                                 "002  A002  V  D  025  10:00:00:00 10:00:01:00 01:00:01:00 01:00:02:00\n"
                                 "003  A003  V  W001 9999999  10:00:00:00 10:00:01:00 01:00:02:00 01:00:03:00\n");

    const Outcome outcome = runCadrel({"list", file, "--rate", "24"});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(
        outcome.out,
        "state   event  roll  clip  file      trans      src in       src out      dst in       dst out      speed\n"
        "ok      001    A001        film.edl  D 024      10:00:00:00  10:00:01:00  01:00:00:00  01:00:01:00   1.00\n"
        "length  002    A002        film.edl  D 025      10:00:00:00  10:00:01:00  01:00:01:00  01:00:02:00   1.00\n"
        "          The dissolve lasts 25 frames, and the event only 24.\n"
        "length  003    A003        film.edl  W 9999999  10:00:00:00  10:00:01:00  01:00:02:00  01:00:03:00   1.00\n"
        "          The wipe lasts 9999999 frames, and the event only 24.\n"
        "\n"
        "Events      3, all valid, 2 with a transition longer than the event\n"
        "            0 cuts, 2 dissolves, 1 wipe, 0 retimed\n"
        "Programme   01:00:00:00 - 01:00:03:00, 00:00:03:00 long\n"
        "Frame rate  24 fps\n");
}

TEST(List, SummaryPrintsOnlyTheTotals)
{
    const TempFolder folder;
    const std::string file = folder.write("film.edl", mixedFilm());

    const Outcome outcome = runCadrel({"list", file, "--summary", "--audio"});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.out, "Events      4, all valid\n"
                           "            3 cuts, 1 dissolve, 0 wipes, 1 retimed\n"
                           "Programme   01:00:00:00 - 01:00:08:06, 00:00:08:06 long\n"
                           "Frame rate  24 fps\n");
}

TEST(List, JsonHasExactlyTheKeysOfAnEvent)
{
    const TempFolder folder;
    const std::string file = folder.write("film.edl", mixedFilm());

    const json events = listAsJson({file}).at("events");

    ASSERT_EQ(events.size(), 4U);
    EXPECT_EQ(events[2], json::parse(R"({"number": 2, "kind": "plain", "roll": "A002", "clip": "TWO",
        "transition": "dissolve", "duration": 12, "srcIn": "11:00:00:00", "srcOut": "11:00:02:00",
        "dstIn": "01:00:04:00", "dstOut": "01:00:06:00", "speed": 1.0, "vfx": false, "flaws": [],
        "edlFile": "film.edl", "members": []})"));
    EXPECT_EQ(events[3], json::parse(R"({"number": 3, "kind": "plain", "roll": "A003", "clip": "",
        "transition": "cut", "duration": 0, "srcIn": "12:00:00:00", "srcOut": "12:00:04:12",
        "dstIn": "01:00:06:00", "dstOut": "01:00:08:06", "speed": 2.0, "vfx": false, "flaws": ["not-video-event"],
        "edlFile": "film.edl", "members": []})"));
}

TEST(List, FlawsAscendInTheJson)
{
    const TempFolder folder;
    // The roll can't be read (3), nor can SRC OUT (8), which stays uninitialized (0) and so before SRC IN (12).
    const std::string file = folder.write("film.edl", mixedFilm() + "004  A+B  V  C  12:00:00:00 x 1:0:0:0 1:0:0:1\n");

    EXPECT_EQ(listAsJson({file}).at("events").at(4).at("flaws"),
              json({"timecode-uninitialized", "roll-name-invalid", "src-out-unreadable", "timecode-range-invalid"}));
}

TEST(List, JsonGoesToAFileBesideTheTable)
{
    const TempFolder folder;
    const std::string file = folder.write("film.edl", mixedFilm());

    const Outcome outcome = runCadrel({"list", file, "--json", folder / "film.json"});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.out, runCadrel({"list", file}).out);
    EXPECT_EQ(json::parse(contentOf(folder / "film.json")), listAsJson({file}));
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"film.edl", "film.json"}));
}

TEST(List, AudioEventsAreFlawedUnlessAccepted)
{
    const TempFolder folder;
    const std::string file = folder.write("film.edl", mixedFilm());

    EXPECT_EQ(listAsJson({file}).at("events").at(3).at("flaws"), json({"not-video-event"}));
    EXPECT_EQ(listAsJson({file, "--audio"}).at("events").at(3).at("flaws"), json::array());
}

TEST(List, BRollsTakeTheNameOfTheirRollUnlessKeptApart)
{
    const TempFolder folder;
    const std::string file =
        folder.write("film.edl", cut("001", "A001", "10:00:00:00 10:00:04:12", "01:00:00:00 01:00:04:12") +
                                     cut("002", "A001B", "10:00:00:00 10:00:04:00", "01:00:04:12 01:00:08:12"));

    EXPECT_EQ(listAsJson({file}).at("events").at(1).at("roll"), "A001");
    EXPECT_EQ(listAsJson({file, "--no-b-roll"}).at("events").at(1).at("roll"), "A001B");
}

TEST(List, BRollsAreLookedForInEachFileByItself)
{
    const TempFolder folder;
    const std::string a =
        folder.write("a.edl", cut("001", "A001", "10:00:00:00 10:00:04:12", "01:00:00:00 01:00:04:12"));
    const std::string b =
        folder.write("b.edl", cut("001", "A001B", "10:00:00:00 10:00:04:00", "01:00:04:12 01:00:08:12"));

    EXPECT_EQ(listAsJson({a, b}).at("events").at(1).at("roll"), "A001B");
}

TEST(List, FilesComeInTheirOrderAndEachOnlyOnce)
{
    const TempFolder folder;
    const std::string a =
        folder.write("a.edl", cut("007", "A001", "10:00:00:00 10:00:04:12", "01:00:00:00 01:00:04:12"));
    const std::string b =
        folder.write("b.edl", cut("003", "A002", "10:00:00:00 10:00:04:00", "01:00:04:12 01:00:08:12"));

    const json events = listAsJson({b, a, folder / "./b.edl"}).at("events");

    ASSERT_EQ(events.size(), 2U);
    EXPECT_EQ(events[0].at("edlFile"), "b.edl");
    EXPECT_EQ(events[1].at("edlFile"), "a.edl");
}

TEST(List, TheFirstFileShowsTheRate)
{
    const TempFolder folder;
    const auto rateOf = [&folder](const std::string& head, const std::string& frames) {
        const std::string line = cut("001", "A001", "10:00:00:00 10:00:04:" + frames, "01:00:00:00 01:00:04:" + frames);
        return listAsJson({folder.write("film.edl", head + line)}).at("rate");
    };

    EXPECT_EQ(rateOf("", "23"), "24 fps");
    EXPECT_EQ(rateOf("", "24"), "25 fps");
    EXPECT_EQ(rateOf("FCM: NON-DROP FRAME\n", "29"), "30 fps");
    EXPECT_EQ(rateOf("", "30"), "60 fps");
    EXPECT_EQ(rateOf("FCM: DROP FRAME\n", "10"), "30 dfps");
}

TEST(List, TheGivenRateDecidesWhatIsValid)
{
    const TempFolder folder;
    // Frames 0 and 1 of most minutes don't exist in drop-frame.
    const std::string file =
        folder.write("film.edl", cut("001", "A001", "10:01:00:01 10:01:04:01", "01:00:00:00 01:00:04:00"));

    EXPECT_EQ(listAsJson({file, "--rate", "29.97 fps"}).at("events").at(0).at("flaws"), json::array());
    EXPECT_EQ(listAsJson({file, "--rate", "29.97 dfps"}).at("events").at(0).at("flaws"), json({"timecode-invalid"}));
}

TEST(List, AHigherRateThanTheProjectsIsWarnedOf)
{
    const TempFolder folder;
    const std::string file =
        folder.write("film.edl", "TITLE: FILM\r\n\r\n001 A001 V C 10:00:00:00 10:00:04:00 01:00:00:00 01:00:04:00\r\n"
                                 "002 A002 V C 10:00:00:00 10:00:04:00 01:00:04:00 01:00:08:24\r\n"
                                 "003 A003 V C 10:00:00:00 10:00:04:24 01:00:08:00 01:00:12:24\r\n");

    const Outcome outcome = runCadrel({"list", file, "--rate", "24 fps", "--summary"});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.err, "cadrel: " + file +
                               ": warning: shows 25 fps, more than the 24 fps of the project, first in line 4: "
                               "\"002 A002 V C 10:00:00:00 10:00:04:00 01:00:04:00 01:00:08:24\"; "
                               "check the file or give another --rate\n");
    EXPECT_NE(outcome.out.find("Events      3, 2 invalid\n"), std::string::npos) << outcome.out;
}

TEST(List, ADropFrameFileInASlowerProjectIsWarnedOf)
{
    const TempFolder folder;
    const std::string file =
        folder.write("film.edl", "FCM: NON-DROP FRAME\nFCM: DROP FRAME\n" +
                                     cut("001", "A001", "10:00:00:00 10:00:04:12", "01:00:00:00 01:00:04:12"));

    const Outcome outcome = runCadrel({"list", file, "--rate", "25 fps", "--summary"});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.err, "cadrel: " + file +
                               ": warning: shows 30 fps, more than the 25 fps of the project, first in line 2: "
                               "\"FCM: DROP FRAME\"; check the file or give another --rate\n");
}

TEST(List, InvalidTimecodesAreWarnedOf)
{
    const TempFolder folder;
    const std::string file =
        folder.write("film.edl", cut("001", "A001", "10:00:00:00 10:00:04:12", "01:00:00:00 01:00:04:12") +
                                     cut("002", "A002", "10:00:00:00 10:60:04:00", "01:00:04:12 01:00:08:12"));

    const Outcome outcome = runCadrel({"list", file});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.err, "cadrel: " + file +
                               ": warning: 1 event with timecodes that don't exist at 24 fps, first in line 2: "
                               "\"002  A002  V  C  10:00:00:00 10:60:04:00 01:00:04:12 01:00:08:12\"; "
                               "check the file or give another --rate\n");
    EXPECT_NE(outcome.out.find("timecode  002    A002"), std::string::npos) << outcome.out;
}

TEST(List, StrictMakesAnErrorOfAWarning)
{
    const TempFolder folder;
    const std::string file =
        folder.write("film.edl", cut("001", "A001", "10:00:00:00 10:00:04:24", "01:00:00:00 01:00:04:24"));

    const Outcome outcome = runCadrel({"list", file, "--rate", "24 fps", "--strict"});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.out, "");
    EXPECT_TRUE(outcome.err.starts_with("cadrel: " + file + ": shows 25 fps")) << outcome.err;
    EXPECT_EQ(runCadrel({"list", file, "--strict"}).status, 0);
}

TEST(List, NamesThatControlTheTerminalAreShownHarmless)
{
    const TempFolder folder;
    const std::string file =
        folder.write("film.edl", cut("001", "A001", "10:00:00:00 10:00:04:12", "01:00:00:00 01:00:04:12") +
                                     clipName("\033[31mRED\007 M\xc3\xbcller \xc2\x9b \xe2\x80\xae"));

    const Outcome table = runCadrel({"list", file});
    const json event = listAsJson({file}).at("events").at(0);

    EXPECT_NE(table.out.find("A001  ?[31mRED? M\xc3\xbcller ? ?  film.edl"), std::string::npos) << table.out;
    EXPECT_EQ(event.at("clip"), "\033[31mRED\007 M\xc3\xbcller \xc2\x9b \xe2\x80\xae");
}

TEST(List, BytesThatAreNoUtf8AreLatin1OnTheScreenAndReplacedInTheJson)
{
    const TempFolder folder;
    const std::string file = folder.write(
        "film.edl", cut("001", "A001", "10:00:00:00 10:00:04:12", "01:00:00:00 01:00:04:12") + clipName("CAF\xc9 2"));

    EXPECT_EQ(listAsJson({file}).at("events").at(0).at("clip"), "CAF\xef\xbf\xbd 2");
    EXPECT_NE(runCadrel({"list", file}).out.find("CAF\xc3\x89 2"), std::string::npos);
}

TEST(List, LongNamesAreCutInTheTableAlone)
{
    const TempFolder folder;
    const std::string name(60, 'N');
    const std::string file = folder.write(
        "film.edl", cut("001", "A001", "10:00:00:00 10:00:04:12", "01:00:00:00 01:00:04:12") + clipName(name));

    EXPECT_NE(runCadrel({"list", file}).out.find("  " + std::string(39, 'N') + "…  film.edl"), std::string::npos);
    EXPECT_EQ(listAsJson({file}).at("events").at(0).at("clip"), name);
}

TEST(List, UnreadableTimecodesAndTheirSpeedAreLeftOpen)
{
    const TempFolder folder;
    const std::string file =
        folder.write("film.edl", cut("001", "A001", "10:00:00:00 10:00:04:12", "01:00:00:00 01:00:04:12") +
                                     cut("002", "A002", "10:00:00:00 later", "01:00:04:12 01:00:08:12") +
                                     cut("003", "A003", "10:00:04:00 10:00:00:00", "01:00:08:12 01:00:12:12"));

    const Outcome outcome = runCadrel({"list", file});

    EXPECT_NE(outcome.out.find("10:00:00:00  --:--:--:--  01:00:04:12  01:00:08:12     --\n"
                               "          Detected uninitialized timecode.\n"
                               "          SRC OUT format cannot be read.\n"
                               "          Detected invalid timecode range.\n"
                               "range   003"),
              std::string::npos)
        << outcome.out;
}

TEST(List, NamesTakeTheColumnsThatATerminalGivesThem)
{
    const TempFolder folder;
    // Two characters of two columns each; "e" with an accent over it of its own; Latin-1, of one column a letter.
    const std::string file =
        folder.write("film.edl", cut("001", "A001", "10:00:00:00 10:00:04:00", "01:00:00:00 01:00:04:00") +
                                     clipName("\xe6\x97\xa5\xe6\x9c\xac") +
                                     cut("002", "A002", "10:00:00:00 10:00:04:00", "01:00:04:00 01:00:08:00") +
                                     clipName("cafe\xcc\x81 x") +
                                     cut("003", "A003", "10:00:00:00 10:00:04:00", "01:00:08:00 01:00:12:00") +
                                     clipName("M\xfc"
                                              "nchen"));

    const std::string shown = runCadrel({"list", file, "--rate", "24 fps"}).out;

    EXPECT_TRUE(shown.starts_with("state  event  roll  clip     file      trans"
                                  "  src in       src out      dst in       dst out      speed\n"
                                  "ok     001    A001  \xe6\x97\xa5\xe6\x9c\xac     film.edl  C    ") &&
                shown.find("ok     002    A002  cafe\xcc\x81 x   film.edl  C    ") != std::string::npos &&
                shown.find("ok     003    A003  M\xc3\xbcnchen  film.edl  C    ") != std::string::npos)
        << shown;
}

TEST(List, ALongNameIsCutByColumns)
{
    const TempFolder folder;
    const auto clipOf = [&](const std::string& name) {
        const std::string file = folder.write(
            "film.edl", cut("001", "A001", "10:00:00:00 10:00:04:00", "01:00:00:00 01:00:04:00") + clipName(name));
        const std::string shown = runCadrel({"list", file, "--rate", "24 fps"}).out;
        const std::size_t start = shown.find("A001  ") + 6;
        return shown.substr(start, shown.find("  film.edl", start) - start);
    };
    const auto times = [](int count, const std::string& text) {
        std::string all;
        for (int index = 0; index < count; ++index)
            all += text;
        return all;
    };
    const std::string wide = "\xe6\x97\xa5";
    const std::string accented = "e\xcc\x81";
    const std::string dots = "\xe2\x80\xa6";

    EXPECT_EQ(clipOf(times(20, wide)), times(20, wide));
    EXPECT_EQ(clipOf(times(21, wide)), times(19, wide) + dots);
    EXPECT_EQ(clipOf(std::string("x").append(times(20, wide))), std::string("x").append(times(19, wide)) + dots);
    EXPECT_EQ(clipOf(times(40, accented)), times(40, accented));
    EXPECT_EQ(clipOf(times(41, accented)), times(39, accented) + dots);
}

TEST(List, DropFrameShowsInASemicolonOnTheScreenAlone)
{
    const TempFolder folder;
    const std::string file = folder.write(
        "film.edl", "FCM: DROP FRAME\n" + cut("001", "A001", "10:00:00:00 10:01:00:02", "01:00:00:00 01:01:00:02"));

    const std::string shown = runCadrel({"list", file, "--rate", "29.97 dfps"}).out;

    EXPECT_NE(shown.find("10:00:00;00  10:01:00;02  01:00:00;00  01:01:00;02"), std::string::npos) << shown;
    EXPECT_NE(shown.find("Programme   01:00:00;00 - 01:01:00;02, 00:01:00;02 long\n"), std::string::npos) << shown;
    EXPECT_EQ(listAsJson({file, "--rate", "29.97 dfps"}).at("events").at(0).at("dstOut"), "01:01:00:02");
    EXPECT_EQ(runCadrel({"list", file, "--rate", "30 fps"}).out.find(';'), std::string::npos);
}

} // namespace
