// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/JsonSchema.h"
#include "tests/app/NotesOfCuts.h"
#include "tests/app/ProgramRun.h"
#include "tests/app/SoundProject.h"
#include "tests/support/TreePaths.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstddef>
#include <gtest/gtest.h>
#include <map>
#include <nlohmann/json.hpp>
#include <sstream>
#include <string>
#include <tuple>
#include <vector>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

using Words = std::vector<std::string>;

const std::array Extensions{".html", ".pdf", ".csv", ".txt", ".json"};

Words joined(Words words, const Words& more)
{
    words.insert(words.end(), more.begin(), more.end());
    return words;
}

bool tells(const std::string& text, const std::string& part)
{
    return text.find(part) != std::string::npos;
}

std::string clip(const std::string& name, double start, double end)
{
    return R"({"kind": "clip", "start": )" + std::to_string(start) + R"(, "end": )" + std::to_string(end) +
           R"(, "clip": 1, "name": )" + json(name).dump() + "}";
}

std::string range(const std::string& name, double start, double end)
{
    return R"({"kind": "range", "start": )" + std::to_string(start) + R"(, "end": )" + std::to_string(end) +
           R"(, "name": )" + json(name).dump() + "}";
}

std::string track(const std::string& kind, const std::string& name, const std::string& events)
{
    return R"({"kind": ")" + kind + R"(", "name": )" + json(name).dump() + R"(, "events": [)" + events + "]}";
}

/// The film of Film.h with its sound, in seconds from 01:00:00:00. TWO has lost 10 to 12, and NEW has come in at 20:
///
///     DIA           |--long line--|  |over the cut|            8-14, 18-21
///     DIA              |lost|                                  10.5-11.5
///     FX    |hum|                                 |latch|      1-7, 24-26
class Sound {
public:
    explicit Sound(const std::string& dialogue = "DIA", const std::string& name = "long line", const Words& more = {})
        : oldFile(folder.write("old.edl", oldCut())), newFile(folder.write("new.edl", newCut()))
    {
        std::string tracks = track("audio", dialogue,
                                   clip(name, 3608, 3614) + "," + clip("lost", 3610.5, 3611.5) + "," +
                                       clip("over the cut", 3618, 3621)) +
                             "," + track("audio", "FX", clip("hum", 3601, 3607) + "," + clip("latch", 3624, 3626));
        for (const std::string& other : more)
            tracks.append(",").append(other);
        std::string text = projectWith(tracks);
        text.replace(text.find(R"("pool": [])"), 10,
                     R"("pool": [{"number": 1, "kind": "audio", "name": "boom", "path": "boom.wav", "length": 9000}])");
        project = folder.write("scene.stage", text);
    }

    Outcome apply(const Words& more = {}) const
    {
        return runCadrel(joined({"apply", project, "--old", oldFile, "--new", newFile}, more));
    }
    /// The notes in the form of that extension.
    std::string notes(const std::string& extension, const Words& more = {}) const
    {
        const std::string file = folder / ("notes" + extension);
        const Outcome outcome = apply(joined({"--notes", file, "--overwrite", "--summary"}, more));
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        return contentOf(file);
    }
    json notesAsJson(const Words& more = {}) const { return json::parse(notes(".json", more)); }

    const TempFolder folder;
    const std::string oldFile;
    const std::string newFile;
    std::string project;
};

/// The step of that number.
json stepOf(const json& notes, int number)
{
    for (const json& reel : notes.at("reels")) {
        for (const json& row : reel.at("rows")) {
            if (row.value("number", 0) == number)
                return row;
        }
    }
    ADD_FAILURE() << "there is no step " << number;
    return {};
}

/// The sound of all steps, and last that which changed elsewhere.
std::vector<json> soundsOf(const json& notes)
{
    std::vector<json> sounds;
    for (const json& reel : notes.at("reels")) {
        for (const json& row : reel.at("rows")) {
            if (row.at("row") == "step")
                sounds.push_back(row.at("sound"));
        }
    }
    sounds.push_back(notes.at("sound").at("elsewhere"));
    return sounds;
}

TEST(ApplyNotes, TellAtEachStepWhatHappenedToTheSound)
{
    const Sound sound;

    const std::string text = sound.notes(".txt");

    EXPECT_TRUE(tells(text, "Sound       scene.stage, 5 clips: 1 stay, 3 moved, 1 trimmed, 2 split, 1 fell\n"
                            "            out\n"))
        << text;
    EXPECT_TRUE(tells(text, "   1  01:00:10:00  delete 00:00:02:00                  -00:00:02:00 -00:00:02:00\n"
                            "      head -48 frames                    TWO\n"
                            "      sound: 1 split, 1 fell out, on DIA\n"
                            "        split, -00:00:02:00       01:00:08:00    DIA: long line\n"
                            "        fell out, 00:00:01:00     01:00:10:12    DIA: lost\n"))
        << text;
    EXPECT_TRUE(tells(text, "      inserted 00:00:04:00               NEW\n"
                            "        roll B009, source 05:00:00:00\n"
                            "      sound: 1 split, on DIA\n"
                            "        split                     01:00:18:00    DIA: over the cut\n"))
        << text;
    EXPECT_FALSE(tells(text, "where no picture did")) << text;
}

TEST(ApplyNotes, ADoubledClipTellsItsOldTimeFirstAndItsNewOneAfterItsName)
{
    // The weir stands once more at the end of the example.
    const TempFolder folder;
    const auto notes = [&folder](const char* file) {
        const Outcome outcome = runCadrel(
            {"apply", treePath("examples/reel3/reel3.stage"), "--old", treePath("examples/reel3/reel3_v07.edl"),
             "--new", treePath("examples/reel3/reel3_v12.edl"), "--vfx", "VFX_****_v,_comp", "--notes", folder / file});
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        return unbroken(contentOf(folder / file));
    };

    EXPECT_TRUE(tells(notes("notes.txt"), " once more 03:00:06:02 FX 1: weir roar, close, now at 03:13:05:15 "));
    EXPECT_TRUE(tells(notes("notes.html"), "<span class=\"tc\">03:00:06:02</span> <bdi>FX 1: weir roar, close</bdi> "
                                           "<small>once more, now at 03:13:05:15</small>"));
    EXPECT_TRUE(tells(notes("notes.csv"), "FX 1: weir roar, close at 03:00:06:02: once more, now at 03:13:05:15"));
}

TEST(ApplyNotes, TheHealingIsThatOfTheChangeEdlThatWasApplied)
{
    // The last shot is cut in two in both cuts.
    const std::string first = cut("001", "A001", "01:00:00:00 01:00:08:00", "01:00:00:00 01:00:08:00");
    const std::string before = first + cut("002", "A002", "01:00:00:00 01:00:02:00", "01:00:08:00 01:00:10:00") +
                               cut("003", "A003", "01:00:00:00 01:00:02:00", "01:00:10:00 01:00:12:00") +
                               cut("004", "A003", "01:00:02:00 01:00:05:00", "01:00:12:00 01:00:15:00");
    const std::string after = first + cut("002", "A003", "01:00:00:00 01:00:02:00", "01:00:08:00 01:00:10:00") +
                              cut("003", "A003", "01:00:02:00 01:00:05:00", "01:00:10:00 01:00:13:00");
    const Sound sound;
    const std::string oldFile = sound.folder.write("a.edl", before);
    const std::string newFile = sound.folder.write("b.edl", after);

    const Outcome outcome =
        runCadrel({"apply", sound.project, "--old", oldFile, "--new", newFile, "--notes", sound.folder / "notes.txt"});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    const std::string text = unbroken(contentOf(sound.folder / "notes.txt"));
    EXPECT_TRUE(tells(text, "Of the change EDL that was applied: 1 event healed from 2; the steps above")) << text;
    EXPECT_FALSE(tells(text, "For the change EDL")) << text;
}

TEST(ApplyNotes, LongLinesOfTheSoundAreWrappedOnPaper)
{
    const auto wide = [](const char* name) { return track("audio", name, clip("room", 3608, 3614)); };
    const Sound sound("WIDE WINDOW WASH WALL A", "long line",
                      {wide("WIDE WINDOW WASH WALL B"), wide("WIDE WINDOW WASH WALL C"),
                       wide("WIDE WINDOW WASH WALL D"), wide("WIDE WINDOW WASH WALL E")});

    sound.notes(".pdf");

    const std::string paper = unbroken(textOfPdf(sound.folder / "notes.pdf"));
    EXPECT_TRUE(tells(paper, "sound: 5 split, 1 fell out, on WIDE WINDOW WASH WALL A, WIDE WINDOW WASH WALL B, "
                             "WIDE WINDOW WASH WALL C, WIDE WINDOW WASH WALL D and 1 more"))
        << paper;
}

TEST(ApplyNotes, TheHeadTellsOfWhichCutTheTimesOfTheSoundAre)
{
    const std::string sentence = "The time of a clip is its start in the old project; of what is new, and where "
                                 "automation jumps, it is that of the new cut.";
    const Sound sound;
    const std::string paper = sound.folder / "notes.pdf";
    sound.notes(".pdf");

    for (const std::string& form : {sound.notes(".txt"), sound.notes(".html"), textOfPdf(paper)})
        EXPECT_TRUE(tells(unbroken(form), sentence)) << form;
    EXPECT_FALSE(tells(unbroken(Cuts(oldCut(), newCut()).notes().out), sentence));
}

TEST(ApplyNotes, TheCsvHasColumnsForTheSound)
{
    const Sound sound;

    const std::string csv = sound.notes(".csv");

    EXPECT_TRUE(tells(csv, ",source_in,scenes,sound_trimmed,sound_split,sound_doubled,sound_fell_out,sound_new,"
                           "sound_moved,sound_tracks,automation_jumps,sound\r\n"))
        << csv;
    EXPECT_TRUE(tells(csv, "TWO: head -48 frames,15+00,,1,,24 fps,,,0,1,0,1,0,0,DIA,0,"
                           "\"DIA: long line at 01:00:08:00: split, -00:00:02:00; "
                           "DIA: lost at 01:00:10:12: fell out, 00:00:01:00\"\r\n"))
        << csv;
    EXPECT_EQ(std::count(csv.begin(), csv.end(), '\n'), 3);
}

TEST(ApplyNotes, NoNameOfTheSoundIsAFormulaInTheCsv)
{
    const Sound sound("@DIA", "=1+1", {track("marker", "Scenes", range("+2", 3600, 3630))});

    const std::string csv = sound.notes(".csv");

    EXPECT_TRUE(tells(csv, ",'+2,0,1,0,1,0,0,'@DIA,0,\"'@DIA: =1+1 at 01:00:08:00: split, -00:00:02:00; ")) << csv;
}

TEST(ApplyNotes, TheJsonHasTheTimesOfEachChange)
{
    const Sound sound;

    const json notes = sound.notesAsJson();

    EXPECT_EQ(notes.at("sound").at("project"), "scene.stage");
    EXPECT_EQ(notes.at("sound").at("tracks").at(0), json::parse(R"({"name": "DIA", "kind": "audio", "folders": []})"));
    const json step = stepOf(notes, 1).at("sound");
    EXPECT_EQ(step.at("tracks"), json({1}));
    ASSERT_EQ(step.at("changes").size(), 2U);
    EXPECT_EQ(step.at("changes")[0], json::parse(R"({"kind": "split", "track": 1, "trackName": "DIA", "on": "clip",
        "name": "long line",
        "was": {"in": {"seconds": 3608.0, "timecode": "01:00:08:00"}, "out": {"seconds": 3614.0, "timecode": "01:00:14:00"}},
        "lost": {"in": {"seconds": 3610.0, "timecode": "01:00:10:00"},
                 "out": {"seconds": 3612.0, "timecode": "01:00:12:00"}}})"));
    EXPECT_EQ(step.at("changes")[1].at("kind"), "fell-out");
}

TEST(ApplyNotes, QuotesAndOtherScriptsInNamesAreWholeInTheJson)
{
    const std::string name = "\"key\" \\ \t Größe 海";
    const Sound sound("DIA \"1\"", name);

    const json change = stepOf(sound.notesAsJson(), 1).at("sound").at("changes")[0];

    EXPECT_EQ(change.at("name"), name);
    EXPECT_EQ(change.at("trackName"), "DIA \"1\"");
}

TEST(ApplyNotes, TellTheSettingsOfTheRun)
{
    const Sound sound;
    const std::string file = sound.folder / "notes.json";
    const Outcome outcome =
        sound.apply({"--notes", file, "--simplify", "2", "--overhang", "6", "--no-b-roll", "--json", "-"});

    ASSERT_EQ(outcome.status, 0) << outcome.err;
    json expected = json::parse(outcome.out).at("settings");
    EXPECT_EQ(expected.at("overhang"), json::parse(R"({"value": 6, "from": "command line"})"));
    expected["simplify"] = {{"value", 2}, {"from", "command line"}};
    EXPECT_EQ(json::parse(contentOf(file)).at("settings"), expected);
    EXPECT_TRUE(tells(sound.notes(".txt", {"--overhang", "6", "--no-b-roll"}),
                      "\nFrame rate  24 fps\nSettings    command line  --overhang 6 --no-b-roll\n"
                      "            default       --tracks all --match roll --heal normal --vfx none\n"));
    EXPECT_FALSE(tells(sound.notes(".csv", {"--overhang", "6"}), "overhang"));
}

TEST(ApplyNotes, TheJsonKeepsToItsSchema)
{
    const JsonSchema schema("notes");
    const Sound sound("DIA", "long line", {track("marker", "Scenes", range("1", 3600, 3630))});
    const json notes = sound.notesAsJson();

    EXPECT_EQ(schema.faultOf(notes), "");

    json number = notes;
    number["reels"][0]["rows"][1]["sound"]["changes"][0]["kind"] = 2;
    EXPECT_NE(schema.faultOf(number), "");
}

TEST(ApplyNotes, ThePageFoldsTheSoundUnderItsStep)
{
    const Sound sound;

    const std::string page = sound.notes(".html");

    EXPECT_TRUE(tells(
        page, "<details class=\"sound\"><summary><span class=\"tag sound\">sound</span>1 split, 1 fell out, on DIA"
              "</summary><ul><li><span class=\"tc\">01:00:08:00</span> <bdi>DIA: long line</bdi> "
              "<small>split, -00:00:02:00</small></li>"))
        << page;
    EXPECT_TRUE(tells(page, "<button data-sound>"));
    for (const char* const loading : {"http://", "https://", "src=", "@import", "url(", "<link"})
        EXPECT_FALSE(tells(page, loading)) << loading;
}

TEST(ApplyNotes, NotesOfThePictureAloneHaveNothingOfTheSound)
{
    const Sound sound;
    for (const std::string extension : {".html", ".csv", ".txt", ".json"}) {
        const std::string file = sound.folder / ("picture" + extension);
        ASSERT_EQ(runCadrel({"notes", "--old", sound.oldFile, "--new", sound.newFile, "-o", file}).status, 0);

        const std::string notes = contentOf(file);

        EXPECT_FALSE(tells(notes, "sound:") || tells(notes, "sound_") || tells(notes, "\"sound\"") ||
                     tells(notes, "data-sound>"))
            << extension;
    }
}

TEST(ApplyNotes, NamesCantBreakThePageOrActInASpreadsheet)
{
    const Sound sound("=CMD()", "<script>\"&\x1b[31m\n", {track("marker", "Scenes", range("@SUM(1)", 3600, 3630))});

    const std::string page = sound.notes(".html");
    EXPECT_FALSE(tells(page, "<script>\"&"));
    EXPECT_TRUE(tells(page, "=CMD(): &lt;script&gt;&quot;&amp;?[31m?</bdi> <small>")) << page;

    const std::string csv = sound.notes(".csv");
    EXPECT_TRUE(tells(csv, ",'@SUM(1),0,1,0,1,0,0,'=CMD(),0,\"'=CMD(): <script>\"\"&?[31m? at 01:00:08:00: split"))
        << csv;

    EXPECT_FALSE(tells(sound.notes(".txt"), "\x1b["));
    sound.notes(".pdf");
    EXPECT_FALSE(tells(textOfPdf(sound.folder / "notes.pdf"), "\x1b["));
    EXPECT_EQ(stepOf(sound.notesAsJson(), 1).at("sound").at("changes")[0].at("name"), "<script>\"&\x1b[31m\n");
}

TEST(ApplyNotes, LongNamesMakeNoLineWider)
{
    const Sound sound(std::string(90, 'T'), std::string(90, 'N'),
                      {track("marker", "Scenes", range(std::string(90, 'S'), 3600, 3630))});

    std::istringstream lines(sound.notes(".txt"));

    for (std::string line; std::getline(lines, line);) {
        const auto cutNames = std::count(line.begin(), line.end(), '\xE2');
        EXPECT_LE(static_cast<std::ptrdiff_t>(line.size()) - 2 * cutNames, 80) << line;
    }
}

TEST(ApplyNotes, ScenesAreTheRangesThatTakeHalfOfTheOldCutOrMore)
{
    const auto scenesAt = [](const Words& markers) {
        const Sound sound("DIA", "long line", markers);
        const json notes = sound.notesAsJson();
        return std::pair(notes.at("sound").at("sceneTrack"), stepOf(notes, 1).at("sound").at("scenes"));
    };
    const std::string half = track("marker", "Half", range("a", 3600, 3611) + "," + range("b", 3620, 3624));
    const std::string less = track("marker", "Less", range("c", 3600, 3611) + "," + range("d", 3620, 3623.5));
    const std::string more = track("marker", "More", range("e", 3605, 3611) + "," + range("f", 3611, 3630));

    EXPECT_EQ(scenesAt({half}), (std::pair<json, json>("Half", {"a"})));
    EXPECT_EQ(scenesAt({less}), (std::pair<json, json>(nullptr, json::array())));
    EXPECT_EQ(scenesAt({half, more, less}), (std::pair<json, json>("More", {"e", "f"})));
}

TEST(ApplyNotes, MarkersOfTheUserAreToldButForTheScenes)
{
    const Sound sound("DIA", "long line",
                      {track("marker", "Scenes", range("1", 3600, 3630)),
                       track("marker", "Cues", range("ADR 1", 3610.5, 3611) + "," + range("ADR 2", 3613, 3614))});

    const json notes = sound.notesAsJson();

    const json changes = stepOf(notes, 1).at("sound").at("changes");
    ASSERT_EQ(changes.size(), 3U);
    EXPECT_EQ(changes[2].at("on"), "marker");
    EXPECT_EQ(changes[2].at("name"), "ADR 1");
    EXPECT_EQ(notes.at("sound").at("markers").at("all"), 2);
}

TEST(ApplyNotes, WhatChangesWhereNoPictureDidIsToldElsewhere)
{
    // With --keep cut the change EDL alone counts: the tail, ten seconds after the last picture, falls out.
    const Sound sound("DIA", "long line", {track("audio", "Tail", clip("tail pop", 3640, 3645))});
    const Words keepCut{"--keep", "cut"};

    const json notes = sound.notesAsJson(keepCut);

    const json& elsewhere = notes.at("sound").at("elsewhere");
    ASSERT_EQ(elsewhere.at("changes").size(), 1U);
    EXPECT_EQ(elsewhere.at("changes")[0].at("kind"), "fell-out");
    EXPECT_EQ(elsewhere.at("changes")[0].at("name"), "tail pop");
    EXPECT_TRUE(tells(sound.notes(".txt", keepCut),
                      "\nSound that changed where no picture did\n"
                      "      sound: 1 fell out, on Tail\n"
                      "        fell out, 00:00:05:00     01:00:40:00    Tail: tail pop\n"));
    EXPECT_TRUE(tells(sound.notes(".html", keepCut), "<h2>Sound that changed where no picture did</h2>\n<details"));
    EXPECT_TRUE(tells(sound.notes(".csv", keepCut), "\r\n,,elsewhere,,,,,,,,,,,,,,,,,,,,,,,,0,0,0,1,0,0,Tail,0,"));
}

TEST(ApplyNotes, OfCutsWithoutAChangeTellThatNothingHasChanged)
{
    const Sound sound;
    const std::string file = sound.folder / "notes.txt";

    const Outcome outcome =
        runCadrel({"apply", sound.project, "--old", sound.oldFile, "--new", sound.oldFile, "--notes", file});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    const std::string text = contentOf(file);
    EXPECT_TRUE(tells(text, "\nNothing has changed.\n")) << text;
    EXPECT_TRUE(tells(text, "\n  No track had to change, so the sound is as it was\n")) << text;
    EXPECT_TRUE(tells(outcome.out, "\nNothing has changed.\n")) << outcome.out;
}

TEST(ApplyNotes, OfARestrictedRunTellAllOfThePictureAndOnlyItsOwnSound)
{
    const Sound sound;
    const Words restricted{"--preserve", "01:00:16:00", "01:00:40:00"};

    const json notes = sound.notesAsJson(restricted);

    EXPECT_EQ(notes.at("totals").at("steps"), 2);
    EXPECT_TRUE(stepOf(notes, 1).at("sound").at("changes").empty()) << stepOf(notes, 1);
    EXPECT_EQ(stepOf(notes, 2).at("sound").at("changes").size(), 1U);
    EXPECT_TRUE(tells(sound.notes(".txt", restricted),
                      "  Only the sound between 01:00:16:00 and 01:00:40:00 was carried over\n"));
}

TEST(ApplyNotes, TellWhenNobodyHasLookedForJumpsOfTheAutomation)
{
    const Sound sound;

    EXPECT_EQ(sound.notesAsJson().at("sound").at("automationWatched"), true);
    EXPECT_EQ(sound.notesAsJson({"--no-automation-markers"}).at("sound").at("automationWatched"), false);
    EXPECT_TRUE(
        tells(sound.notes(".html", {"--no-automation-markers"}), "Nobody has looked for jumps of the automation"));
}

TEST(ApplyNotes, ManyClipsAtOneStepAreCounted)
{
    std::string clips = clip("step 0", 3610.1, 3610.12);
    for (int number = 1; number < 40; ++number)
        clips.append(",").append(clip("step", 3610.1 + number * 0.04, 3610.12 + number * 0.04));
    const Sound sound("DIA", "long line", {track("audio", "Feet", clips)});

    // "long line", "lost" and 40 steps; 30 are listed.
    const std::string text = sound.notes(".txt");
    EXPECT_TRUE(tells(text, "      sound: 1 split, 41 fell out, on DIA, Feet\n")) << text;
    EXPECT_TRUE(tells(text, "        and 12 more, which the JSON lists\n")) << text;
    EXPECT_TRUE(tells(sound.notes(".html"), "<li>and 12 more, which the JSON lists</li>"));
    EXPECT_TRUE(tells(sound.notes(".csv"), "; and 12 more, which the JSON lists\""));
    EXPECT_EQ(stepOf(sound.notesAsJson(), 1).at("sound").at("changes").size(), 42U);
}

TEST(ApplyNotes, AreWrittenInAllFormsWithoutAProject)
{
    const Sound sound;
    for (const std::string extension : Extensions) {
        const std::string file = sound.folder / ("notes" + extension);

        const Outcome outcome = sound.apply({"--notes", file, "--feet", "--simplify", "10", "--paper", "letter"});

        EXPECT_EQ(outcome.status, 0) << outcome.err;
        EXPECT_TRUE(tells(outcome.out, ", no project; give -o") || tells(outcome.out, "Written     " + file))
            << outcome.out;
        EXPECT_FALSE(contentOf(file).empty());
    }
    EXPECT_TRUE(tells(contentOf(sound.folder / "notes.pdf"), "/MediaBox [ 0 0 612 792 ]"));
    EXPECT_TRUE(tells(contentOf(sound.folder / "notes.txt"), "delete 15+00 through 17+15"));
}

TEST(ApplyNotes, AreOnlyWrittenWhenTheRunSucceeds)
{
    const Sound sound;
    const std::string file = sound.folder / "notes.html";

    // The folder of the project isn't there.
    EXPECT_EQ(sound.apply({"--notes", file, "-o", sound.folder / "none" / "new.stage"}).status, 1);
    // The cuts share no name.
    const std::string other =
        sound.folder.write("other.edl", cut("001", "Z001", "10:00:00:00 10:00:30:00", "01:00:00:00 01:00:30:00"));
    EXPECT_EQ(runCadrel({"apply", sound.project, "--old", sound.oldFile, "--new", other, "--notes", file}).status, 1);

    EXPECT_FALSE(std::filesystem::exists(file));
}

TEST(ApplyNotes, ReplaceAFileOnlyWhereTheUserAllowsIt)
{
    const Sound sound;
    const std::string file = sound.folder.write("notes.txt", "mine");

    const Outcome refused = sound.apply({"--notes", file});
    EXPECT_EQ(refused.status, 1);
    EXPECT_TRUE(tells(refused.err, "--overwrite")) << refused.err;
    EXPECT_EQ(contentOf(file), "mine");

    const Outcome replaced = sound.apply({"--notes", file, "--overwrite", "--backup"});
    EXPECT_EQ(replaced.status, 0) << replaced.err;
    EXPECT_TRUE(tells(contentOf(file), "Change notes") || tells(contentOf(file), "Old cut"));
    EXPECT_EQ(contentOf(sound.folder / "notes_backup_1.txt"), "mine");
    EXPECT_TRUE(tells(replaced.out, "Backup      ")) << replaced.out;
}

TEST(ApplyNotes, AreRefusedInThePlaceOfAnotherFileOfTheRun)
{
    const Sound sound;
    const std::string stage = sound.folder / "result.txt";
    const std::string old = sound.folder.write("old.txt", oldCut());

    EXPECT_EQ(sound.apply({"--notes", stage, "-o", stage}).status, 2);
    EXPECT_EQ(sound.apply({"--notes", stage, "--json", stage}).status, 2);
    EXPECT_EQ(
        runCadrel({"apply", sound.project, "--old", old, "--new", sound.newFile, "--notes", old, "--overwrite"}).status,
        2);
    EXPECT_EQ(contentOf(old), oldCut());
}

TEST(ApplyNotes, NeedAFormAndBothCuts)
{
    const Sound sound;
    const std::string file = sound.folder / "notes.doc";
    const std::string change = sound.folder / "change.edl";
    ASSERT_EQ(runCadrel({"generate", "--old", sound.oldFile, "--new", sound.newFile, "-o", change}).status, 0);

    const Outcome formless = sound.apply({"--notes", file});
    EXPECT_EQ(formless.status, 2);
    EXPECT_TRUE(tells(formless.err, "--notes: the name has to end in .html")) << formless.err;
    EXPECT_EQ(sound.apply({"--notes", "-"}).status, 2);
    EXPECT_EQ(sound.apply({"--feet"}).status, 2);
    EXPECT_EQ(sound.apply({"--clips", "--summary"}).status, 2);
    EXPECT_EQ(runCadrel({"apply", sound.project, "--change", change, "--notes", sound.folder / "notes.txt"}).status, 2);
}

// The report on the screen

TEST(ApplyReport, HasTheHeadOfTheNotesAndTheClipsOnlyOnRequest)
{
    const Sound sound;

    const std::string report = sound.apply().out;
    const std::string head = "\n\nLength      00:00:30:00 before, 00:00:32:00 after, +00:00:02:00\n"
                             "Old picture 00:00:28:00 kept, 00:00:02:00 lifted\n"
                             "New picture 00:00:04:00 inserted, 00:00:00:00 doubled\n"
                             "Moved       00:00:00:00\n"
                             "Steps       2 in 1 reel\n"
                             "\n"
                             "The largest changes\n"
                             "   2  insert 00:00:04:00                 NEW\n"
                             "      sound: 1 split, on 1 track\n"
                             "   1  delete 00:00:02:00                 TWO\n"
                             "      sound: 1 split, 1 fell out, on 1 track\n"
                             "\n";
    EXPECT_TRUE(tells(report, head + "--notes NOTES.html tells every step, and --clips lists every clip.\n")) << report;
    EXPECT_FALSE(tells(report, "was in"));

    const std::string clips = sound.apply({"--clips"}).out;
    EXPECT_TRUE(tells(clips, head + "Clip by clip\n\ntrack")) << clips;
    EXPECT_TRUE(tells(clips, "was in"));
    EXPECT_TRUE(tells(clips, "\nInsert, 1 marker\n"));
    EXPECT_FALSE(tells(clips, "--clips lists"));

    EXPECT_FALSE(tells(sound.apply({"--summary"}).out, "largest"));
    EXPECT_TRUE(tells(sound.apply({"--notes", sound.folder / "notes.txt"}).out, "\n\n--clips lists every clip.\n"));
}

TEST(ApplyReport, OfAChangeEdlHasNoNotes)
{
    const Sound sound;
    const std::string change = sound.folder / "change.edl";
    ASSERT_EQ(runCadrel({"generate", "--old", sound.oldFile, "--new", sound.newFile, "-o", change}).status, 0);

    const Outcome outcome = runCadrel({"apply", sound.project, "--change", change});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_FALSE(tells(outcome.out, "largest"));
    EXPECT_TRUE(outcome.out.ends_with("\n\n--clips lists every clip.\n")) << outcome.out;
}

// The example reel

const std::string Reel3 = treePath("examples/reel3/");

Words reel3(const Words& more)
{
    return joined({"apply", Reel3 + "reel3.stage", "--old", Reel3 + "reel3_v07.edl", "--new", Reel3 + "reel3_v12.edl",
                   "--vfx", "VFX_****_v,_comp"},
                  more);
}

/// The report of a run of the example and its notes, as JSON.
struct Told {
    json report;
    json notes;
};

Told tellOf(const Words& more)
{
    const TempFolder folder;
    const std::string report = folder / "report.json";
    const std::string notes = folder / "notes.json";
    const Outcome outcome = runCadrel(reel3(joined({"--summary", "--json", report, "--notes", notes}, more)));
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    return {json::parse(contentOf(report)), json::parse(contentOf(notes))};
}

/// What became of a clip, in thousandths of a frame.
struct Became {
    long head = 0;
    long between = 0;
    long tail = 0;
    int splits = 0;
    int doubles = 0;
    int fellOut = 0;
    int added = 0;

    auto operator<=>(const Became&) const = default;
};

long subframes(double seconds)
{
    return std::lround(seconds * 24000);
}

/// By track, name and old start; clips that are alike in them are added up.
using Clips = std::map<std::tuple<std::string, std::string, long>, Became>;

Clips becameInReport(const json& report, const json& sceneTrack)
{
    Clips clips;
    for (const json& track : report.at("tracks")) {
        if (track.at("name") == sceneTrack)
            continue;
        for (const json& change : track.at("changes")) {
            const bool isNew = change.at("was").is_null();
            const json& place = isNew ? change.at("now").at(0) : change.at("was");
            const std::string name = change.at("name");
            Became& became = clips[{track.at("name"), name.empty() ? change.value("clip", "") : name,
                                    isNew ? 0 : subframes(place.at("in").at("seconds"))}];
            if (isNew) {
                ++became.added;
                continue;
            }
            became.head += subframes(change.at("trimmed").at("start").at("seconds"));
            became.between += subframes(change.at("trimmed").at("middle").at("seconds"));
            became.tail += subframes(change.at("trimmed").at("end").at("seconds"));
            became.splits += change.at("split").get<bool>() ? 1 : 0;
            became.doubles += change.at("doubled").get<bool>() ? 1 : 0;
            became.fellOut += change.at("now").empty() ? 1 : 0;
        }
    }
    std::erase_if(clips, [](const auto& entry) { return entry.second == Became(); });
    return clips;
}

Clips becameInNotes(const json& notes)
{
    Clips clips;
    for (const json& sound : soundsOf(notes)) {
        for (const json& change : sound.at("changes")) {
            const std::string kind = change.at("kind");
            const bool isNew = kind == "added";
            Became& became = clips[{change.at("trackName"), change.at("name"),
                                    isNew ? 0 : subframes(change.at("was").at("in").at("seconds"))}];
            const auto lost = [&change] {
                return subframes(change.at("lost").at("out").at("seconds").get<double>() -
                                 change.at("lost").at("in").at("seconds").get<double>());
            };
            if (kind == "head-trimmed")
                became.head += lost();
            else if (kind == "tail-trimmed")
                became.tail += lost();
            else if (kind == "split")
                became.between += lost();
            became.splits = kind == "split" ? 1 : became.splits;
            became.doubles = kind == "doubled" ? 1 : became.doubles;
            became.fellOut += kind == "fell-out" ? 1 : 0;
            became.added += isNew ? 1 : 0;
        }
    }
    return clips;
}

/// Rounding may add up over many pieces.
void expectSame(const Clips& expected, const Clips& told)
{
    EXPECT_EQ(expected.size(), told.size());
    for (const auto& [clip, became] : expected) {
        const auto found = told.find(clip);
        ASSERT_NE(found, told.end()) << std::get<0>(clip) << ", " << std::get<1>(clip);
        const std::string name = std::get<0>(clip) + ", " + std::get<1>(clip);
        EXPECT_NEAR(static_cast<double>(became.head), static_cast<double>(found->second.head), 2) << name;
        EXPECT_NEAR(static_cast<double>(became.between), static_cast<double>(found->second.between), 60) << name;
        EXPECT_NEAR(static_cast<double>(became.tail), static_cast<double>(found->second.tail), 2) << name;
        EXPECT_EQ(std::tie(became.splits, became.doubles, became.fellOut, became.added),
                  std::tie(found->second.splits, found->second.doubles, found->second.fellOut, found->second.added))
            << name;
    }
}

class ApplyNotesOfReel3 : public testing::TestWithParam<Words> {};

TEST_P(ApplyNotesOfReel3, TellEachChangeOfEachClipOnce)
{
    const Told told = tellOf(GetParam());
    const json& sound = told.notes.at("sound");

    const Clips expected = becameInReport(told.report, sound.at("sceneTrack"));

    EXPECT_FALSE(expected.empty());
    expectSame(expected, becameInNotes(told.notes));
    // A clip is told once at a step for each thing that happens to it there.
    for (const json& step : soundsOf(told.notes)) {
        std::vector<std::string> lines;
        for (const json& change : step.at("changes"))
            lines.push_back(change.dump());
        std::sort(lines.begin(), lines.end());
        EXPECT_EQ(std::adjacent_find(lines.begin(), lines.end()), lines.end());
    }
}

TEST_P(ApplyNotesOfReel3, CountWhatTheReportCounts)
{
    const Told told = tellOf(GetParam());
    const json& sound = told.notes.at("sound");

    json clips{{"all", 0},   {"stay", 0},    {"moved", 0},   {"trimmed", 0},
               {"split", 0}, {"doubled", 0}, {"inNoCut", 0}, {"new", 0}};
    json markers = clips;
    for (const json& track : told.report.at("tracks")) {
        if (track.at("name") == sound.at("sceneTrack"))
            continue;
        json& counts = track.at("kind") == "marker" ? markers : clips;
        for (auto& [key, count] : counts.items())
            count = count.get<int>() + track.at(key == "all" ? "holds" : key).get<int>();
    }
    EXPECT_EQ(sound.at("clips"), clips);
    EXPECT_EQ(sound.at("markers"), markers);

    std::size_t jumps = 0;
    for (const json& step : soundsOf(told.notes))
        jumps += step.at("automationJumps").size();
    const json& all = told.report.at("markers");
    EXPECT_EQ(jumps, static_cast<std::size_t>(std::count_if(all.begin(), all.end(), [](const json& marker) {
                  return marker.at("kind") == "Automation Warning";
              })));
}

INSTANTIATE_TEST_SUITE_P(AnyRun, ApplyNotesOfReel3,
                         testing::Values(Words{}, Words{"--keep", "cut"}, Words{"--heal", "none"},
                                         Words{"--heal", "inserts"}, Words{"--preserve", "03:02:00:00", "03:06:30:00"},
                                         Words{"--tracks", "selected"}, Words{"--overhang", "12"},
                                         Words{"--simplify", "400"}, Words{"--no-automation-markers"},
                                         Words{"--match", "clip", "--force"}, Words{"--no-b-roll", "--force"}));

TEST(ApplyNotesOfTheExample, HaveTheStepsOfTheNotesWithoutSound)
{
    const TempFolder folder;
    const std::string file = folder / "notes.json";
    ASSERT_EQ(runCadrel({"notes", "--old", Reel3 + "reel3_v07.edl", "--new", Reel3 + "reel3_v12.edl", "--vfx",
                         "VFX_****_v,_comp", "-o", file})
                  .status,
              0);
    json notes = tellOf({}).notes;

    notes.erase("sound");
    for (json& row : notes["reels"][0]["rows"])
        row.erase("sound");
    json expected = json::parse(contentOf(file));
    // The list that is carried out begins with the first change.
    expected.erase("healed");
    notes.erase("healed");
    // A run has settings of its own.
    expected.erase("settings");
    notes.erase("settings");
    EXPECT_EQ(notes, expected);
}

TEST(ApplyNotesOfTheExample, TellTheSoundOfTheStairAtTheStepThatTakesItOut)
{
    const json notes = tellOf({}).notes;

    EXPECT_EQ(notes.at("sound").at("sceneTrack"), "Scenes");
    for (const json& sound : soundsOf(notes)) {
        const json& scenes = sound.at("scenes");
        const bool isStair = std::find(scenes.begin(), scenes.end(), "43 Stair") != scenes.end();
        int inStair = 0;
        for (const json& change : sound.at("changes"))
            inStair += change.at("kind") == "fell-out" && change.value("part", "") == "stair, up and listening" ? 1 : 0;
        EXPECT_EQ(inStair, isStair ? 3 : 0);
    }
    // The weir that comes once more, with what sounds there.
    for (const json& reel : notes.at("reels")) {
        for (const json& row : reel.at("rows")) {
            if (row.at("row") != "step")
                continue;
            const bool isDoubled = std::any_of(row.at("changes").begin(), row.at("changes").end(),
                                               [](const json& change) { return change.at("kind") == "doubled"; });
            const auto clips = std::count_if(row.at("sound").at("changes").begin(), row.at("sound").at("changes").end(),
                                             [](const json& change) { return change.at("kind") == "doubled"; });
            EXPECT_EQ(clips, isDoubled ? 3 : 0);
        }
    }
    EXPECT_TRUE(notes.at("sound").at("elsewhere").at("changes").empty());
}

TEST(ApplyNotesOfTheExample, NoLineOfTheTextIsWiderThan80Columns)
{
    const TempFolder folder;
    const std::string file = folder / "notes.txt";
    const Outcome outcome = runCadrel(reel3({"--notes", file, "--feet"}));
    ASSERT_EQ(outcome.status, 0) << outcome.err;

    std::istringstream lines(contentOf(file));
    for (std::string line; std::getline(lines, line);) {
        const auto cutNames = std::count(line.begin(), line.end(), '\xE2');
        EXPECT_LE(static_cast<std::ptrdiff_t>(line.size()) - 2 * cutNames, 80) << line;
    }
    // The report is about a screenful: its totals, the figures, and two lines for each of ten changes.
    EXPECT_LE(std::count(outcome.out.begin(), outcome.out.end(), '\n'), 50);
}

TEST(ApplyNotesOfTheExample, ItsLargestChangesStandInTheDocumentsAsTheReportPrintsThem)
{
    const Outcome outcome = runCadrel(reel3({}));
    ASSERT_EQ(outcome.status, 0) << outcome.err;

    for (const char* const page : {"README.md", "docs/commands.md"}) {
        const std::string text = contentOf(treePath(page));
        const std::size_t start = text.find("The largest changes\n");
        ASSERT_NE(start, std::string::npos) << page;
        const std::string shown = text.substr(start, text.find("...\n", start) - start);
        EXPECT_EQ(std::count(shown.begin(), shown.end(), '\n'), 5) << shown;
        EXPECT_NE(outcome.out.find(shown), std::string::npos) << page << "\n" << outcome.out;
    }
}

} // namespace
