// SPDX-License-Identifier: GPL-3.0-or-later

// Frame rates and drop-frame states that don't fit each other, and the labels of rates.

#include "tests/app/Film.h"
#include "tests/app/ProgramRun.h"
#include "tests/app/SoundProject.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

const std::string Fine = cut("001", "A001", "10:00:00:12 10:00:10:12", "01:00:00:00 01:00:10:00");
const std::string DropFrame = "FCM: DROP FRAME\n";
const std::string NonDrop = "FCM: NON-DROP FRAME\n";

/// A cut for each four of the timecodes, the last of which has the frame.
std::string manyTimecodes(int timecodes, const std::string& lastFrame)
{
    std::string text;
    for (int event = 0; event < timecodes / 4; ++event)
        text +=
            cut("001", "A001", "10:00:00:00 10:00:10:" + (text.empty() ? lastFrame : "12"), "01:00:00:00 01:00:10:12");
    return text;
}

std::string warningsOf(const std::string& text, const std::string& rate)
{
    const TempFolder folder;
    const std::string file = folder.write("film.edl", text);
    const Outcome outcome = runCadrel({"list", file, "--rate", rate, "--summary"});
    EXPECT_EQ(outcome.status, 0);
    const std::string front = "cadrel: " + file + ": warning: ";
    return outcome.err.starts_with(front) ? outcome.err.substr(front.size()) : outcome.err;
}

const std::string Check = "; check the file or give another --rate\n";

TEST(Rates, AListOfAnotherDropFrameStateIsWarnedOf)
{
    EXPECT_EQ(warningsOf(NonDrop + Fine, "29.97 dfps"),
              "is of non-drop timecode, unlike the 29.97 dfps of the project; line 1: \"FCM: NON-DROP FRAME\"" + Check);
    EXPECT_EQ(warningsOf("\n" + DropFrame + Fine, "30 fps"),
              "is of drop-frame timecode, unlike the 30 fps of the project; line 2: \"FCM: DROP FRAME\"" + Check);
    EXPECT_EQ(warningsOf("001 A001 V C 10:00:00:12 10:00:10:12 01:00:00;00 01:00:10;00\n", "29.97 fps"),
              "is of drop-frame timecode, unlike the 29.97 fps of the project; line 1: "
              "\"001 A001 V C 10:00:00:12 10:00:10:12 01:00:00;00 01:00:10;00\"" +
                  Check);
    EXPECT_EQ(warningsOf(Fine, "29.97 dfps"), "");
    EXPECT_EQ(warningsOf(DropFrame + Fine, "29.97 dfps"), "");
    EXPECT_EQ(warningsOf(NonDrop + Fine, "24 fps"), "");
}

TEST(Rates, ANewCutOfAnotherDropFrameStateThanTheOldOneIsWarnedOf)
{
    const TempFolder folder;
    const std::string drop = folder.write("drop.edl", DropFrame + Fine);
    const std::string nonDrop = folder.write("nondrop.edl", NonDrop + Fine);

    for (const char* const command : {"generate", "notes"}) {
        const Outcome outcome = runCadrel({command, "--old", drop, "--new", nonDrop});
        EXPECT_EQ(outcome.status, 0);
        EXPECT_EQ(outcome.err, "cadrel: " + nonDrop +
                                   ": warning: is of non-drop timecode, unlike the 30 dfps of the project; "
                                   "line 1: \"FCM: NON-DROP FRAME\"" +
                                   Check);
        EXPECT_EQ(runCadrel({command, "--old", drop, "--new", nonDrop, "--strict"}).status, 1);
        EXPECT_EQ(runCadrel({command, "--old", drop, "--new", drop}).err, "");
    }
}

TEST(Rates, AListOfALowerRateIsWarnedOfFrom200TimecodesOn)
{
    EXPECT_EQ(warningsOf(manyTimecodes(200, "23"), "25 fps"),
              "shows 24 fps in all of its 200 timecodes, less than the 25 fps of the project" + Check);
    EXPECT_EQ(warningsOf(manyTimecodes(196, "23"), "25 fps"), "");
    EXPECT_EQ(warningsOf(manyTimecodes(200, "24"), "25 fps"), "");
    EXPECT_EQ(warningsOf(manyTimecodes(200, "24"), "29.97 dfps"),
              "shows 25 fps in all of its 200 timecodes, less than the 29.97 dfps of the project" + Check);
    EXPECT_EQ(warningsOf(manyTimecodes(200, "29"), "50 fps"),
              "shows 30 fps in all of its 200 timecodes, less than the 50 fps of the project" + Check);
    EXPECT_EQ(warningsOf(manyTimecodes(200, "30"), "60 fps"),
              "shows 48 fps in all of its 200 timecodes, less than the 60 fps of the project" + Check);
    EXPECT_EQ(warningsOf(manyTimecodes(200, "47"), "50 fps"),
              "shows 48 fps in all of its 200 timecodes, less than the 50 fps of the project" + Check);
    EXPECT_EQ(warningsOf(manyTimecodes(200, "48"), "50 fps"), "");
    EXPECT_EQ(warningsOf(manyTimecodes(200, "49"), "60 fps"),
              "shows 50 fps in all of its 200 timecodes, less than the 60 fps of the project" + Check);
    EXPECT_EQ(warningsOf(manyTimecodes(400, "50"), "60 fps"), "");
    EXPECT_EQ(warningsOf(manyTimecodes(400, "47"), "47.95 fps"), "");
    EXPECT_EQ(warningsOf(manyTimecodes(400, "29"), "29.97 fps"), "");
}

TEST(Rates, AListThatFitsAHighRateIsNotTakenForAHigherOne)
{
    EXPECT_EQ(warningsOf(manyTimecodes(8, "47"), "48 fps"), "");
    EXPECT_EQ(warningsOf(manyTimecodes(8, "49"), "50 fps"), "");
    EXPECT_EQ(warningsOf(manyTimecodes(4, "48"), "48 fps"),
              "shows 60 fps, more than the 48 fps of the project, first in line 1: "
              "\"001  A001  V  C  10:00:00:00 10:00:10:48 01:00:00:00 01:00:10:12\"" +
                  Check);
}

/// Without a rate that is given.
Outcome listed(const TempFolder& folder, const std::string& text, std::vector<std::string> more = {})
{
    more.insert(more.begin(), {"list", folder.write("film.edl", text), "--summary"});
    return runCadrel(more);
}

TEST(Rates, AListThatIsReadAt60FpsButMayBeOf48Or50FpsIsWarnedOf)
{
    const TempFolder folder;
    const std::string front = "cadrel: " + (folder / "film.edl").string() + ": ";
    const std::string remedy = "; give the right one with --rate, such as --rate \"";
    const auto hint = [&](const std::string& frame, const std::string& rates, const std::string& example) {
        return "is read at 60 fps, but has no frame number above " + frame + ", so that it may be of " + rates +
               remedy + example + "\"\n";
    };
    const std::string anyOfThem = "48 fps or 50 fps";

    EXPECT_EQ(listed(folder, manyTimecodes(8, "29")).err, "");
    EXPECT_EQ(listed(folder, manyTimecodes(8, "30")).err, front + "warning: " + hint("30", anyOfThem, "48 fps"));
    EXPECT_EQ(listed(folder, manyTimecodes(196, "47")).err, front + "warning: " + hint("47", anyOfThem, "48 fps"));
    EXPECT_EQ(listed(folder, manyTimecodes(8, "48")).err, front + "warning: " + hint("48", "50 fps", "50 fps"));
    EXPECT_EQ(listed(folder, manyTimecodes(8, "49")).err, front + "warning: " + hint("49", "50 fps", "50 fps"));
    EXPECT_EQ(listed(folder, manyTimecodes(8, "50")).err, "");
    EXPECT_EQ(listed(folder, manyTimecodes(8, "47"), {"--rate", "60"}).err, "");
    EXPECT_EQ(listed(folder, manyTimecodes(8, "47"), {"--rate", "48"}).err, "");
    EXPECT_NE(listed(folder, manyTimecodes(8, "47")).out.find("Frame rate  60 fps\n"), std::string::npos);
    // Many timecodes tell the rate by themselves.
    EXPECT_EQ(listed(folder, manyTimecodes(200, "47")).err,
              front + "warning: shows 48 fps in all of its 200 timecodes, less than the 60 fps of the project" + Check);

    const Outcome strict = listed(folder, manyTimecodes(8, "47"), {"--strict"});
    EXPECT_EQ(strict.status, 1);
    EXPECT_EQ(strict.err, front + hint("47", anyOfThem, "48 fps"));
}

TEST(Rates, EveryCommandThatJudgesARateWarnsOfItOnce)
{
    const TempFolder folder;
    const std::string file = folder.write("film.edl", manyTimecodes(8, "40"));

    for (const char* const command : {"generate", "notes"}) {
        const Outcome outcome = runCadrel({command, "--old", file, "--new", file});
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        EXPECT_EQ(outcome.err,
                  "cadrel: " + file +
                      ": warning: is read at 60 fps, but has no frame number above 40, so that it may be of "
                      "48 fps or 50 fps; give the right one with --rate, such as --rate \"48 fps\"\n");
    }
}

TEST(Rates, APulledDownRateChangesNothingInAChangeEdl)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());
    const std::string newFile = folder.write("new.edl", newCut());
    const auto changeAt = [&](const std::vector<std::string>& rate) {
        std::vector<std::string> words{"generate", "--old", oldFile,          "--new",
                                       newFile,    "-o",    folder / "c.edl", "--overwrite"};
        words.insert(words.end(), rate.begin(), rate.end());
        EXPECT_EQ(runCadrel(words).status, 0);
        return contentOf(folder / "c.edl");
    };

    EXPECT_EQ(changeAt({"--rate", "23.98"}), changeAt({}));
    EXPECT_EQ(changeAt({"--rate", "24.98"}), changeAt({"--rate", "25"}));
    EXPECT_EQ(changeAt({"--rate", "29.97"}), changeAt({"--rate", "30"}));
    EXPECT_EQ(changeAt({"--rate", "29.97 dfps"}), changeAt({"--rate", "30 dfps"}));
    EXPECT_EQ(changeAt({"--rate", "47.95"}), changeAt({"--rate", "48"}));
    EXPECT_EQ(changeAt({"--rate", "59.94"}), changeAt({"--rate", "60"}));
}

TEST(Rates, AChangeEdlOfADropFrameProjectReadsBackAsWhatItIs)
{
    const TempFolder folder;
    const std::string file = folder.write("film.edl", Fine);
    const std::string change = folder / "change.edl";

    ASSERT_EQ(runCadrel({"generate", "--old", file, "--new", file, "--rate", "29.97 dfps", "-o", change}).status, 0);

    EXPECT_EQ(contentOf(change), "TITLE:   change.edl\n"
                                 "FCM: DROP FRAME\n"
                                 "001  A001     V     C        01:00:00:00 01:00:10:00 01:00:00:00 01:00:10:00\n");
    EXPECT_EQ(json::parse(runCadrel({"list", change, "--json", "-"}).out).at("rate"), "30 dfps");
    EXPECT_EQ(runCadrel({"list", change, "--rate", "29.97 dfps"}).err, "");
}

TEST(Rates, EveryLabelCanBeGivenWithAndWithoutItsUnit)
{
    const TempFolder folder;
    const std::string file = folder.write("film.edl", Fine);
    const auto rateOf = [&file](const std::string& rate) {
        return json::parse(runCadrel({"list", file, "--rate", rate, "--json", "-"}).out).at("rate");
    };

    for (const std::string number : {"23.98", "24", "24.98", "25", "29.97", "30", "47.95", "48", "50", "59.94", "60"}) {
        EXPECT_EQ(rateOf(number), number + " fps");
        EXPECT_EQ(rateOf(number + " fps"), number + " fps");
    }
    EXPECT_EQ(rateOf("29.97 dfps"), "29.97 dfps");
    EXPECT_EQ(rateOf("30 dfps"), "30 dfps");
}

struct HighRate {
    const char* label;
    int framesPerSecond;
    bool isPulledDown;
};

class HighRates : public testing::TestWithParam<HighRate> {};

TEST_P(HighRates, AreStoodByEveryCommand)
{
    const auto& [label, framesPerSecond, isPulledDown] = GetParam();
    const TempFolder folder;
    const std::string last = std::to_string(framesPerSecond - 1);
    const std::string oldFile =
        folder.write("old.edl", cut("001", "A001", "10:00:00:00 10:00:10:" + last, "01:00:00:00 01:00:10:" + last));
    const std::string newFile =
        folder.write("new.edl", cut("001", "A001", "10:00:05:00 10:00:10:" + last, "01:00:00:00 01:00:05:" + last));
    std::string project = projectAt(framesPerSecond * (isPulledDown ? 1000.0 / 1001 : 1.0), false, isPulledDown, 0.0);
    const std::string tracks = "\"tracks\": []";
    project.replace(project.find(tracks), tracks.size(),
                    R"("tracks": [{"kind": "audio", "name": "DIA", "events": [
                        {"kind": "clip", "start": 3600, "end": 3620, "clip": 1, "name": "hello"}]}])");
    const std::string pool = "\"pool\": []";
    project.replace(project.find(pool), pool.size(),
                    R"("pool": [{"number": 1, "kind": "audio", "name": "a", "path": "a.wav", "length": 100}])");
    const std::string stage = folder.write("scene.stage", project);
    const std::vector<std::string> rate{"--old", oldFile, "--new", newFile, "--rate", label};
    const auto run = [&rate](std::vector<std::string> words) {
        words.insert(words.end(), rate.begin(), rate.end());
        return runCadrel(words);
    };

    const Outcome generated = run({"generate", "-o", folder / "change.edl"});
    EXPECT_EQ(generated.status, 0) << generated.err;
    EXPECT_EQ(contentOf(folder / "change.edl"),
              "TITLE:   change.edl\n001  A001     V     C        01:00:05:00 01:00:10:" + last +
                  " 01:00:00:00 01:00:05:" + last + "\n");
    EXPECT_EQ(run({"notes"}).status, 0);
    const Outcome applied = run({"apply", stage, "-o", folder / "new.stage", "--force"});
    EXPECT_EQ(applied.status, 0) << applied.err;
    EXPECT_NE(applied.out.find(std::string("Frame rate  ") + label), std::string::npos) << applied.out;
    EXPECT_NE(runCadrel({"show", folder / "new.stage"}).out.find(label), std::string::npos);
}

INSTANTIATE_TEST_SUITE_P(Rates, HighRates,
                         testing::Values(HighRate{"47.95 fps", 48, true}, HighRate{"48 fps", 48, false},
                                         HighRate{"50 fps", 50, false}));

} // namespace
