// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/ProgramRun.h"
#include "tests/support/TreePaths.h"

#include <array>
#include <cstdio>
#include <filesystem>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

/// An old and a new cut in a folder of their own.
class Film {
public:
    Film(const std::string& oldText, const std::string& newText)
        : oldFile(folder.write("old.edl", oldText)), newFile(folder.write("new.edl", newText))
    {
    }

    Outcome generate(const std::vector<std::string>& more = {}) const
    {
        std::vector<std::string> arguments{"generate", "--old", oldFile, "--new", newFile};
        arguments.insert(arguments.end(), more.begin(), more.end());
        return runCadrel(arguments);
    }
    json generateAsJson(std::vector<std::string> more = {}) const
    {
        more.insert(more.end(), {"--json", "-"});
        const Outcome outcome = generate(more);
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        return json::parse(outcome.out);
    }

    const TempFolder folder;
    const std::string oldFile;
    const std::string newFile;
};

/// "SRC IN-SRC OUT>DST IN-DST OUT" of each event.
std::vector<std::string> timesOf(const json& events)
{
    std::vector<std::string> times;
    for (const json& event : events) {
        const auto text = [&event](const char* key) { return event.at(key).get<std::string>(); };
        times.push_back(text("srcIn") + "-" + text("srcOut") + ">" + text("dstIn") + "-" + text("dstOut"));
    }
    return times;
}

TEST(Generate, WritesTheChangeEdl)
{
    const Film film(oldCut(), newCut());

    const Outcome outcome = film.generate({"-o", film.folder / "change.edl"});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.err, "");
    EXPECT_EQ(contentOf(film.folder / "change.edl"),
              "TITLE:   change.edl\n"
              "001  A001     V     C        01:00:00:00 01:00:10:00 01:00:00:00 01:00:10:00\n"
              "002  A002     V     C        01:00:12:00 01:00:20:00 01:00:10:00 01:00:18:00\n"
              "003  A003     V     C        01:00:20:00 01:00:30:00 01:00:22:00 01:00:32:00\n");
    EXPECT_EQ(film.folder.names(), (std::vector<std::string>{"change.edl", "new.edl", "old.edl"}));
}

TEST(Generate, PrintsASummary)
{
    const Film film(oldCut(), newCut());

    const Outcome outcome = film.generate({"-o", film.folder / "change.edl"});

    EXPECT_EQ(outcome.out, "Old cut     old.edl: 3 events, all valid\n"
                           "New cut     new.edl: 4 events, all valid\n"
                           "Frame rate  24 fps, as the old cut shows\n"
                           "Change EDL  3 events\n"
                           "Covered     00:00:28:00 of 00:00:32:00, 87.5 %\n"
                           "Settings    default       --match roll --heal normal --vfx none --b-roll\n"
                           "Inserts     1, together 00:00:04:00\n"
                           "\n"
                           "            in           out          length       shot\n"
                           "            01:00:18:00  01:00:22:00  00:00:04:00  NEW\n"
                           "\n"
                           "Written     " +
                               (film.folder / "change.edl").string() + "\n");
}

TEST(Generate, TheSettingsInForceAreToldWithWhereTheyAreFrom)
{
    const Film film(oldCut(), newCut());
    const auto settingsOf = [&film](const std::vector<std::string>& options) {
        const Outcome outcome = film.generate(options);
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        const std::size_t start = outcome.out.find("Settings    ");
        return outcome.out.substr(start, outcome.out.find("Inserts") - start);
    };

    EXPECT_EQ(settingsOf({"--match", "clip", "--vfx", "VFX_****_v,_comp", "--vfx", "A,B", "--no-b-roll"}),
              "Settings    command line  --match clip --vfx 'VFX_****_v,_comp' --vfx A,B --no-b-roll\n"
              "            default       --heal normal\n");
    // What is given is from the command line, though it is the default.
    EXPECT_EQ(settingsOf({"--heal", "normal", "--b-roll", "--vfx", "none"}),
              "Settings    command line  --heal normal --vfx none --b-roll\n"
              "            default       --match roll\n");
    EXPECT_EQ(film.generateAsJson({"--heal", "gaps", "--vfx", "A,B", "--no-b-roll"}).at("settings"), json::parse(R"({
        "match": {"value": "roll", "from": "default"},
        "heal": {"value": "gaps", "from": "command line"},
        "vfx": {"value": ["A,B"], "from": "command line"},
        "b-roll": {"value": false, "from": "command line"}})"));
}

TEST(Generate, AnInsertThatIsHealedOverStaysAnInsert)
{
    const TempFolder folder;
    const auto reel = [](const std::string& insertedRoll) {
        return cut("001", "A001", "10:00:00:12 10:00:05:12", "01:00:00:00 01:00:05:00") +
               cut("002", insertedRoll, "11:00:00:00 11:00:02:00", "01:00:05:00 01:00:07:00") +
               cut("003", "A003", "12:00:00:00 12:00:03:00", "01:00:07:00 01:00:10:00");
    };
    const std::string oldFile = folder.write("old.edl", reel("TAKE3"));
    const std::string newFile = folder.write("new.edl", reel("TAKE4"));

    const Outcome outcome =
        runCadrel({"generate", "--old", oldFile, "--new", newFile, "--heal", "inserts", "--rate", "24 fps"});

    EXPECT_NE(outcome.out.find("Change EDL  1 event, 1 of them healed from 2\n"), std::string::npos) << outcome.out;
    EXPECT_NE(outcome.out.find("Covered     00:00:08:00 of 00:00:10:00, 80.0 %\n"), std::string::npos) << outcome.out;
    EXPECT_NE(outcome.out.find("01:00:05:00  01:00:07:00  00:00:02:00  TAKE4\n"), std::string::npos) << outcome.out;
}

TEST(Generate, WithoutAFileThereIsOnlyTheSummary)
{
    const Film film(oldCut(), newCut());

    const Outcome outcome = film.generate();

    EXPECT_EQ(outcome.status, 0);
    EXPECT_TRUE(outcome.out.ends_with("Written     nothing; give -o CHANGE.edl\n")) << outcome.out;
    EXPECT_EQ(film.folder.names(), (std::vector<std::string>{"new.edl", "old.edl"}));
}

TEST(Generate, JsonTellsTheEventsAndTheSummary)
{
    const Film film(oldCut(), newCut());

    const json document = film.generateAsJson({"-o", film.folder / "change.edl"});

    ASSERT_EQ(document.at("events").size(), 3U);
    EXPECT_EQ(document.at("events").at(1), json::parse(R"({"number": 2, "kind": "plain", "roll": "A002",
        "clip": "TWO", "transition": "cut", "duration": 0, "srcIn": "01:00:12:00", "srcOut": "01:00:20:00",
        "dstIn": "01:00:10:00", "dstOut": "01:00:18:00", "speed": 1.0, "vfx": false, "flaws": [], "edlFile": "",
        "members": []})"));
    EXPECT_EQ(document.at("rate"), "24 fps");
    EXPECT_EQ(document.at("old"), json::parse(R"({"files": ["old.edl"], "events": 3, "invalid": 0, "unread": []})"));
    EXPECT_EQ(document.at("new"), json::parse(R"({"files": ["new.edl"], "events": 4, "invalid": 0, "unread": []})"));
    EXPECT_EQ(document.at("programmeFrames"), 32 * 24);
    EXPECT_EQ(document.at("coveredFrames"), 28 * 24);
    EXPECT_EQ(document.at("inserts"), json::parse(R"([{"dstIn": "01:00:18:00", "dstOut": "01:00:22:00",
        "frames": 96, "shot": "NEW", "moreShots": 0}])"));
    EXPECT_EQ(document.at("written"), json({film.folder / "change.edl"}));
}

TEST(Generate, TouchingNeighboursAreHealed)
{
    const Film film(oldCut(), oldCut());

    const json document = film.generateAsJson();

    ASSERT_EQ(timesOf(document.at("events")),
              (std::vector<std::string>{"01:00:00:00-01:00:30:00>01:00:00:00-01:00:30:00"}));
    const json& healed = document.at("events").at(0);
    EXPECT_EQ(healed.at("kind"), "healed");
    EXPECT_EQ(healed.at("roll"), "Healed Event 001");
    EXPECT_EQ(timesOf(healed.at("members")),
              (std::vector<std::string>{"01:00:00:00-01:00:10:00>01:00:00:00-01:00:10:00",
                                        "01:00:10:00-01:00:20:00>01:00:10:00-01:00:20:00",
                                        "01:00:20:00-01:00:30:00>01:00:20:00-01:00:30:00"}));
    EXPECT_EQ(healed.at("members").at(2).at("roll"), "A003");
    EXPECT_EQ(document.at("healed"), json::parse(R"({"events": 1, "members": 3})"));
    EXPECT_NE(film.generate().out.find("Change EDL  1 event, 1 of them healed from 3\n"), std::string::npos);
}

TEST(Generate, HealModesDifferInWhatMayLieInAGap)
{
    // Between A and C, which keep their distance, B has given place to another shot; between C and E nothing stands.
    const std::string a = cut("001", "A", "10:00:00:12 10:00:10:12", "01:00:00:00 01:00:10:00");
    const std::string c = cut("003", "C", "10:00:00:12 10:00:10:12", "01:00:20:00 01:00:30:00");
    const std::string e = cut("004", "E", "10:00:00:12 10:00:10:12", "01:00:40:00 01:00:50:00");
    const std::string f = cut("005", "F", "10:00:00:12 10:00:10:12", "01:00:50:00 01:01:00:00");
    const Film film(a + cut("002", "B", "10:00:00:12 10:00:10:12", "01:00:10:00 01:00:20:00") + c + e + f,
                    a + cut("002", "X", "10:00:00:12 10:00:10:12", "01:00:10:00 01:00:20:00") + c + e + f);
    const auto countWith = [&film](const std::string& mode) {
        return film.generateAsJson({"--heal", mode}).at("events").size();
    };

    EXPECT_EQ(countWith("none"), 4U);
    EXPECT_EQ(countWith("normal"), 3U);  // A, C, E+F
    EXPECT_EQ(countWith("gaps"), 2U);    // A, C+E+F
    EXPECT_EQ(countWith("inserts"), 1U); // A+C+E+F
}

TEST(Generate, MatchesByTheChosenName)
{
    const Film film(cut("001", "A001", "10:00:00:12 10:00:10:12", "01:00:00:00 01:00:10:00") + clipName("SAME"),
                    cut("001", "A777", "10:00:00:12 10:00:10:12", "01:00:05:00 01:00:15:00") + clipName("SAME"));

    EXPECT_EQ(timesOf(film.generateAsJson({"--match", "clip"}).at("events")),
              (std::vector<std::string>{"01:00:00:00-01:00:10:00>01:00:05:00-01:00:15:00"}));
    EXPECT_EQ(film.generate({"--match", "roll"}).status, 1);
}

TEST(Generate, VfxVersionsAreOneShot)
{
    const Film film(cut("001", "VFX_010_v003_comp", "10:00:00:12 10:00:10:12", "01:00:00:00 01:00:10:00"),
                    cut("001", "VFX_010_v012_comp", "10:00:00:12 10:00:10:12", "01:00:00:00 01:00:10:00"));

    const json events = film.generateAsJson({"--vfx", "VFX_***_v,_comp"}).at("events");

    ASSERT_EQ(events.size(), 1U);
    EXPECT_EQ(events[0].at("roll"), "VFX_010_v012_comp");
    EXPECT_EQ(events[0].at("vfx"), true);
    EXPECT_EQ(film.generate().status, 1);
}

TEST(Generate, BRollsAreRenamedInBothCuts)
{
    const Film film(cut("001", "A001", "10:00:00:12 10:00:10:12", "01:00:00:00 01:00:10:00"),
                    cut("001", "A002", "10:00:00:12 10:00:10:12", "01:00:00:00 01:00:10:00") +
                        cut("002", "A001B", "10:00:00:12 10:00:04:12", "01:00:10:00 01:00:14:00") +
                        cut("003", "A001", "12:00:00:12 12:00:10:12", "01:00:14:00 01:00:24:00"));

    EXPECT_EQ(timesOf(film.generateAsJson().at("events")),
              (std::vector<std::string>{"01:00:00:00-01:00:04:00>01:00:10:00-01:00:14:00"}));
    EXPECT_EQ(film.generate({"--no-b-roll"}).status, 1);
}

TEST(Generate, EachSideTakesSeveralFiles)
{
    const TempFolder folder;
    const std::string a =
        folder.write("a.edl", cut("001", "A001", "10:00:00:12 10:00:10:12", "01:00:00:00 01:00:10:00"));
    const std::string b =
        folder.write("b.edl", cut("001", "A002", "10:00:00:12 10:00:10:12", "01:00:10:00 01:00:20:00"));
    const std::string both =
        folder.write("both.edl", cut("001", "A002", "10:00:00:12 10:00:10:12", "01:00:00:00 01:00:10:00") +
                                     cut("002", "A001", "10:00:00:12 10:00:10:12", "01:00:10:00 01:00:20:00"));

    const Outcome outcome = runCadrel({"generate", "--old", a, b, "--new", both, "--json", "-"});

    ASSERT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(timesOf(json::parse(outcome.out).at("events")),
              (std::vector<std::string>{"01:00:10:00-01:00:20:00>01:00:00:00-01:00:10:00",
                                        "01:00:00:00-01:00:10:00>01:00:10:00-01:00:20:00"}));
}

TEST(Generate, MoreThan999EventsGoIntoSeveralFiles)
{
    const Film film(manyShots(1000), manyShots(1000));

    const Outcome outcome = film.generate({"-o", film.folder / "change.edl", "--heal", "none"});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(film.folder.names(), (std::vector<std::string>{"change_1.edl", "change_2.edl", "new.edl", "old.edl"}));
    // Shot 999 plays from 01:16:39:00.
    EXPECT_EQ(contentOf(film.folder / "change_2.edl"),
              "TITLE:   change_2.edl\n"
              "001  R999     V     C        01:16:39:00 01:16:40:00 01:16:39:00 01:16:40:00\n");
    EXPECT_TRUE(outcome.out.ends_with("Written     " + (film.folder / "change_1.edl").string() + ", " +
                                      (film.folder / "change_2.edl").string() + "\n"))
        << outcome.out;
}

TEST(Generate, TheFilesOfALongListDontOverwriteAnInputEither)
{
    const TempFolder folder;
    const std::string shots = manyShots(1000);
    const std::string file = folder.write("change_2.edl", shots);

    const Outcome outcome =
        runCadrel({"generate", "--old", file, "--new", file, "-o", folder / "change.edl", "--heal", "none"});

    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(contentOf(file), shots);
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"change_2.edl"}));
}

TEST(Generate, PartsOfAnEarlierLongerListStayAndAreNamed)
{
    const Film film(manyShots(1000), manyShots(1000));
    const auto generate = [&](const std::string& heal) {
        return film.generate({"-o", film.folder / "change.edl", "--overwrite", "--heal", heal});
    };
    const auto path = [&](const char* name) { return (film.folder / name).string(); };
    film.folder.write("change_3.edl", "third");
    film.folder.write("change_10.edl", "tenth");
    for (const char* const other : {"change_.edl", "change_03.edl", "change_3b.edl", "change_3.txt", "rechange_3.edl"})
        film.folder.write(other, "another");
    const std::string remark = ", which may be of an earlier list; remove what you don't need\n";

    const std::string inTwo = generate("none").out;
    EXPECT_TRUE(inTwo.ends_with("Left over   " + path("change_3.edl") + ", " + path("change_10.edl") + remark))
        << inTwo;

    // All shots stand where they stood, so that one event is left of them.
    const std::string inOne = generate("normal").out;
    EXPECT_TRUE(inOne.ends_with("Left over   " + path("change_1.edl") + ", " + path("change_2.edl") + ", " +
                                path("change_3.edl") + ", " + path("change_10.edl") + remark))
        << inOne;
    const std::string inTwoAgain = generate("none").out;
    EXPECT_TRUE(inTwoAgain.ends_with("Left over   " + path("change.edl") + ", " + path("change_3.edl") + ", " +
                                     path("change_10.edl") + remark))
        << inTwoAgain;
    EXPECT_EQ(contentOf(path("change_3.edl")), "third");
    EXPECT_EQ(contentOf(path("change_10.edl")), "tenth");
}

TEST(Generate, ABackupIsNoPartOfAnEarlierList)
{
    const Film film(oldCut(), newCut());
    film.folder.write("change_backup_1.edl", "former");

    const Outcome outcome = film.generate({"-o", film.folder / "change_backup.edl"});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(outcome.out.find("Left over"), std::string::npos) << outcome.out;
}

TEST(Generate, AnInputIsNoPartOfAnEarlierList)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("reel_1.edl", oldCut());
    const std::string newFile = folder.write("reel_2.edl", newCut());

    const Outcome outcome = runCadrel({"generate", "--old", oldFile, "--new", newFile, "-o", folder / "reel.edl"});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(outcome.out.find("Left over"), std::string::npos) << outcome.out;
}

TEST(Generate, NothingThatSurvivesIsToldAndWritesNoFile)
{
    const Film film(oldCut(), cut("001", "B009", "05:00:00:00 05:00:04:12", "01:00:00:00 01:00:04:12"));

    const Outcome outcome = film.generate({"-o", film.folder / "change.edl", "--json", film.folder / "change.json"});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.out, "");
    EXPECT_EQ(outcome.err, "cadrel: " + film.oldFile + ", " + film.newFile +
                               ": nothing of the old cut survives in the new one, so there is no change EDL; "
                               "see that both are of one reel, and try --match or --vfx\n");
    EXPECT_EQ(film.folder.names(), (std::vector<std::string>{"new.edl", "old.edl"}));
}

TEST(Generate, InsertsAreTheUnionOfWhatIsNotCovered)
{
    // A picture event whose roll can't be read needs sound, an audio event doesn't; a gap of the cut is no programme.
    const Film film(oldCut(), cut("001", "A001", "10:00:00:00 10:00:04:00", "01:00:00:00 01:00:04:00") +
                                  cut("002", "X+1", "10:00:00:00 10:00:02:00", "01:00:04:00 01:00:06:00") +
                                  clipName("UNREADABLE") +
                                  cut("003", "X002", "10:00:00:00 10:00:02:00", "01:00:06:00 01:00:08:00") +
                                  "004  X003  A  C  10:00:00:00 10:00:02:00 01:00:08:00 01:00:10:00\n" +
                                  cut("005", "X004", "10:00:00:00 10:00:01:00", "01:00:20:00 01:00:21:00"));

    const json document = film.generateAsJson();

    EXPECT_EQ(document.at("programmeFrames"), (8 + 1) * 24);
    EXPECT_EQ(document.at("coveredFrames"), 4 * 24);
    EXPECT_EQ(document.at("inserts"), json::parse(R"([
        {"dstIn": "01:00:04:00", "dstOut": "01:00:08:00", "frames": 96, "shot": "UNREADABLE", "moreShots": 1},
        {"dstIn": "01:00:20:00", "dstOut": "01:00:21:00", "frames": 24, "shot": "X004", "moreShots": 0}])"));
    EXPECT_EQ(document.at("new").at("invalid"), 2);
}

TEST(Generate, OverlappingEventsOfTheNewCutCountOnce)
{
    // A001 returns for its first two seconds at 01:00:02:00; the long shot under it lasts on to 01:00:08:00.
    const Film film(cut("001", "A001", "10:00:00:12 10:00:02:12", "01:00:00:00 01:00:02:00"),
                    cut("001", "X001", "10:00:00:12 10:00:08:12", "01:00:00:00 01:00:08:00") + clipName("LONG") +
                        cut("002", "A001", "10:00:00:12 10:00:02:12", "01:00:02:00 01:00:04:00"));

    const json document = film.generateAsJson();

    EXPECT_EQ(document.at("programmeFrames"), 8 * 24);
    EXPECT_EQ(document.at("coveredFrames"), 2 * 24);
    EXPECT_EQ(document.at("inserts"), json::parse(R"([
        {"dstIn": "01:00:00:00", "dstOut": "01:00:02:00", "frames": 48, "shot": "LONG", "moreShots": 0},
        {"dstIn": "01:00:04:00", "dstOut": "01:00:08:00", "frames": 96, "shot": "LONG", "moreShots": 0}])"));
}

TEST(Generate, AllButAFrameIsNotAHundredPercent)
{
    // 9600 frames, one of which is new.
    const Film film(cut("001", "A001", "10:00:00:00 10:06:39:23", "01:00:00:00 01:06:39:23"),
                    cut("001", "A001", "10:00:00:00 10:06:39:23", "01:00:00:00 01:06:39:23") +
                        cut("002", "X001", "10:00:00:00 10:00:00:01", "01:06:39:23 01:06:40:00"));

    EXPECT_NE(film.generate().out.find("Covered     00:06:39:23 of 00:06:40:00, 99.9 %\n"), std::string::npos);
}

TEST(Generate, AFileThatComesUpDuringTheRunIsNotOverwritten)
{
    const Film film(manyShots(20000), manyShots(20000));
    const auto run = [&](const std::string& appearing, const std::vector<std::string>& more) {
        std::vector<std::string> words{"generate", "--old", film.oldFile, "--new", film.newFile};
        words.insert(words.end(), more.begin(), more.end());
        return runCadrelDisturbedAt("reading new.edl", words,
                                    [&] { film.folder.write(appearing, "of another program"); });
    };
    const std::string change = film.folder / "change.edl";
    const std::string document = film.folder / "change.json";
    const std::vector<std::string> inputs{"new.edl", "old.edl"};
    const auto requireKept = [&](const Outcome& outcome, const std::string& name) {
        EXPECT_EQ(outcome.status, 1);
        EXPECT_NE(outcome.out.find(name + ": exists already; give --overwrite"), std::string::npos) << outcome.out;
        EXPECT_EQ(contentOf(film.folder / name), "of another program");
        EXPECT_EQ(film.folder.names().size(), inputs.size() + 1);
        std::filesystem::remove(film.folder / name);
    };

    requireKept(run("change.edl", {"-o", change, "--json", document}), "change.edl");
    requireKept(run("change.json", {"-o", change, "--json", document}), "change.json");
    requireKept(run("change_2.edl", {"-o", change, "--heal", "none"}), "change_2.edl");
    EXPECT_EQ(run("change.edl", {"-o", change, "--overwrite"}).status, 0);
    EXPECT_NE(contentOf(change), "of another program");
}

const std::string OutsideOfTheDay = ": a time would fall outside the 24 hours of a day";
const std::string CorrectTimecodes = "; correct its timecodes or leave it out\n";

TEST(Generate, TwoEventsThatCantBeMatchedAreToldAndPassedOver)
{
    // 2512 frames of source fill 2500 frames of programme up to the last frame of the day: the speed counts as normal,
    // so that the stretch is taken to be as long as the source and would end behind midnight.
    const std::string speedy = cut("003", "A009", "01:00:00:00 01:01:40:12", "23:58:19:24 23:59:59:24");
    const std::string fine = cut("001", "A001", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00");
    const Film film(fine + cut("002", "A002", "10:00:00:00 10:00:10:00", "01:00:10:00 01:00:20:00") + speedy,
                    fine + speedy);
    const std::string what = "event 3 in line 2 of new.edl (A009) can't be matched with event 3 in line 3 of old.edl "
                             "(A009)" +
                             OutsideOfTheDay;

    const Outcome outcome = film.generate({"-o", film.folder / "change.edl"});
    const Outcome strict = film.generate({"--strict"});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.err, "cadrel: new.edl: warning: " + what + ", so it is passed over" + CorrectTimecodes);
    EXPECT_EQ(contentOf(film.folder / "change.edl"),
              "TITLE:   change.edl\n"
              "001  A001     V     C        01:00:00:00 01:00:10:00 01:00:00:00 01:00:10:00\n");
    EXPECT_EQ(film.generateAsJson().at("unmatched"), json::array({"new.edl: " + what}));
    EXPECT_EQ(strict.status, 1);
    EXPECT_EQ(strict.err, "cadrel: new.edl: " + what + CorrectTimecodes);
}

TEST(Generate, AnEventThatCantBeUsedIsToldAndPassedOver)
{
    // A transition of 9,999,999 frames is longer than a day, and one at midnight would end after it.
    const std::string endless = "002  A009  V  D  9999999  01:00:00:00 01:00:10:12 01:00:10:00 01:00:20:12\n";
    const std::string late = "003  A008  V  D  024  01:00:00:00 01:00:00:12 23:59:59:12 23:59:59:23\n";
    const std::string fine = cut("001", "A001", "10:00:00:00 10:00:10:12", "01:00:00:00 01:00:10:12");
    const Film film(fine + endless, fine + late);
    const auto told = [](const std::string& file, const std::string& event, const std::string& lengths) {
        return "cadrel: " + file + ": warning: " + event + " can't be used: the dissolve lasts " + lengths +
               ", so it is passed over; correct the duration of the dissolve or leave the event out\n";
    };

    const Outcome outcome = film.generate();

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.err,
              told("old.edl", "event 2 in line 2 of old.edl (A009)", "9999999 frames, and the event only 252") +
                  told("new.edl", "event 3 in line 2 of new.edl (A008)", "24 frames, and the event only 11"));
    EXPECT_NE(outcome.out.find("Change EDL  1 event\n"), std::string::npos) << outcome.out;
    EXPECT_EQ(film.generate({"--strict"}).status, 1);
    EXPECT_EQ(runCadrel({"notes", "--old", film.oldFile, "--new", film.newFile}).status, 0);
}

TEST(Generate, OfManyEventsThatCantBeUsedTheFirstTenAreTold)
{
    const std::string fine = cut("001", "A001", "10:00:00:00 10:00:10:12", "01:00:00:00 01:00:10:12");
    std::string endless;
    for (int count = 0; count < 11; ++count)
        endless += "002  A009  V  D  9999999  01:00:00:00 01:00:10:12 01:00:10:00 01:00:20:12\n";
    const Film eleven(fine + endless, fine);
    const Film twelve(fine + endless, fine + endless.substr(0, endless.find('\n') + 1));

    const std::string rest = ": warning: 1 more event can't be matched and is passed over; correct the timecodes\n";
    EXPECT_TRUE(eleven.generate().err.ends_with(eleven.newFile + rest)) << eleven.generate().err;
    EXPECT_NE(twelve.generate().err.find("2 more events can't be matched and are passed over"), std::string::npos);
    EXPECT_EQ(twelve.generateAsJson().at("unmatched").size(), 12U);
}

TEST(Generate, WarningsNameTheFileAndStrictStops)
{
    const Film film(oldCut(), newCut() + cut("005", "A009", "10:00:00:00 10:00:10:24", "01:01:00:00 01:01:10:24"));

    const Outcome warned = film.generate();
    const Outcome strict = film.generate({"--strict", "-o", film.folder / "change.edl"});

    EXPECT_EQ(warned.status, 0);
    EXPECT_EQ(warned.err, "cadrel: " + film.newFile +
                              ": warning: shows 25 fps, more than the 24 fps of the project, first in line 10: "
                              "\"005  A009  V  C  10:00:00:00 10:00:10:24 01:01:00:00 01:01:10:24\"; "
                              "check the file or give another --rate\n");
    EXPECT_NE(warned.out.find("New cut     new.edl: 5 events, 1 invalid\n"), std::string::npos) << warned.out;
    EXPECT_EQ(strict.status, 1);
    EXPECT_EQ(film.folder.names(), (std::vector<std::string>{"new.edl", "old.edl"}));
}

TEST(Generate, TheExampleReelGivesAChangeEdlWhoseEventsKeepTheirLength)
{
    const TempFolder folder;
    const std::string examples = treePath("examples");

    const Outcome outcome =
        runCadrel({"generate", "--old", examples + "/reel3/reel3_v07.edl", "--new", examples + "/reel3/reel3_v12.edl",
                   "--vfx", "VFX_****_v,_comp", "-o", folder / "change.edl", "--json", folder / "change.json"});

    ASSERT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(outcome.err, "");
    const json document = json::parse(contentOf(folder / "change.json"));
    EXPECT_FALSE(document.at("events").empty());
    for (const json& event : document.at("events")) {
        EXPECT_EQ(event.at("flaws"), json::array());
        EXPECT_EQ(event.at("speed"), 1.0);
    }
    EXPECT_EQ(document.at("programmeFrames"), ((15 * 60) + 7) * 24 + 20);
}

} // namespace
