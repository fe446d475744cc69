// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/NotesOfCuts.h"
#include "tests/app/ProgramRun.h"
#include "tests/support/TreePaths.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdio>
#include <filesystem>
#include <gtest/gtest.h>
#include <map>
#include <nlohmann/json.hpp>
#include <regex>
#include <sstream>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

std::vector<std::string> linesOf(const std::string& text)
{
    std::vector<std::string> lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);)
        lines.push_back(line);
    return lines;
}

/// The characters of a text in UTF-8.
std::ptrdiff_t columnsOf(const std::string& text)
{
    return std::count_if(text.begin(), text.end(),
                         [](char byte) { return (static_cast<unsigned char>(byte) & 0xC0U) != 0x80U; });
}

std::vector<std::string> reel3(std::vector<std::string> more)
{
    std::vector<std::string> arguments{"notes",
                                       "--old",
                                       treePath("examples/reel3/reel3_v07.edl"),
                                       "--new",
                                       treePath("examples/reel3/reel3_v12.edl"),
                                       "--vfx",
                                       "VFX_****_v,_comp"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    return arguments;
}

json reel3Json()
{
    const TempFolder folder;
    const std::string path = folder / "notes.json";
    const Outcome outcome = runCadrel(reel3({"-o", path}));
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    return json::parse(contentOf(path));
}

TEST(Notes, ShowsTheStepsAsText)
{
    const Cuts film(oldCut(), newCut());

    const Outcome outcome = film.notes();

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    const std::string steps = "Reel 1, 01:00:00:00\n"
                              "00:00:30:00 before, 00:00:32:00 after, +00:00:02:00\n"
                              "\n"
                              "step  at           what to do                                length       offset\n"
                              "      01:00:00:00  kept 00:00:10:00, was 01:00:00:00                 00:00:00:00\n"
                              "   1  01:00:10:00  delete 00:00:02:00                  -00:00:02:00 -00:00:02:00\n"
                              "      head -48 frames                    TWO\n"
                              "      01:00:10:00  kept 00:00:08:00, was 01:00:12:00                -00:00:02:00\n"
                              "   2  01:00:18:00  insert 00:00:04:00                  +00:00:04:00 +00:00:02:00\n"
                              "      inserted 00:00:04:00               NEW\n"
                              "        roll B009, source 05:00:00:00\n"
                              "      01:00:22:00  kept 00:00:10:00, was 01:00:20:00                +00:00:02:00\n";
    EXPECT_NE(outcome.out.find(steps), std::string::npos) << outcome.out;
}

TEST(Notes, NoLineOfTheTextIsWiderThan80Columns)
{
    const Outcome outcome = runCadrel(reel3({"--feet"}));

    for (const std::string& line : linesOf(outcome.out))
        EXPECT_LE(columnsOf(line), 80) << line;
}

TEST(Notes, LongNamesMakeNoLineWider)
{
    const std::string name(60, 'N');
    const auto shot = [&name](const char* number, const char* roll, const char* source, const char* place) {
        return cut(number, roll, source, place) + clipName(name);
    };
    const Cuts film(shot("001", "A001", "10:00:00:00 10:00:09:12", "01:00:00:00 01:00:09:12") +
                        shot("002", "A002", "10:00:00:00 10:00:01:00", "01:00:09:12 01:00:10:12") +
                        shot("003", "A003", "10:00:00:00 10:00:01:00", "01:00:10:12 01:00:11:12"),
                    shot("001", "A002", "10:00:00:00 10:00:01:00", "01:00:00:00 01:00:01:00") +
                        shot("002", "A003", "10:00:00:00 10:00:01:00", "01:00:01:00 01:00:02:00") +
                        shot("003", "A001", "10:00:00:00 10:00:09:12", "01:00:02:00 01:00:11:12") +
                        shot("004", "A009", "10:00:00:00 10:00:09:12", "01:00:11:12 01:00:21:00"));

    const Outcome outcome = film.notes({"--feet"});

    EXPECT_NE(outcome.out.find(" and 1 more"), std::string::npos) << outcome.out;
    for (const std::string& line : linesOf(outcome.out)) {
        // The sign that a name goes on has three bytes.
        const auto cutNames = std::count(line.begin(), line.end(), '\xE2');
        EXPECT_LE(static_cast<std::ptrdiff_t>(line.size()) - 2 * cutNames, 80) << line;
    }
}

TEST(Notes, LongNamesOfFilesMakeNoLineWider)
{
    const TempFolder folder;
    const std::string oneWord(140, 'O');
    const auto accents = [](int count) {
        std::string text;
        for (int letter = 0; letter < count; ++letter)
            text += "\xC3\xBC"; // one letter of two bytes
        return text;
    };

    const Outcome outcome = runCadrel(
        {"notes", "--old", folder.write(oneWord + ".edl", oldCut()), "--new",
         folder.write("THE SECOND CUT OF THE FILM, AS IT CAME, OF MONDAY, WITH ALL TITLES.edl", newCut()),
         folder.write(accents(90) + ".edl", cut("001", "A009", "10:00:00:00 10:00:01:00", "02:00:00:00 02:00:01:00"))});

    ASSERT_EQ(outcome.status, 0) << outcome.err;
    // The title takes 12 columns, which leaves 68.
    EXPECT_NE(outcome.out.find("Old cut     " + std::string(68, 'O') + "\n            " + std::string(68, 'O') +
                               "\n            OOOO.edl: 3 events, all valid\n"),
              std::string::npos)
        << outcome.out;
    EXPECT_NE(outcome.out.find("New cut     THE SECOND CUT OF THE FILM, AS IT CAME, OF MONDAY, WITH ALL\n"
                               "            TITLES.edl, " +
                               accents(56) + "\n            " + accents(34) + ".edl: 5 events, all valid\n"),
              std::string::npos)
        << outcome.out;
    for (const std::string& line : linesOf(outcome.out))
        EXPECT_LE(columnsOf(line), 80) << line;
}

/// A page with its quotes as they are read.
std::string withQuotes(std::string html)
{
    for (std::size_t at = 0; (at = html.find("&quot;", at)) != std::string::npos;)
        html.replace(at, 6, 1, '"');
    return html;
}

TEST(Notes, TheSettingsAndTheOrderOfTheStepsStandInTheHeadOfThePageAndThePaper)
{
    const Cuts film(oldCut(), newCut());
    const std::vector<std::string> settings{"--heal", "gaps", "--vfx", "VFX_****_v,_comp"};
    const std::string order = "The steps are carried out in order, and their places are those in the programme so far. "
                              "What is moved is taken out first; the place after \"to\" is counted without it.";

    film.file(".pdf", settings);
    const std::string paper = unbroken(textOfPdf(film.folder / "notes.pdf"));
    const std::string page = unbroken(withQuotes(film.file(".html", settings)));

    for (const std::string& form : {paper, page}) {
        EXPECT_NE(form.find("Settings given: --heal gaps --vfx 'VFX_****_v,_comp'"), std::string::npos) << form;
        EXPECT_NE(form.find("Settings by default: --match roll"), std::string::npos) << form;
        EXPECT_EQ(form.find("command line"), std::string::npos) << form;
        EXPECT_NE(form.find(order), std::string::npos) << form;
        EXPECT_LT(form.find(order), form.find("The largest changes"));
    }
    EXPECT_NE(unbroken(film.notes().out).find(order), std::string::npos);
}

TEST(Notes, TheSettingsInForceStandInTheTextAndTheJson)
{
    const Cuts film(oldCut(), newCut());
    const std::string page = film.folder / "notes.json";
    const std::string table = film.folder / "notes.csv";

    const Outcome text = film.notes({"--heal", "gaps", "--vfx", "VFX_****_v,_comp", "--no-b-roll"});
    EXPECT_EQ(film.notes({"--simplify", "12", "-o", page}).status, 0);
    EXPECT_EQ(film.notes({"--heal", "gaps", "-o", table}).status, 0);

    EXPECT_NE(text.out.find("\nFrame rate  24 fps\n"
                            "Settings    command line  --heal gaps --vfx 'VFX_****_v,_comp' --no-b-roll\n"
                            "            default       --match roll --simplify 0\n"
                            "Length      "),
              std::string::npos)
        << text.out;
    EXPECT_EQ(json::parse(contentOf(page)).at("settings"), json::parse(R"({
        "match": {"value": "roll", "from": "default"},
        "heal": {"value": "normal", "from": "default"},
        "vfx": {"value": [], "from": "default"},
        "b-roll": {"value": true, "from": "default"},
        "simplify": {"value": 12, "from": "command line"}})"));
    EXPECT_EQ(contentOf(table).find("heal"), std::string::npos);
}

TEST(Notes, ManySettingsMakeNoLineWiderThan80Columns)
{
    const Cuts film(oldCut(), newCut());

    const Outcome outcome = film.notes({"--match", "clip", "--heal", "inserts", "--vfx", "VFX_****_v,_comp", "--vfx",
                                        "SHOT_****_v,_x", "--no-b-roll", "--simplify", "10000"});

    EXPECT_NE(outcome.out.find("Settings    command line  --match clip --heal inserts --vfx 'VFX_****_v,_comp'\n"
                               "                          --vfx 'SHOT_****_v,_x' --no-b-roll --simplify 10000\n"),
              std::string::npos)
        << outcome.out;
    for (const std::string& line : linesOf(outcome.out))
        EXPECT_LE(columnsOf(line), 80) << line;
}

TEST(Notes, FeetCountTheLastFrameIn)
{
    const Cuts film(oldCut(), newCut());

    const Outcome outcome = film.notes({"--feet"});

    // 10 s are 240 frames, 15 feet; 48 frames are 3 feet, and the last of them is frame 287, 17 feet and 15 frames.
    EXPECT_NE(outcome.out.find("      delete 15+00 through 17+15\n"), std::string::npos) << outcome.out;
    // 18 s are 432 frames, 27 feet; 4 s are 96 frames, 6 feet.
    EXPECT_NE(outcome.out.find("      insert 27+00 through 32+15\n"), std::string::npos) << outcome.out;
}

TEST(Notes, TheCsvHasARowAStepAndFixedColumns)
{
    const Cuts film(oldCut(), newCut());

    EXPECT_EQ(film.file(".csv"),
              "\xEF\xBB\xBFstep,reel,action,at,from,delete,insert,move,delete_frames,insert_frames,move_frames,"
              "length_change_frames,offset_frames,kinds,roll,clip,old_in,new_in,changes,at_feet,from_feet,"
              "at_reel,from_reel,rate,source_in\r\n"
              "1,1,replace,01:00:10:00,,00:00:02:00,,,48,0,0,-48,-48,head-trimmed,A002,TWO,01:00:10:00,,"
              "TWO: head -48 frames,15+00,,1,,24 fps,\r\n"
              "2,1,replace,01:00:18:00,,,00:00:04:00,,0,96,0,96,48,inserted,B009,NEW,,01:00:18:00,"
              "\"NEW: inserted 00:00:04:00, roll B009, source 05:00:00:00\",27+00,,1,,24 fps,05:00:00:00\r\n");
}

TEST(Notes, ACsvTextIsNoFormulaAndKeepsItsQuotes)
{
    const Cuts film(cut("001", "A001", "10:00:00:12 10:00:10:00", "01:00:00:00 01:00:09:12"),
                    cut("001", "A001", "10:00:00:12 10:00:10:00", "01:00:00:00 01:00:09:12") +
                        cut("002", "B002", "10:00:00:00 10:00:01:00", "01:00:09:12 01:00:10:12") +
                        clipName("=1+\"A\""));

    const std::string csv = film.file(".csv");

    EXPECT_NE(csv.find(",B002,\"'=1+\"\"A\"\"\","), std::string::npos) << csv;
}

TEST(Notes, TheFiguresOfTheExampleAreThoseOfItsListOfChanges)
{
    const json notes = reel3Json();
    const json& totals = notes.at("totals");

    // 00:15:30:21 and 00:15:07:20 at 24 frames a second, as the page of the example says.
    EXPECT_EQ(totals.at("framesBefore"), (15 * 60 + 30) * 24 + 21);
    EXPECT_EQ(totals.at("framesAfter"), (15 * 60 + 7) * 24 + 20);
    EXPECT_EQ(totals.at("reels"), 1);
    // The second wide of the weir, 3:12.
    EXPECT_EQ(totals.at("doubledFrames"), 3 * 24 + 12);
    EXPECT_EQ(totals.at("framesBefore"), totals.at("keptFrames").get<int>() + totals.at("liftedFrames").get<int>());
    EXPECT_EQ(totals.at("framesAfter"), totals.at("keptFrames").get<int>() + totals.at("doubledFrames").get<int>() +
                                            totals.at("insertedFrames").get<int>());

    int moves = 0;
    std::vector<std::string> versions;
    int change = 0;
    for (const json& row : notes.at("reels")[0].at("rows")) {
        if (row.at("row") != "step")
            continue;
        change += row.at("lengthChangeFrames").get<int>();
        moves += row.at("action") == "move" ? 1 : 0;
        if (row.at("action") == "relabel")
            versions.push_back(row.at("changes")[0].at("newShot").at("roll"));
    }
    EXPECT_EQ(change, -(23 * 24 + 1)); // -23:01
    EXPECT_EQ(moves, 2);               // scene 46, and the men on the barge deck
    EXPECT_EQ(versions, (std::vector<std::string>{"VFX_0310_v012_comp", "VFX_0320_v009_comp", "VFX_0330_v006_comp",
                                                  "VFX_0340_v011_comp", "VFX_0410_v010_comp", "VFX_0420_v008_comp",
                                                  "VFX_0440_v005_comp", "VFX_0450_v013_comp"}));
}

TEST(Notes, ThePictureThatIsKeptIsWhatTheChangeEdlCovers)
{
    const TempFolder folder;
    const std::string path = folder / "change.json";
    std::vector<std::string> arguments = reel3({"--json", path});
    arguments[0] = "generate";
    ASSERT_EQ(runCadrel(arguments).status, 0);
    const json change = json::parse(contentOf(path));
    const json totals = reel3Json().at("totals");

    // The change EDL knows no freeze frames: the photograph of 72 frames is kept in the notes alone.
    EXPECT_EQ(totals.at("keptFrames").get<int>() + totals.at("doubledFrames").get<int>(),
              change.at("coveredFrames").get<int>() + 72);
}

TEST(Notes, ThePageLoadsNothingAndHasALineForEachStep)
{
    const TempFolder folder;
    const std::string path = folder / "notes.HTML";
    ASSERT_EQ(runCadrel(reel3({"-o", path})).status, 0);
    const std::string page = contentOf(path);

    EXPECT_NE(page.find("default-src 'none'"), std::string::npos);
    for (const char* const loading : {"http://", "https://", "src=", "@import", "url(", "<link"})
        EXPECT_EQ(page.find(loading), std::string::npos) << loading;
    const auto steps = reel3Json().at("totals").at("steps").get<int>();
    for (int step = 1; step <= steps; ++step)
        EXPECT_NE(page.find("<tr id=\"s" + std::to_string(step) + "\""), std::string::npos) << step;
    EXPECT_EQ(page.find("<tr id=\"s" + std::to_string(steps + 1) + "\""), std::string::npos);
}

/// How often a text stands in another.
int countOf(const std::string& part, const std::string& text)
{
    int count = 0;
    for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1))
        ++count;
    return count;
}

TEST(Notes, ThePdfHasThePaperThatIsAskedFor)
{
    const TempFolder folder;
    ASSERT_EQ(runCadrel(reel3({"-o", folder / "a4.pdf"})).status, 0);
    ASSERT_EQ(runCadrel(reel3({"--paper", "letter", "-o", folder / "letter.pdf"})).status, 0);

    const std::string a4 = contentOf(folder / "a4.pdf");
    const std::string letter = contentOf(folder / "letter.pdf");

    EXPECT_TRUE(a4.starts_with("%PDF-"));
    EXPECT_GT(countOf("/MediaBox [ 0 0 595.28", a4), 1);
    EXPECT_GT(countOf("/MediaBox [ 0 0 612 792 ]", letter), 1);
}

/// The film after a re-edit that has put a shot of that name at its end.
Cuts withLastShot(const std::string& name)
{
    return {oldCut(),
            oldCut() + cut("004", "B009", "05:00:00:00 05:00:04:00", "01:00:30:00 01:00:34:00") + clipName(name)};
}

TEST(Notes, ANameThatIsNoUtf8CantBreakThePdf)
{
    const Cuts film = withLastShot("\xFF\xFE (x) \\");

    EXPECT_TRUE(film.file(".pdf").starts_with("%PDF-"));
    const std::string text = textOfPdf(film.folder / "notes.pdf");
    EXPECT_NE(text.find("\xC3\xBF\xC3\xBE (x) \\"), std::string::npos) << text;
}

TEST(Notes, ANameCantBreakThePage)
{
    const Cuts film = withLastShot("<script>\"&");

    const std::string page = film.file(".html");

    EXPECT_NE(page.find("&lt;script&gt;&quot;&amp;"), std::string::npos);
    EXPECT_EQ(page.find("<script>\"&"), std::string::npos);
}

TEST(Notes, BytesOfANameThatAreNoLettersAreReplacedInTheCsv)
{
    const Cuts film = withLastShot("\x1B[2J\xFF");

    const std::string csv = film.file(".csv");

    EXPECT_NE(csv.find(",B009,?[2J\xC3\xBF,"), std::string::npos) << csv;
    EXPECT_EQ(csv.find('\x1B'), std::string::npos);
}

TEST(Notes, APartOfAShotTellsTheSourceOfThePart)
{
    // A stands once in the old cut; in the new one it stands once more, and goes on for 100 frames, or 4:04.
    const std::string shot = cut("001", "A001", "00:00:41:16 00:00:51:16", "01:00:00:00 01:00:10:00");
    const Cuts film(shot, shot + cut("002", "A001", "00:00:41:16 00:00:55:20", "01:00:10:00 01:00:24:04"));

    const std::string text = film.notes().out;
    const json notes = json::parse(film.file(".json"));

    EXPECT_NE(text.find("roll A001, source 00:00:51:16\n"), std::string::npos) << text;
    EXPECT_EQ(text.find("source 00:00:41:16"), std::string::npos) << text;
    std::vector<std::string> sources;
    for (const json& row : notes.at("reels")[0].at("rows")) {
        if (row.at("row") != "step")
            continue;
        for (const json& change : row.at("changes")) {
            if (change.contains("sourceIn"))
                sources.push_back(change.at("sourceIn"));
        }
    }
    EXPECT_EQ(sources, std::vector<std::string>{"00:00:51:16"});
}

TEST(Notes, AReplacedShotTellsItsRollAndItsSource)
{
    const Cuts film(oldCut(), std::regex_replace(oldCut(), std::regex("A002  V  C  11:00:00:12 11:00:10:12"),
                                                 "B002  V  C  05:00:00:00 05:00:10:00"));

    const std::string text = film.notes().out;

    EXPECT_NE(text.find("      replaced 00:00:10:00               TWO\n"
                        "        roll B002, source 05:00:00:00, was TWO at 01:00:10:00\n"),
              std::string::npos)
        << text;
}

TEST(Notes, ARetimedShotTellsItsLengthsItsRollAndItsSource)
{
    const Cuts film(oldCut(),
                    std::regex_replace(oldCut(), std::regex("11:00:00:12 11:00:10:12"), "11:00:00:12 11:00:05:12"));

    const std::string text = film.notes().out;

    EXPECT_NE(text.find("      speed 100 now 50 %                 TWO\n"
                        "        was 00:00:10:00 long, is 00:00:10:00, roll A002, source 11:00:00:12\n"),
              std::string::npos)
        << text;
}

TEST(Notes, ARetimedShotOfANewVersionNamesBothVersions)
{
    const auto shot = [](const char* version, const char* source) {
        const std::string name = "VFX_0310_" + std::string(version) + "_comp";
        return std::regex_replace(oldCut(), std::regex("A002  V  C  11:00:00:12 11:00:10:12"),
                                  name + "  V  C  " + source);
    };
    const std::string from = shot("v012", "11:00:00:12 11:00:10:12");
    const std::string to = shot("v013", "11:00:00:12 11:00:05:12");
    const auto expectLines = [](const Outcome& notes, const std::string& lines) {
        EXPECT_NE(notes.out.find(lines), std::string::npos) << notes.out << notes.err;
    };

    expectLines(Cuts(from, to).notes({"--vfx", "VFX_****_v,_comp"}),
                "      speed 100 now 50 %                 VFX_0310_v013_comp\n"
                "        was VFX_0310_v012_comp, 00:00:10:00 long, is 00:00:10:00, roll\n"
                "        VFX_0310_v013_comp, source 11:00:00:12\n");
    expectLines(Cuts(from, shot("v012", "11:00:00:12 11:00:05:12")).notes({"--vfx", "VFX_****_v,_comp"}),
                "      speed 100 now 50 %                 TWO\n"
                "        was 00:00:10:00 long, is 00:00:10:00, roll VFX_0310_v012_comp, source\n"
                "        11:00:00:12\n");
}

TEST(Notes, NamesTheFirstFiveOfManyEventsThatAreDoubted)
{
    std::string sound;
    for (int event = 4; event < 11; ++event)
        sound += "010  S001  A  C  10:00:00:00 10:00:01:00 01:00:00:00 01:00:01:00\n";
    const Cuts film(oldCut() + sound, oldCut());

    const Outcome outcome = film.notes();

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(countOf("old.edl, event 10 (S001): no picture", outcome.out), 5) << outcome.out;
    EXPECT_NE(outcome.out.find("Old cut, 2 further events: no picture"), std::string::npos) << outcome.out;
}

/// The lines of the last block, as the JSON has them.
std::vector<std::string> remarksIn(const json& notes)
{
    const json& healed = notes.at("healed");
    std::vector<std::string> lines{
        "For the change EDL that cadrel makes of these cuts: " + std::to_string(healed.at("events").get<int>()) +
        " event healed from " + std::to_string(healed.at("members").get<int>()) + "; the steps above are not healed"};
    for (const char* const side : {"old", "new"}) {
        std::map<std::string, int> counts;
        for (const json& doubt : notes.at(side).at("doubts")) {
            if (++counts[doubt.at("doubt")] <= 5)
                lines.push_back(doubt.at("edlFile").get<std::string>() + ", event " +
                                std::to_string(doubt.at("event").get<int>()) + " (");
        }
        int unread = 0;
        for (const json& line : notes.at(side).at("unread")) {
            if (++unread <= 5)
                lines.push_back(line.at("file").get<std::string>() + ", line " +
                                std::to_string(line.at("line").get<int>()) + " " +
                                line.at("problem").get<std::string>() + ": \"");
        }
        if (unread > 5)
            lines.push_back(std::string(side == std::string("old") ? "Old" : "New") + " cut, " +
                            std::to_string(unread - 5) + " further line");
    }
    return lines;
}

TEST(Notes, WhatIsHealedDoubtedAndNotReadStandsInEveryForm)
{
    std::string broken;
    for (int line = 0; line < 7; ++line)
        broken += "02" + std::to_string(line) + "  A004  V  C  12:00:00:00 12:00:01:00 01:00:30:00\n";
    const std::string reversed = cut("009", "A009", "10:00:05:00 10:00:04:00", "01:00:40:00 01:00:41:00");
    const std::string sound = "010  S001  A  C  10:00:00:00 10:00:01:00 01:00:00:00 01:00:01:00\n";
    const Cuts film(oldCut() + broken + cut("008", "AX", "10:00:00:00 10:00:01:00", "01:00:30:00 01:00:31:00"),
                    newCut() + "021  A004  V  C  12:00:00:00 12:00:01:00 01:00:30:00\n" +
                        cut("008", "AX", "10:00:00:00 10:00:01:00", "01:00:32:00 01:00:33:00") + reversed + sound);

    const json notes = json::parse(film.file(".json"));
    const std::string pdf = film.folder / "notes.pdf";
    film.file(".pdf");
    const std::string text = film.notes().out;
    const std::string html = withQuotes(film.file(".html"));

    ASSERT_EQ(notes.at("old").at("unread").size(), 7U);
    // The head of the old cut has two lines, and each of its three shots has two.
    EXPECT_EQ(notes.at("old").at("unread")[0],
              (json{{"file", "old.edl"},
                    {"line", 8},
                    {"problem", "misses a field and isn't read"},
                    {"text", "020  A004  V  C  12:00:00:00 12:00:01:00 01:00:30:00"}}));
    ASSERT_EQ(notes.at("new").at("unread").size(), 1U);
    EXPECT_EQ(notes.at("old").at("doubts").size(), 1U);
    EXPECT_EQ(notes.at("new").at("doubts").size(), 3U);
    // THREE and the shot after it.
    EXPECT_EQ(notes.at("healed"), (json{{"events", 1}, {"members", 2}, {"bridgedGaps", 0}}));
    const std::vector<std::string> remarks = remarksIn(notes);
    // Healing, a doubt and six lines of the old cut, three doubts and a line of the new one.
    EXPECT_EQ(remarks.size(), 12U);
    for (const std::string& form : {text, html, textOfPdf(pdf)}) {
        for (const std::string& remark : remarks)
            EXPECT_NE(unbroken(form).find(remark), std::string::npos) << remark << "\n" << form;
    }
    for (const std::string& line : linesOf(text))
        EXPECT_LE(columnsOf(line), 80) << line;
}

TEST(Notes, TwoFilesOnOneTimecodeAreARemarkInEveryForm)
{
    const TempFolder folder;
    const std::string first = folder.write("r1.edl", oldCut());
    const std::string beside =
        folder.write("r2.edl", cut("001", "B001", "10:00:00:00 10:00:10:12", "01:00:30:00 01:00:40:12"));
    // A frame on top of the last shot.
    const std::string onTop =
        folder.write("r3.edl", cut("001", "C001", "10:00:00:00 10:00:10:12", "01:00:29:23 01:00:30:00"));
    const auto notes = [&](const std::string& form, const std::vector<std::string>& more) {
        const std::string file = folder / ("notes" + form);
        std::vector<std::string> arguments{"notes",       "--new",  first,    "-o",    file,
                                           "--overwrite", "--rate", "24 fps", "--old", first};
        arguments.insert(arguments.end(), more.begin(), more.end());
        EXPECT_EQ(runCadrel(arguments).status, 0);
        return form == ".pdf" ? textOfPdf(file) : contentOf(file);
    };
    const std::string remark = "r3.edl lies on the same timecode as another file of its cut";

    for (const char* const form : {".txt", ".html", ".pdf"}) {
        EXPECT_NE(unbroken(notes(form, {beside, onTop})).find(remark), std::string::npos) << form;
        EXPECT_EQ(unbroken(notes(form, {beside})).find("lies on the same timecode"), std::string::npos) << form;
    }
    const json cuts = json::parse(notes(".json", {beside, onTop}));
    EXPECT_EQ(cuts.at("old").at("overlappingFiles"), json({"r3.edl"}));
    EXPECT_EQ(cuts.at("new").at("overlappingFiles"), json::array());
}

TEST(Notes, APlaceAfterMidnightBeginsTheDayAnew)
{
    // 20 s of new picture come first, so that the last shot is at 00:00:10:00 when it is to be moved.
    const Cuts film(cut("001", "A001", "10:00:00:12 10:00:30:12", "23:59:10:00 23:59:40:00") +
                        cut("002", "A002", "10:00:00:00 10:00:10:00", "23:59:40:00 23:59:50:00") +
                        cut("003", "A003", "10:00:00:00 10:00:05:00", "23:59:50:00 23:59:55:00"),
                    cut("001", "N001", "10:00:00:00 10:00:20:00", "23:59:10:00 23:59:30:00") +
                        cut("002", "A003", "10:00:00:00 10:00:05:00", "23:59:30:00 23:59:35:00") +
                        cut("003", "A001", "10:00:00:12 10:00:20:12", "23:59:35:00 23:59:55:00"));

    const Outcome outcome = film.notes();

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_NE(outcome.out.find("move 00:00:05:00 from 00:00:10:00"), std::string::npos) << outcome.out;
}

/// Two reels, of which the second begins with A002 in the new cut, and the first ends with it in the old one.
struct TwoReels : Cuts {
    TwoReels()
        : Cuts(one() + cut("002", "A002", "10:00:00:00 10:00:10:00", "01:00:20:00 01:00:30:00") +
                   cut("003", "A003", "10:00:00:00 10:00:30:00", "02:00:00:00 02:00:30:00"),
               one() + cut("002", "A002", "10:00:00:00 10:00:10:00", "02:00:00:00 02:00:10:00") +
                   cut("003", "A003", "10:00:00:00 10:00:30:00", "02:00:10:00 02:00:40:00"))
    {
    }

    static std::string one() { return cut("001", "A001", "10:00:00:12 10:00:20:12", "01:00:00:00 01:00:20:00"); }
};

/// The last five seconds of a reel of fifteen come to its start.
struct ChangedPlaces : Cuts {
    ChangedPlaces()
        : Cuts(cut("001", "A001", "10:00:00:12 10:00:10:12", "01:00:00:00 01:00:10:00") +
                   cut("002", "A002", "10:00:00:00 10:00:05:00", "01:00:10:00 01:00:15:00"),
               cut("001", "A002", "10:00:00:00 10:00:05:00", "01:00:00:00 01:00:05:00") +
                   cut("002", "A001", "10:00:00:12 10:00:10:12", "01:00:05:00 01:00:15:00"))
    {
    }
};

TEST(Notes, WhatIsKeptTellsHowMuchLaterItStandsNow)
{
    const ChangedPlaces film;

    const std::string text = film.notes({"--rate", "24 fps"}).out;
    EXPECT_NE(text.find("      01:00:00:00  kept 00:00:05:00, was 01:00:10:00                -00:00:10:00\n"
                        "      01:00:05:00  kept 00:00:10:00, was 01:00:00:00                +00:00:05:00\n"),
              std::string::npos)
        << text;
    film.file(".pdf", {"--rate", "24 fps"});
    EXPECT_NE(unbroken(textOfPdf(film.folder / "notes.pdf"))
                  .find("01:00:00:00 kept 00:00:05:00, was 01:00:10:00 -00:00:10:00 "
                        "01:00:05:00 kept 00:00:10:00, was 01:00:00:00 +00:00:05:00"),
              std::string::npos);
    const std::string page = film.file(".html", {"--rate", "24 fps"});
    EXPECT_TRUE(std::regex_search(
        page, std::regex("kept 00:00:05:00, was 01:00:10:00</td>.*<td class=\"tc num\">-00:00:10:00</td></tr>")))
        << page;
    EXPECT_TRUE(std::regex_search(
        page, std::regex("kept 00:00:10:00, was 01:00:00:00</td>.*<td class=\"tc num\">\\+00:00:05:00</td></tr>")))
        << page;
}

TEST(Notes, WhatIsKeptFromAnotherReelHasNoOffset)
{
    const TwoReels film;

    const std::string page = film.file(".html");

    EXPECT_TRUE(
        std::regex_search(page, std::regex("kept 00:00:10:00, was 01:00:20:00</td>.*<td class=\"tc num\"></td></tr>")))
        << page;
}

TEST(Notes, ThePlaceThatAMoveGoesToIsCountedWithoutIt)
{
    // Eleven shots of 100 frames: the third goes between the eighth and the ninth, so that seven are before it.
    std::string before;
    std::string after;
    int place = 0;
    const auto shot = [](int number, int position) {
        const auto timecode = [](int hour, int frames) {
            std::array<char, 50> text{};
            std::snprintf(text.data(), text.size(), "%02d:%02d:%02d:%02d", hour, frames / 1440 % 60, frames / 24 % 60,
                          frames % 24);
            return std::string(text.data());
        };
        return cut("001", std::string("A").append(std::to_string(number)),
                   timecode(10, 2000 * number) + " " + timecode(10, 2000 * number + 100),
                   timecode(1, position * 100) + " " + timecode(1, position * 100 + 100));
    };
    for (const int number : {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11})
        before += shot(number, number - 1);
    for (const int number : {1, 2, 4, 5, 6, 7, 8, 3, 9, 10, 11})
        after += shot(number, place++);
    const Cuts film(before, after);

    const std::string text = film.notes({"--rate", "24 fps"}).out;

    // 700 frames are 29 seconds and 4 frames.
    EXPECT_NE(text.find("   1  01:00:08:08  move 00:00:04:04 to 01:00:29:04"), std::string::npos) << text;
    EXPECT_NE(unbroken(text).find("What is moved is taken out first; the place after \"to\" is counted without it."),
              std::string::npos)
        << text;
}

TEST(Notes, OfSeveralReelsTheHeadTellsThatEachKeepsItsStart)
{
    const std::string sentence =
        "What is put into a reel or taken out of it leaves the starts of the others where they are.";
    const TwoReels two;
    const Cuts one(oldCut(), newCut());

    two.file(".pdf");
    for (const std::string& form : {two.notes().out, two.file(".html"), textOfPdf(two.folder / "notes.pdf")})
        EXPECT_NE(unbroken(form).find(sentence), std::string::npos) << form;
    for (const std::string& form : {one.notes().out, one.file(".html")})
        EXPECT_EQ(unbroken(form).find(sentence), std::string::npos) << form;
}

/// A shot that comes out of the one before by a dissolve, in one line.
std::string dissolve(const std::string& number, const std::string& roll, const std::string& frames,
                     const std::string& source, const std::string& record)
{
    return number + "  " + roll + " V     D    " + frames + " " + source + " " + record +
           "\n* FROM CLIP NAME: " + roll + "\n* TO CLIP NAME: " + roll + "\n";
}

TEST(Notes, AReelThatBeginsElsewhereIsMovedThereByItsFirstStep)
{
    const Cuts film("FCM: NON-DROP FRAME\n" + cut("001", "A", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00"),
                    "FCM: NON-DROP FRAME\n" +
                        cut("001", "LEADER", "00:00:00:00 00:00:08:00", "00:59:52:00 01:00:00:00") +
                        cut("002", "A", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00"));
    const std::vector<std::string> rate{"--rate", "24 fps"};

    const std::string text = film.notes(rate).out;
    const std::string csv = film.file(".csv", rate);
    const json notes = json::parse(film.file(".json", rate));

    EXPECT_NE(text.find("   1  01:00:00:00  move the whole reel to 00:59:52:00                00:00:00:00\n"
                        "      00:00:08:00 earlier                the whole reel\n"
                        "   2  00:59:52:00  insert 00:00:08:00                  +00:00:08:00 +00:00:08:00\n"),
              std::string::npos)
        << text;
    EXPECT_NE(text.find("01:00:00:00  kept 00:00:10:00, was 01:00:00:00"), std::string::npos) << text;
    EXPECT_NE(csv.find("\n1,1,move-reel,00:59:52:00,01:00:00:00,,,,0,0,0,0,0,reel-moved,,,01:00:00:00,00:59:52:00,"
                       "the whole reel: 00:00:08:00 earlier,0+00,0+00,1,1,24 fps,\r"),
              std::string::npos)
        << csv;
    const json& step = notes.at("reels")[0].at("rows")[0];
    EXPECT_EQ(step.at("action"), "move-reel");
    EXPECT_EQ(step.at("from").at("timecode"), "01:00:00:00");
    EXPECT_EQ(step.at("at").at("timecode"), "00:59:52:00");
    EXPECT_EQ(step.at("changes"), json::parse(R"([{"kind": "reel-moved", "frames": -192,
        "old": {"in": "01:00:00:00", "frames": 240}, "new": {"in": "00:59:52:00", "frames": 432}}])"));
    const std::string page = film.file(".html", rate);
    EXPECT_NE(page.find("<td class=\"tc\">01:00:00:00</td><td class=\"tc\">move the whole reel to 00:59:52:00</td>"),
              std::string::npos);
}

TEST(Notes, ADissolveThatComesWithItsShotIsTold)
{
    const std::string first = cut("001", "A", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00");
    const Cuts film(first, first + dissolve("002", "BL", "024", "00:00:00:00 00:00:02:00", "01:00:10:00 01:00:12:00"));

    const std::string text = film.notes({"--rate", "24 fps"}).out;

    EXPECT_NE(unbroken(text).find("inserted 00:00:02:00 BL roll BL, source 00:00:00:00, with a dissolve of 24 frames"),
              std::string::npos)
        << text;
}

TEST(Notes, ADissolveThatGoesWithItsShotIsTold)
{
    const std::string first = cut("001", "A", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00");
    const Cuts film(first + dissolve("002", "B", "001", "00:00:00:00 00:00:02:00", "01:00:10:00 01:00:12:00"),
                    first + dissolve("002", "C", "016", "00:00:00:00 00:00:02:00", "01:00:10:00 01:00:12:00"));
    const Cuts lift(first + dissolve("002", "B", "001", "00:00:00:00 00:00:02:00", "01:00:10:00 01:00:12:00"), first);

    const std::string text = unbroken(film.notes({"--rate", "24 fps"}).out);
    const std::string lifted = unbroken(lift.notes({"--rate", "24 fps"}).out);

    EXPECT_NE(text.find("replaced 00:00:02:00 C roll C, source 00:00:00:00, with a dissolve of 16 frames, was B at "
                        "01:00:10:00, with a dissolve of 1 frame"),
              std::string::npos)
        << text;
    EXPECT_NE(lifted.find("lifted 00:00:02:00 at 01:00:10:00 B with a dissolve of 1 frame"), std::string::npos)
        << lifted;
}

TEST(Notes, AnotherTransitionSaysWhatItWasAndWhatItIs)
{
    const std::string first = cut("001", "A", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00");
    const std::string other = cut("001", "C", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00");
    const std::string second = dissolve("002", "B", "024", "00:00:00:00 00:00:05:00", "01:00:10:00 01:00:15:00");
    std::string wipe = second;
    wipe.replace(wipe.find("D    024"), 8, "W001 024");

    const std::string toWipe = Cuts(first + second, first + wipe).notes({"--rate", "24 fps"}).out;
    const std::string ofOther = Cuts(first + second, other + second).notes({"--rate", "24 fps"}).out;

    EXPECT_NE(toWipe.find("      dissolve of 24 now wipe of 24      B\n"), std::string::npos) << toWipe;
    EXPECT_NE(ofOther.find("      dissolve of 24, other picture      B\n"), std::string::npos) << ofOther;
}

TEST(Notes, AFreezeHasNoSpeed)
{
    const std::string first = cut("001", "A", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00");
    const std::string plain = cut("002", "B", "10:00:05:00 10:00:07:00", "01:00:10:00 01:00:12:00");
    const std::string frozen = cut("002", "B", "10:00:05:00 10:00:05:01", "01:00:10:00 01:00:12:00");
    const std::vector<std::string> rate{"--rate", "24 fps"};

    const std::string inserted = Cuts(first, first + frozen).notes(rate).out;
    const std::string freezes = Cuts(first + plain, first + frozen).notes(rate).out;
    const std::string runs = Cuts(first + frozen, first + plain).notes(rate).out;

    EXPECT_NE(inserted.find("roll B, source 10:00:05:00, freeze\n"), std::string::npos) << inserted;
    EXPECT_NE(freezes.find("      speed 100 % now freeze             B\n"), std::string::npos) << freezes;
    EXPECT_NE(runs.find("      freeze now speed 100 %             B\n"), std::string::npos) << runs;
}

TEST(Notes, DoubledPictureNamesItsShotsAndItsFormerVersion)
{
    const std::string shots = cut("001", "A", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00") +
                              cut("002", "VFX_0001_v001_comp", "10:00:00:00 10:00:04:00", "01:00:10:00 01:00:14:00") +
                              cut("003", "C", "10:00:00:00 10:00:03:00", "01:00:14:00 01:00:17:00");
    const std::string more = cut("004", "C", "10:00:00:00 10:00:03:00", "01:00:20:00 01:00:23:00") +
                             cut("005", "A", "10:00:00:00 10:00:10:00", "01:00:23:00 01:00:33:00");
    const std::string version = cut("004", "VFX_0001_v002_comp", "10:00:00:00 10:00:04:00", "01:00:17:00 01:00:21:00");
    const std::vector<std::string> rate{"--rate", "24 fps", "--vfx", "VFX_****_v,_comp"};

    const std::string newVersion = unbroken(Cuts(shots, shots + version).notes(rate).out);
    const std::string oldVersion = unbroken(Cuts(shots, shots + more).notes(rate).out);
    const std::string both =
        unbroken(Cuts(shots, shots + cut("004", "A", "10:00:00:00 10:00:10:00", "01:00:17:00 01:00:27:00") +
                                 cut("005", "VFX_0001_v001_comp", "10:00:00:00 10:00:04:00", "01:00:27:00 01:00:31:00"))
                     .notes(rate)
                     .out);

    EXPECT_NE(newVersion.find("once more 00:00:04:00 VFX_0001_v002_comp stood once in the old cut at 01:00:10:00, as "
                              "VFX_0001_v001_comp"),
              std::string::npos)
        << newVersion;
    EXPECT_EQ(oldVersion.find(", as "), std::string::npos) << oldVersion;
    EXPECT_NE(both.find("once more 00:00:14:00 A and 1 more"), std::string::npos) << both;
    EXPECT_NE(both.find("insert 00:00:14:00 A and 1 more"), std::string::npos) << both;
}

TEST(Notes, TheHeadSaysWhatTheOffsetsAndTheFeetAre)
{
    const Cuts film(oldCut(), newCut());
    const std::string offsets =
        "The offset of a step is what the reel has gained so far; that of kept picture is how much "
        "later it stands now than in the old cut.";
    const std::string feet = "Feet are counted in the programme so far, from the first frame of the reel, and the last "
                             "frame of a stretch is counted in.";

    film.file(".pdf", {"--feet"});
    for (const std::string& form :
         {film.notes({"--feet"}).out, film.file(".html", {"--feet"}), textOfPdf(film.folder / "notes.pdf")}) {
        EXPECT_NE(unbroken(form).find(offsets), std::string::npos) << form;
        EXPECT_NE(unbroken(form).find(feet), std::string::npos) << form;
    }
    EXPECT_EQ(unbroken(film.notes().out).find(feet), std::string::npos);
}

TEST(Notes, NothingIsSaidOfStepsWhereThereAreNone)
{
    const std::string same = cut("001", "A", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00") +
                             cut("002", "A", "10:00:10:00 10:00:12:00", "01:00:10:00 01:00:12:00");

    const std::string text = unbroken(Cuts(same, same).notes({"--rate", "24 fps"}).out);

    EXPECT_NE(text.find("Nothing has changed."), std::string::npos) << text;
    EXPECT_NE(text.find("1 event healed from 2"), std::string::npos) << text;
    EXPECT_EQ(text.find("The steps are carried out"), std::string::npos) << text;
    EXPECT_EQ(text.find("the steps above"), std::string::npos) << text;
}

TEST(Notes, TheTitlesOfTheCutsTellFilesOfOneNameApart)
{
    const TempFolder folder;
    const auto written = [&](const char* version, const char* title, const std::string& cuts) {
        std::filesystem::create_directory(folder / version);
        return folder.write(std::string(version) + "/reel3.edl", std::string("TITLE: ") + title + "\n" + cuts);
    };
    const std::string shot = cut("001", "A", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00");
    const std::string nameless = "002  AX V C 10:00:00:00 10:00:02:00 01:00:10:00 01:00:12:00\n";
    const std::string before = written("v07", "REEL 3 V07", shot + nameless);
    const std::string after = written("v12", "REEL 3 V12", shot);

    const auto notes = [&](std::vector<std::string> more) {
        std::vector<std::string> arguments{"notes", "--old", before, "--new", after, "--rate", "24 fps"};
        arguments.insert(arguments.end(), more.begin(), more.end());
        return runCadrel(arguments).out;
    };
    const std::string text = notes({});
    notes({"-o", folder / "notes.html"});
    notes({"-o", folder / "notes.json"});

    EXPECT_EQ(text.find("Titles      REEL 3 V07 to REEL 3 V12\n"), 0U) << text;
    EXPECT_NE(text.find("Old cut, reel3.edl, event 2 (AX)"), std::string::npos) << text;
    EXPECT_NE(contentOf(folder / "notes.html").find("<title>Change notes: REEL 3 V07 to REEL 3 V12</title>"),
              std::string::npos);
    notes({"-o", folder / "notes.pdf"});
    EXPECT_NE(unbroken(textOfPdf(folder / "notes.pdf")).find("REEL 3 V07 to REEL 3 V12 page 1 of 1"),
              std::string::npos);
    EXPECT_NE(
        contentOf(folder / "notes.html").find("<p class=\"titles\"><bdi>REEL 3 V07</bdi> to <bdi>REEL 3 V12</bdi></p>"),
        std::string::npos);
    EXPECT_EQ(json::parse(contentOf(folder / "notes.json")).at("new").at("titles"), json{"REEL 3 V12"});
}

TEST(Notes, FeetOfAMoveBetweenReelsNameBoth)
{
    const TwoReels two;
    const ChangedPlaces one;

    // 20 s are 480 frames, 30 feet; 10 s more end with frame 719, 44 feet and 15 frames.
    const std::string between = "take out 30+00 through 44+15 of reel 1, put in from 0+00 of reel 2";
    two.file(".pdf", {"--feet"});
    for (const std::string& form :
         {two.notes({"--feet"}).out, two.file(".html", {"--feet"}), textOfPdf(two.folder / "notes.pdf")})
        EXPECT_NE(unbroken(form).find(between), std::string::npos) << form;
    // 10 s are 240 frames, 15 feet; 5 s more end with frame 359, 22 feet and 7 frames.
    const std::string text = one.notes({"--feet", "--rate", "24 fps"}).out;
    EXPECT_NE(text.find("      take out 15+00 through 22+07, put in from 0+00\n"), std::string::npos) << text;
}

TEST(Notes, ALengthThatDoesNotChangeHasOneBlankBeforeIt)
{
    const ChangedPlaces film;

    const std::string text = film.notes({"--rate", "24 fps"}).out;

    EXPECT_NE(text.find("Length      00:00:15:00 before, 00:00:15:00 after, 00:00:00:00\n"), std::string::npos) << text;
    EXPECT_NE(film.file(".html", {"--rate", "24 fps"}).find("<b>00:00:00:00</b><span>change of length</span>"),
              std::string::npos);
}

TEST(Notes, APartThatIsTakenOutOfAShotIsToldAsLifted)
{
    // TWO loses the 3rd to the 7th second, and the shots after it don't change.
    const Cuts film(oldCut(),
                    cut("001", "A001", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00") + clipName("ONE") +
                        cut("002", "A002", "11:00:00:12 11:00:03:12", "01:00:10:00 01:00:13:00") + clipName("TWO") +
                        cut("003", "A002", "11:00:07:12 11:00:10:12", "01:00:13:00 01:00:16:00") + clipName("TWO") +
                        cut("004", "A003", "12:00:00:00 12:00:10:00", "01:00:16:00 01:00:26:00") + clipName("THREE"));

    const std::string text = film.notes({"--rate", "24 fps"}).out;
    EXPECT_NE(text.find("   1  01:00:13:00  delete 00:00:04:00                  -00:00:04:00 -00:00:04:00\n"
                        "      lifted part 00:00:04:00            TWO\n"
                        "        in the old cut at 01:00:13:00\n"),
              std::string::npos)
        << text;
    film.file(".pdf", {"--rate", "24 fps"});
    EXPECT_NE(unbroken(textOfPdf(film.folder / "notes.pdf"))
                  .find("TWO: lifted part 00:00:04:00, in the old cut at 01:00:13:00"),
              std::string::npos);
}

TEST(Notes, GapsThatHealingCoversAreToldOfTheChangeEdl)
{
    const TempFolder folder;
    const std::string file = folder / "notes.json";
    EXPECT_EQ(runCadrel(reel3({"--heal", "inserts", "-o", file})).status, 0);
    const json healed = json::parse(contentOf(file)).at("healed");
    ASSERT_EQ(healed.at("bridgedGaps"), 5);

    const Outcome outcome = runCadrel(reel3({"--heal", "inserts"}));

    EXPECT_NE(unbroken(outcome.out)
                  .find("For the change EDL that cadrel makes of these cuts: " +
                        std::to_string(healed.at("events").get<int>()) + " events healed from " +
                        std::to_string(healed.at("members").get<int>()) +
                        ", 5 gaps covered; the steps above are not healed"),
              std::string::npos)
        << outcome.out;
}

TEST(Notes, PictureThatGoesToALaterReelIsToldWhereItGoes)
{
    const TwoReels film;

    const Outcome outcome = film.notes();

    EXPECT_NE(outcome.out.find("   1  01:00:20:00  move 00:00:10:00 to 02:00:00:00     -00:00:10:00 -00:00:10:00\n"
                               "      moved 00:00:10:00                  A002\n"
                               "        in the old cut at 01:00:20:00\n"),
              std::string::npos)
        << outcome.out;
    // The later reel tells of it without a number.
    EXPECT_NE(outcome.out.find("      02:00:00:00  moved 00:00:10:00 from reel 1, step 1            +00:00:10:00\n"
                               "      A002\n"
                               "      02:00:00:00  kept 00:00:10:00, was 01:00:20:00\n"
                               "      02:00:10:00  kept 00:00:30:00, was 02:00:00:00                +00:00:10:00\n"),
              std::string::npos)
        << outcome.out;
    film.file(".pdf");
    EXPECT_NE(unbroken(textOfPdf(film.folder / "notes.pdf"))
                  .find("02:00:00:00 moved 00:00:10:00 from reel 1, step 1 +00:00:10:00 A002 "
                        "02:00:00:00 kept 00:00:10:00, was 01:00:20:00 02:00:10:00 kept 00:00:30:00"),
              std::string::npos);
    const json told = json::parse(film.file(".json")).at("reels")[1].at("rows")[0];
    EXPECT_EQ(told, json::parse(R"({"row": "moved", "step": 1, "fromReel": 1, "frames": 240, "offsetFrames": 240,
                                    "at": {"reel": 2, "timecode": "02:00:00:00", "frame": 0}})"));
    // The CSV has a row a step.
    const std::string csv = film.file(".csv");
    EXPECT_EQ(std::count(csv.begin(), csv.end(), '\n'), 2);
}

TEST(Notes, ACutHasNothingToTellOfItself)
{
    const Cuts film(oldCut(), oldCut());

    const Outcome outcome = film.notes();

    EXPECT_EQ(outcome.status, 0);
    EXPECT_NE(outcome.out.find("\nNothing has changed.\n"), std::string::npos) << outcome.out;
}

TEST(Notes, EqualTitlesDoNotTellTheCutsApart)
{
    const Cuts film("TITLE: REEL 3\n" + oldCut(), "TITLE: REEL 3\n" + newCut());

    EXPECT_NE(film.file(".html").find("<title>Change notes: old.edl to new.edl</title>"), std::string::npos);
    film.file(".pdf");
    EXPECT_NE(unbroken(textOfPdf(film.folder / "notes.pdf")).find(" old.edl to new.edl page 1 of "), std::string::npos);
}

TEST(Notes, WhereNothingHasChangedALineThatWasPassedOverInOneCutAloneIsPointedTo)
{
    const std::string shot = cut("002", "A", "10:00:00:00 10:00:10:00", "00:00:00:00 00:00:10:00");
    // It ends at midnight, where the day begins anew.
    const std::string leader = cut("001", "LEADER", "00:00:00:00 00:00:08:00", "23:59:52:00 00:00:00:00");
    const Cuts withLeader(shot, leader + shot);
    const Cuts same(leader + shot, leader + shot);
    const std::vector<std::string> rate{"--rate", "24 fps"};
    const std::string hint = "Nothing has changed in the picture that could be read; see below.";

    const std::string text = withLeader.notes(rate).out;
    EXPECT_NE(text.find("\n" + hint + "\n"), std::string::npos) << text;
    EXPECT_NE(text.find("passed over", text.find(hint)), std::string::npos) << text;
    EXPECT_NE(withLeader.file(".html", rate).find("<p>" + hint + "</p>"), std::string::npos);
    withLeader.file(".pdf", rate);
    EXPECT_NE(unbroken(textOfPdf(withLeader.folder / "notes.pdf")).find(hint), std::string::npos);
    EXPECT_NE(same.notes(rate).out.find("\nNothing has changed.\n"), std::string::npos);
    EXPECT_NE(Cuts(shot, shot + "001  AX V C 10:00:00:00\n").notes(rate).out.find("\n" + hint + "\n"),
              std::string::npos);
}

/// Reels of one shot of so many minutes, at these minutes.
std::string reelsAt(const std::vector<std::pair<int, int>>& reels)
{
    const auto time = [](int minutes) {
        const std::string text = std::to_string(100 + minutes % 60);
        return std::string("0")
            .append(std::to_string(minutes / 60))
            .append(":")
            .append(text.substr(1))
            .append(":00:00");
    };
    std::string film;
    for (std::size_t reel = 0; reel < reels.size(); ++reel) {
        const auto [start, length] = reels[reel];
        film +=
            cut(std::string("00").append(std::to_string(reel + 1)), std::string("R").append(std::to_string(reel + 1)),
                time(0) + " " + time(length), time(start) + " " + time(start + length));
    }
    return film;
}

TEST(Notes, AReelInTheWayOfAnEarlierOneIsMovedByAStepOfThat)
{
    const Cuts film(reelsAt({{60, 4}, {70, 4}}), reelsAt({{60, 12}, {80, 4}}));
    const std::vector<std::string> rate{"--rate", "24 fps"};

    const std::string text = film.notes(rate).out;
    const json notes = json::parse(film.file(".json", rate));

    EXPECT_NE(unbroken(text).find("Reels are moved as a whole in such an order that none ever lies on another"),
              std::string::npos)
        << text;
    EXPECT_NE(text.find("   1  01:10:00:00  move all of reel 2 to 01:20:00:00                 00:00:00:00\n"
                        "      00:10:00:00 later                  the whole reel\n"),
              std::string::npos)
        << text;
    EXPECT_NE(text.find("\nReel 2, 01:20:00:00, began at 01:10:00:00, moved by step 1\n"
                        "00:04:00:00 before and after\n"),
              std::string::npos)
        << text;
    const json& step = notes.at("reels")[0].at("rows")[0];
    EXPECT_EQ(step.at("from"), json::parse(R"({"reel": 2, "timecode": "01:10:00:00", "frame": 0})"));
    EXPECT_EQ(step.at("at"), json::parse(R"({"reel": 2, "timecode": "01:20:00:00", "frame": 0})"));
    EXPECT_FALSE(step.at("changes")[0].contains("outOfTheWay"));
    EXPECT_NE(film.file(".csv", rate)
                  .find("\n1,1,move-reel,01:20:00:00,01:10:00:00,,,,0,0,0,0,0,reel-moved,,,"
                        "01:10:00:00,01:20:00:00,the whole reel: 00:10:00:00 later,0+00,0+00,2,2,"),
              std::string::npos);
}

TEST(Notes, AReelThatWaitsAtAFreePlaceSaysSo)
{
    const std::string first = cut("001", "A", "00:00:00:00 00:04:00:00", "01:00:00:00 01:04:00:00");
    const std::string second = cut("002", "B", "00:00:00:00 00:04:00:00", "01:10:00:00 01:14:00:00");
    const Cuts film(first + second, cut("001", "B", "00:00:00:00 00:04:00:00", "01:00:00:00 01:04:00:00") +
                                        cut("002", "A", "00:00:00:00 00:04:00:00", "01:10:00:00 01:14:00:00"));
    const std::vector<std::string> rate{"--rate", "24 fps"};

    const std::string text = film.notes(rate).out;
    const json notes = json::parse(film.file(".json", rate));

    EXPECT_NE(text.find("   1  01:00:00:00  move all of reel 2 to 01:20:00:00                 00:00:00:00\n"
                        "      00:20:00:00 later                  the whole reel\n"
                        "        out of the way until its own steps\n"),
              std::string::npos)
        << text;
    EXPECT_NE(text.find("   3  01:20:00:00  move all of reel 2 to 01:10:00:00 "), std::string::npos) << text;
    EXPECT_EQ(notes.at("reels")[0].at("rows")[0].at("changes")[0].at("outOfTheWay"), true);
    EXPECT_EQ(text.find("moved by step"), std::string::npos) << text;
    EXPECT_NE(text.find("\nReel 2, 01:10:00:00, began at 01:00:00:00, out of the way since step 1\n"),
              std::string::npos)
        << text;
}

TEST(Notes, AReelThatWaitsUntilItIsGoneSaysSo)
{
    const std::string gone = cut("002", "B", "00:00:00:00 00:04:00:00", "01:10:00:00 01:14:00:00");
    const std::string shot = cut("001", "A", "00:00:00:00 00:04:00:00", "01:00:00:00 01:04:00:00");
    const Cuts film(shot + gone, shot + cut("002", "N", "00:00:00:00 00:08:00:00", "01:04:00:00 01:12:00:00"));
    const std::vector<std::string> rate{"--rate", "24 fps"};

    const std::string text = film.notes(rate).out;

    EXPECT_NE(text.find("   1  01:10:00:00  move all of reel 2 to 01:20:00:00                 00:00:00:00\n"
                        "      00:10:00:00 later                  the whole reel\n"
                        "        out of the way until it is gone\n"),
              std::string::npos)
        << text;
    EXPECT_NE(text.find("\nReel 2, 01:10:00:00, is gone, out of the way since step 1\n"), std::string::npos) << text;
}

TEST(Notes, ANewReelThatFirstStandsAtAFreePlaceSaysSoInEachForm)
{
    const std::string a = cut("001", "A", "00:00:00:00 00:20:00:00", "01:00:00:00 01:20:00:00");
    const Cuts film(a + cut("002", "B", "00:00:00:00 00:20:00:00", "01:20:00:00 01:40:00:00") +
                        cut("003", "C", "00:00:00:00 00:20:00:00", "01:40:00:00 02:00:00:00"),
                    a + cut("002", "B", "00:00:00:00 00:20:00:00", "01:30:00:00 01:50:00:00") +
                        cut("003", "C", "00:00:00:00 00:20:00:00", "02:10:00:00 02:30:00:00"));
    const std::vector<std::string> rate{"--rate", "24 fps"};
    const std::string place = "in the old cut at 01:20:00:00, at a free place until its reel's steps";
    const std::string title = "Reel 2, 01:30:00:00, is new, out of the way since step 1";

    const std::string text = film.notes(rate).out;
    const json notes = json::parse(film.file(".json", rate));
    const std::string page = film.file(".html", rate);
    film.file(".pdf", rate);
    const std::string paper = unbroken(textOfPdf(film.folder / "notes.pdf"));

    EXPECT_NE(text.find("   1  01:20:00:00  move 00:20:00:00 to 02:40:00:00 "), std::string::npos) << text;
    EXPECT_NE(text.find("\n        " + place + "\n"), std::string::npos) << text;
    EXPECT_NE(text.find("\n" + title + "\n"), std::string::npos) << text;
    EXPECT_NE(text.find("   3  02:40:00:00  move all of reel 2 to 01:30:00:00 "), std::string::npos) << text;
    EXPECT_NE(paper.find(place), std::string::npos) << paper;
    EXPECT_NE(paper.find(title), std::string::npos) << paper;
    EXPECT_NE(page.find("at a free place until its reel"), std::string::npos);
    EXPECT_NE(page.find(title), std::string::npos);
    EXPECT_NE(film.file(".csv", rate).find(place), std::string::npos);
    const json& rows = notes.at("reels")[0].at("rows");
    EXPECT_EQ(rows[1].at("changes")[0].at("outOfTheWay"), true) << rows;
    EXPECT_FALSE(rows[2].at("changes")[0].contains("outOfTheWay")) << rows;
}

TEST(Notes, AFilmThatFillsTheDaySaysThatOneReelLiesOnAnother)
{
    const std::string first = cut("001", "A", "00:00:00:00 11:50:00:00", "00:00:00:00 11:50:00:00");
    const std::string second = cut("002", "B", "00:00:00:00 11:50:00:00", "12:00:00:00 23:50:00:00");
    const Cuts film(first + second, cut("001", "B", "00:00:00:00 11:50:00:00", "00:00:00:00 11:50:00:00") +
                                        cut("002", "A", "00:00:00:00 11:50:00:00", "12:00:00:00 23:50:00:00"));

    const std::string text = unbroken(film.notes({"--rate", "24 fps"}).out);

    EXPECT_NE(text.find("one of them lies on another for a moment, since the day has no free place for it."),
              std::string::npos)
        << text;
    EXPECT_EQ(text.find("none ever lies on another"), std::string::npos) << text;
}

TEST(Notes, CutsThatShareNothingAreReplacedAsAWhole)
{
    const Cuts film(oldCut(), cut("001", "Z001", "10:00:00:12 10:00:10:12", "01:00:00:00 01:00:10:00"));

    const Outcome outcome = film.notes();

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_NE(outcome.out.find("   1  01:00:00:00  replace 00:00:30:00 by 00:00:10:00"), std::string::npos)
        << outcome.out;
}

TEST(Notes, DropFrameShowsInASemicolonForPeopleAlone)
{
    const Cuts film(oldCut(), newCut());
    const std::regex withColons(R"(\d\d:\d\d:\d\d:\d\d)");
    const std::regex withSemicolon(R"(\d\d:\d\d:\d\d;\d\d)");
    const std::vector<std::string> dropFrame{"--rate", "29.97 dfps"};

    const std::string text = film.notes(dropFrame).out;

    EXPECT_NE(text.find("01:00:10;00"), std::string::npos) << text;
    EXPECT_FALSE(std::regex_search(text, withColons)) << text;
    EXPECT_TRUE(std::regex_search(film.file(".html", dropFrame), withSemicolon));
    // The columns of the table are for programs, the words in it for people.
    EXPECT_TRUE(std::regex_search(film.file(".csv", dropFrame), withColons));
    const std::string document = film.file(".json", dropFrame);
    EXPECT_TRUE(std::regex_search(document, withColons));
    EXPECT_FALSE(std::regex_search(document, withSemicolon));
    EXPECT_FALSE(std::regex_search(film.notes({"--rate", "30 fps"}).out, withSemicolon));
}

TEST(Notes, AFileThatComesUpDuringTheRunIsNotOverwritten)
{
    const std::string shots = manyShots(20000);
    const TempFolder folder;
    const std::string notes = folder / "notes.txt";
    const std::vector<std::string> words{
        "notes", "--old", folder.write("old.edl", shots), "--new", folder.write("new.edl", shots), "-o", notes};
    const auto disturb = [&] { writeFile(notes, "of another program"); };

    const Outcome outcome = runCadrelDisturbedAt("reading new.edl", words, disturb);

    EXPECT_EQ(outcome.status, 1);
    EXPECT_NE(outcome.out.find(notes + ": another program has written it meanwhile"), std::string::npos) << outcome.out;
    EXPECT_EQ(contentOf(notes), "of another program");
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"new.edl", "notes.txt", "old.edl"}));
    std::vector<std::string> replacing = words;
    replacing.emplace_back("--overwrite");
    EXPECT_EQ(runCadrelDisturbedAt("reading new.edl", replacing, disturb).status, 0);
    EXPECT_NE(contentOf(notes), "of another program");
}

TEST(Notes, RefusesAFormThatItDoesNotKnow)
{
    const Cuts film(oldCut(), newCut());

    const Outcome outcome = film.notes({"-o", film.folder / "notes.doc"});

    EXPECT_EQ(outcome.status, 2);
    EXPECT_NE(outcome.err.find(".html, .pdf, .csv, .txt or .json"), std::string::npos) << outcome.err;
}

} // namespace
