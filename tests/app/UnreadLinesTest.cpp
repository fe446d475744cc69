// SPDX-License-Identifier: GPL-3.0-or-later

// Lines of EDLs that hold an event which isn't read.

#include "tests/app/Film.h"
#include "tests/app/ProgramRun.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <algorithm>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

const std::string Remedy = "; correct the list, and save it as plain text\n";
const std::string Fine = cut("001", "A001", "10:00:00:12 10:00:10:12", "01:00:00:00 01:00:10:00");
const std::string Short = "002  A002  V  C  10:00:00:00 10:00:01:00 01:00:10:00\n";
const std::string ShortProblem = " misses a field and isn't read: "
                                 "\"002  A002  V  C  10:00:00:00 10:00:01:00 01:00:10:00\"";

std::string repeated(const std::string& line, int count)
{
    std::string text;
    for (int index = 0; index < count; ++index)
        text += line;
    return text;
}

std::size_t linesOf(const std::string& text)
{
    return static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n'));
}

TEST(UnreadLines, AreToldWithFileLineAndText)
{
    const TempFolder folder;
    const std::string file = folder.write("film.edl", Fine + Short);

    const Outcome outcome = runCadrel({"list", file, "--summary"});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.err, "cadrel: " + file + ": warning: line 2" + ShortProblem + Remedy);
    EXPECT_EQ(outcome.out, "Events      1, all valid\n"
                           "            1 cut, 0 dissolves, 0 wipes, 0 retimed\n"
                           "Not read    1 line\n"
                           "Programme   01:00:00:00 - 01:00:10:00, 00:00:10:00 long\n"
                           "Frame rate  24 fps\n");
}

TEST(UnreadLines, StandInTheJson)
{
    const TempFolder folder;
    const std::string a = folder.write("a.edl", Fine + Short);
    const std::string b = folder.write("b.edl", Fine + "\n002  A002  V  D  10:00:00:00 10:00:01:00 1:0:0:0 1:0:1:0\n");

    const json unread = json::parse(runCadrel({"list", a, b, "--json", "-"}).out).at("unread");

    EXPECT_EQ(unread, json::parse(R"([
        {"file": "a.edl", "line": 2, "problem": "misses a field and isn't read",
         "text": "002  A002  V  C  10:00:00:00 10:00:01:00 01:00:10:00"},
        {"file": "b.edl", "line": 3, "problem": "has a dissolve or wipe without a duration and isn't read",
         "text": "002  A002  V  D  10:00:00:00 10:00:01:00 1:0:0:0 1:0:1:0"}])"));
}

TEST(UnreadLines, AreAnErrorWithStrict)
{
    const TempFolder folder;
    const std::string one = folder.write("one.edl", Fine + Short);
    const std::string three = folder.write("three.edl", Fine + repeated(Short, 3));

    for (const char* const command : {"generate", "notes"}) {
        const Outcome outcome = runCadrel({command, "--old", one, "--new", one, "--strict", "-o", folder / "out.txt"});
        EXPECT_EQ(outcome.status, 1) << command;
        EXPECT_EQ(outcome.err, "cadrel: " + one + ": line 2" + ShortProblem + Remedy);
    }
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"one.edl", "three.edl"}));
    EXPECT_EQ(runCadrel({"list", three, "--strict"}).err,
              "cadrel: " + three + ": line 2" + ShortProblem + ", and 2 more lines like that" + Remedy);
}

TEST(UnreadLines, OfManyTheFirstTenAreToldAndTheRestIsCounted)
{
    const TempFolder folder;
    const std::string ten = folder.write("ten.edl", Fine + repeated(Short, 10));
    const std::string eleven = folder.write("eleven.edl", Fine + repeated(Short, 11));
    const std::string many = folder.write("many.edl", Fine + repeated(Short, 100'000));

    EXPECT_EQ(linesOf(runCadrel({"list", ten}).err), 10U);
    const Outcome outcome = runCadrel({"list", eleven});
    EXPECT_EQ(linesOf(outcome.err), 11U);
    EXPECT_TRUE(outcome.err.ends_with("warning: and 1 more line like that; --json lists them all\n")) << outcome.err;
    EXPECT_TRUE(runCadrel({"list", many})
                    .err.ends_with("warning: and 99990 more lines like that; "
                                   "--json lists them all\n"));
}

TEST(UnreadLines, AreNamedWhereNothingElseIsInTheFile)
{
    const TempFolder folder;
    const std::string file = folder.write("film.edl", "TITLE: X\n" + Short);
    std::string wide = "\xFF\xFE";
    for (const char character : Fine)
        wide += {character, '\0'};
    const std::string utf16 = folder.write("utf16.edl", wide);

    for (const std::vector<std::string>& rate : {std::vector<std::string>{}, {"--rate", "24"}}) {
        std::vector<std::string> arguments{"list", file};
        arguments.insert(arguments.end(), rate.begin(), rate.end());
        const Outcome outcome = runCadrel(arguments);
        EXPECT_EQ(outcome.status, 1);
        EXPECT_EQ(outcome.err, "cadrel: " + file + ": holds no event that can be read; line 2" + ShortProblem + Remedy);
    }
    EXPECT_EQ(runCadrel({"list", utf16}).err,
              "cadrel: " + utf16 + ": holds no event that can be read; line 1 is UTF-16 text and isn't read: \"" +
                  Fine.substr(0, Fine.size() - 1) + "\"" + Remedy);
}

TEST(UnreadLines, LinesWithTabsAndAfterAByteOrderMarkAreRead)
{
    const TempFolder folder;
    std::string tabbed = Fine;
    for (std::size_t blanks = tabbed.find("  "); blanks != std::string::npos; blanks = tabbed.find("  "))
        tabbed.erase(blanks, 1);
    std::replace(tabbed.begin(), tabbed.end(), ' ', '\t');
    const std::string file = folder.write("film.edl", "\xEF\xBB\xBF" + tabbed + clipName("ONE"));

    const Outcome outcome = runCadrel({"list", file});

    EXPECT_EQ(outcome.err, "");
    EXPECT_NE(outcome.out.find("ok     001    A001  ONE   film.edl  C"), std::string::npos) << outcome.out;
}

TEST(Reversed, TheTableShowsANegativeSpeed)
{
    const TempFolder folder;
    const std::string file =
        folder.write("film.edl", Fine + "M2   A001       -024.0     10:00:00:12\n" +
                                     cut("002", "A002", "10:00:00:00 10:00:10:00", "01:00:10:00 01:00:20:00"));

    const Outcome outcome = runCadrel({"list", file});

    EXPECT_EQ(outcome.err, "");
    EXPECT_NE(outcome.out.find("01:00:00:00  01:00:10:00  -1.00\n"), std::string::npos) << outcome.out;
    EXPECT_NE(outcome.out.find("2 cuts, 0 dissolves, 0 wipes, 1 retimed, 1 of them reversed\n"), std::string::npos)
        << outcome.out;
    EXPECT_EQ(json::parse(runCadrel({"list", file, "--json", "-"}).out).at("events").at(0).at("speed"), -1.0);
}

TEST(Reversed, AShotMatchesOneThatIsReversedTooAndTheSummaryCountsThem)
{
    const TempFolder folder;
    const std::string motion = "M2   A001       -024.0     10:00:00:12\n";
    const std::string forwards = folder.write("forwards.edl", Fine);
    const std::string backwards = folder.write("backwards.edl", Fine + motion);
    const auto generate = [](const std::string& oldFile, const std::string& newFile) {
        return runCadrel({"generate", "--old", oldFile, "--new", newFile});
    };

    EXPECT_EQ(generate(forwards, backwards).status, 1) << "nothing survives";
    EXPECT_EQ(generate(backwards, forwards).status, 1);
    const Outcome both = generate(backwards, backwards);
    EXPECT_EQ(both.status, 0);
    EXPECT_TRUE(both.out.starts_with("Old cut     backwards.edl: 1 event, all valid, 1 reversed\n")) << both.out;
}

} // namespace
