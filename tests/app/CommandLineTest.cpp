// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/ProgramRun.h"

#include <algorithm>
#include <gtest/gtest.h>

namespace {

using namespace cadrel::tests;

/// Wrong usage is told in one line on standard error and ends with 2.
void expectWrongUsage(const std::vector<std::string>& arguments, const std::string& what)
{
    const Outcome outcome = runCadrel(arguments);

    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(outcome.out, "");
    EXPECT_TRUE(outcome.err.starts_with("cadrel: ")) << outcome.err;
    EXPECT_NE(outcome.err.find(what), std::string::npos) << outcome.err;
    EXPECT_EQ(std::count(outcome.err.begin(), outcome.err.end(), '\n'), 1) << outcome.err;
}

TEST(CommandLine, VersionIsPrinted)
{
    const Outcome outcome = runCadrel({"--version"});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.out, "cadrel 0.1.0\n");
    EXPECT_EQ(outcome.err, "");
}

TEST(CommandLine, HelpOfEachCommandHasAnExample)
{
    for (const std::vector<std::string>& arguments : {std::vector<std::string>{"--help"},
                                                      {"generate", "--help"},
                                                      {"apply", "--help"},
                                                      {"list", "--help"},
                                                      {"show", "--help"},
                                                      {"open", "--help"}}) {
        const Outcome outcome = runCadrel(arguments);

        EXPECT_EQ(outcome.status, 0);
        EXPECT_NE(outcome.out.find("Examples:\n  cadrel "), std::string::npos) << outcome.out;
        EXPECT_EQ(outcome.err, "");
    }
}

TEST(CommandLine, ACommandIsNeeded)
{
    expectWrongUsage({}, "generate, apply, notes, list, show or open");
    expectWrongUsage({"conform"}, "conform");
}

TEST(CommandLine, BothCutsAreNeeded)
{
    expectWrongUsage({"generate", "--old", "old.edl"}, "--new");
    expectWrongUsage({"generate", "--new", "new.edl"}, "--old");
    expectWrongUsage({"list"}, "FILE");
}

TEST(CommandLine, UnknownOptionsAreRefused)
{
    expectWrongUsage({"list", "old.edl", "--loud"}, "--loud");
}

TEST(CommandLine, AMistypedWordIsToldWithTheOneThatIsNear)
{
    const auto expectAdvice = [](const std::vector<std::string>& arguments, const std::string& line) {
        const Outcome outcome = runCadrel(arguments);
        EXPECT_EQ(outcome.status, 2);
        EXPECT_EQ(outcome.err, "cadrel: " + line + "\n");
    };

    expectAdvice({"aply"}, "there is no command aply; did you mean apply?");
    expectAdvice({"lsit", "old.edl"}, "there is no command lsit; did you mean list?");
    expectAdvice({"conform"}, "there is no command conform; see --help");
    expectAdvice({"--hlp"}, "there is no option --hlp; did you mean --help?");
    expectAdvice({"--versoin"}, "there is no option --versoin; did you mean --version?");
    // What is missing, besides, is no reason not to tell.
    expectAdvice({"apply", "--hlp"}, "there is no option --hlp; did you mean --help?");
    expectAdvice({"apply", "a.stage", "--in-plac"}, "there is no option --in-plac; did you mean --in-place?");
    expectAdvice({"generate", "--od=a.edl"}, "there is no option --od; did you mean --old?");
    expectAdvice({"list", "old.edl", "--loud"}, "there is no option --loud; see --help");
    // Three slips are too many.
    expectAdvice({"show", "--trcaks"}, "there is no option --trcaks; did you mean --track?");
    expectAdvice({"show", "--trcakss"}, "there is no option --trcakss; see --help");
}

TEST(CommandLine, WordsOfOptionsAreChecked)
{
    const std::vector<std::string> files{"generate", "--old", "old.edl", "--new", "new.edl"};
    const auto with = [&files](const std::string& option, const std::string& value) {
        std::vector<std::string> arguments = files;
        arguments.insert(arguments.end(), {option, value});
        return arguments;
    };

    expectWrongUsage(with("--rate", "23 fps"), "29.97 dfps");
    expectWrongUsage(with("--rate", "59.94 dfps"), "\"59.94 dfps\" is not supported");
    expectWrongUsage(with("--rate", ""), "29.97 dfps");
    expectWrongUsage(with("--match", "reel"), "roll");
    expectWrongUsage(with("--heal", "all"), "inserts");
}

TEST(CommandLine, VfxPatternsAreChecked)
{
    const TempFolder folder;
    const std::vector<std::string> files{"generate", "--old", folder.write("old.edl", oldCut()), "--new",
                                         folder.write("new.edl", newCut())};
    const auto with = [&files](const std::vector<std::string>& patterns) {
        std::vector<std::string> arguments = files;
        for (const std::string& pattern : patterns)
            arguments.insert(arguments.end(), {"--vfx", pattern});
        return arguments;
    };

    expectWrongUsage(with({"VFX_/v,"}), "VFX_/v");
    expectWrongUsage(with({"VFX_"}), "comma");
    expectWrongUsage(with({","}), "comma");
    expectWrongUsage(with({"A,", "B,", "C,", "D,"}), "3 times");
    EXPECT_EQ(runCadrel(with({"A,", ",B", "C,D"})).status, 0);
}

TEST(CommandLine, AnOutputNeverOverwritesAnInput)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());
    const std::string newFile = folder.write("new.edl", newCut());

    expectWrongUsage({"generate", "--old", oldFile, "--new", newFile, "-o", newFile}, "overwrite");
    expectWrongUsage({"generate", "--old", oldFile, "--new", newFile, "-o", folder / "./old.edl"}, "overwrite");
    expectWrongUsage({"generate", "--old", oldFile, "--new", newFile, "--json", oldFile}, "overwrite");
    expectWrongUsage({"list", oldFile, "--json", oldFile}, "overwrite");
    EXPECT_EQ(contentOf(oldFile), oldCut());
    EXPECT_EQ(contentOf(newFile), newCut());
}

TEST(CommandLine, TheTwoOutputsAreTwoFiles)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());
    const std::string newFile = folder.write("new.edl", newCut());

    expectWrongUsage({"generate", "--old", oldFile, "--new", newFile, "-o", folder / "out", "--json", folder / "./out"},
                     "overwrite");
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"new.edl", "old.edl"}));
}

TEST(CommandLine, TheChangeEdlNeedsAFileName)
{
    expectWrongUsage({"generate", "--old", "old.edl", "--new", "new.edl", "-o", "-"}, "-o");
}

TEST(CommandLine, ColourIsForTerminalsOnly)
{
    const TempFolder folder;
    const std::string file = folder.write("old.edl", oldCut());

    const Outcome onTerminal = runCadrelOnTerminal({"list", file});
    const Outcome withoutColour = runCadrelOnTerminal({"list", file}, "NO_COLOR=1");
    const Outcome elsewhere = runCadrel({"list", file});

    EXPECT_EQ(onTerminal.status, 0);
    EXPECT_NE(onTerminal.out.find("\033[32mok\033[0m"), std::string::npos) << onTerminal.out;
    EXPECT_EQ(withoutColour.status, 0);
    EXPECT_EQ(withoutColour.out.find("\033[32m"), std::string::npos) << withoutColour.out;
    EXPECT_EQ(elsewhere.out.find('\033'), std::string::npos) << elsewhere.out;
}

TEST(CommandLine, TheProgressLineIsForTerminalsOnlyAndGoesAway)
{
    const TempFolder folder;
    const std::string file = folder.write("old.edl", oldCut());

    const Outcome onTerminal = runCadrelOnTerminal({"list", file});

    EXPECT_NE(onTerminal.out.find("reading old.edl\r\033[K"), std::string::npos) << onTerminal.out;
    EXPECT_EQ(runCadrel({"list", file}).err, "");
}

TEST(CommandLine, TheProgressLineDoesntWrapOnANarrowTerminal)
{
    const TempFolder folder;
    const std::string file = folder.write("a rather long name.edl", oldCut());
    const std::string cutAt19 = "reading a rather l\xe2\x80\xa6\r\033[K";
    const auto shownOn = [&](unsigned short columns) {
        return runCadrelOnNarrowTerminal({"list", file, "--summary"}, columns).out;
    };

    EXPECT_NE(shownOn(20).find(cutAt19), std::string::npos) << shownOn(20);
    // "reading a rather long name.edl" has 30 columns, and a line that is filled to its last one may wrap.
    EXPECT_EQ(shownOn(30).find("reading a rather long name.edl"), std::string::npos);
    EXPECT_NE(shownOn(31).find("reading a rather long name.edl\r"), std::string::npos);
    EXPECT_NE(shownOn(0).find("reading a rather long name.edl\r"), std::string::npos);
}

} // namespace
