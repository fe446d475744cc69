// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/ProgramRun.h"
#include "tests/app/SoundProject.h"
#include "tests/app/WithoutSecondNames.h"
#include "tests/support/Sanitizer.h"
#include "tests/support/TreePaths.h"

#include <algorithm>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <functional>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <sys/stat.h>
#include <unistd.h>
#include <utility>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

/// The work stops with 1 and one line: program, file, what is wrong, what to do.
void expectStopped(const Outcome& outcome, const std::string& line)
{
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.out, "");
    EXPECT_EQ(outcome.err, "cadrel: " + line + "\n");
}

using Runner = std::function<Outcome(const std::vector<std::string>&)>;

Outcome runAsSelf(const std::vector<std::string>& arguments)
{
    return runCadrel(arguments);
}

/// A file is refused by both commands, on either side.
void expectRefused(const std::string& file, const std::string& problem, const Runner& run = runAsSelf)
{
    const TempFolder folder;
    const std::string good = folder.write("good.edl", oldCut());
    giveToUnprivileged(folder.path());

    expectStopped(run({"list", file}), file + ": " + problem);
    expectStopped(run({"generate", "--old", file, "--new", good, "-o", folder / "change.edl"}), file + ": " + problem);
    expectStopped(run({"generate", "--old", good, "--new", file, "-o", folder / "change.edl"}), file + ": " + problem);
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"good.edl"}));
}

TEST(BadInput, NoSuchFile)
{
    const TempFolder folder;

    expectRefused(folder / "none.edl", "no such file; check the name and the folder");
    expectRefused(folder / "none/none.edl", "no such file; check the name and the folder");
    expectRefused(folder.write("file", "x") / "none.edl", "no such file; check the name and the folder");
    expectRefused("", "no such file; check the name and the folder");
}

TEST(BadInput, AFolderOrADevice)
{
    const TempFolder folder;
    const std::string pipe = folder / "pipe";
    ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);

    std::filesystem::create_directory(folder / "reel");
    expectRefused(folder / "reel", "is a folder; give the EDL files in it");
    expectRefused("/dev/null", "is a device; give an EDL file");
    expectRefused("/dev/zero", "is a device; give an EDL file");
    expectRefused(pipe, "is a pipe; write it into a file first");
}

TEST(BadInput, AFileWhoseReadingBreaksOff)
{
    expectRefused("/proc/self/mem", "can't be read to its end; check the disk or copy the file anew");
}

TEST(BadInput, AFileWithoutTheRightToRead)
{
    const TempFolder folder;
    const std::string file = folder.write("secret.edl", oldCut());
    std::filesystem::permissions(file, std::filesystem::perms::none);
    giveToUnprivileged(folder.path());

    expectRefused(file, "you may not read it; ask its owner for the right to read", runCadrelUnprivileged);
}

TEST(BadInput, AFileWithoutEvents)
{
    const TempFolder folder;

    expectRefused(folder.write("empty.edl", ""), "holds no events; give a CMX EDL");
    expectRefused(folder.write("title.edl", "TITLE: REEL 3\nFCM: NON-DROP FRAME\n* A COMMENT\n"),
                  "holds no events; give a CMX EDL");
    expectRefused(folder.write("short.edl", "001 AX V D 024 01:00:00:12\n"),
                  "holds no event that can be read; line 1 misses a field and isn't read: "
                  "\"001 AX V D 024 01:00:00:12\"; correct the list, and save it as plain text");
}

TEST(BadInput, ABinaryFile)
{
    const TempFolder folder;
    std::string bytes;
    for (int count = 0; count < 4096; ++count) {
        // All but the digits, which would begin an event.
        for (int byte = 0; byte < 256; ++byte) {
            if (byte < '0' || byte > '9')
                bytes += static_cast<char>(byte);
        }
    }

    expectRefused(folder.write("picture.mov", bytes), "holds no events; give a CMX EDL");
}

TEST(BadInput, AFileWithoutAReadableEvent)
{
    const TempFolder folder;

    const std::string good = folder.write("good.edl", oldCut());
    const std::string sound = folder.write("sound.edl", "001 AX A C 01:00:00:12 01:00:01:00 01:00:00:00 01:00:00:12\n");
    const std::string problem = ": holds no event that can be read (the first: Not a video event.); "
                                "give the CMX EDL of a picture track";

    expectStopped(runCadrel({"generate", "--old", sound, "--new", good}), sound + problem);
    expectStopped(runCadrel({"generate", "--old", good, "--new", sound}), sound + problem);

    const Outcome listed = runCadrel({"list", sound});
    EXPECT_EQ(listed.status, 0);
    EXPECT_NE(listed.out.find("Not a video event."), std::string::npos) << listed.out;
}

TEST(BadInput, AFileWithoutAnyTimecode)
{
    const TempFolder folder;

    expectRefused(
        folder.write("mail.txt", "1 a b c d e f g h i j k\n"),
        "holds no event that can be read (the first: Detected uninitialized timecode.); give the CMX EDL of a "
        "picture track");
}

TEST(BadInput, AFileThatShowsNoRate)
{
    const TempFolder folder;
    const std::string file =
        folder.write("film.edl", cut("001", "A001", "10:00:00:00 10:00:04:00", "01:00:00:00 01:00:04:00"));

    expectStopped(runCadrel({"list", file}),
                  file + ": shows no frame rate; give it with --rate, such as --rate \"24 fps\"");
    EXPECT_EQ(runCadrel({"list", file, "--rate", "25 fps"}).status, 0);
}

TEST(BadInput, ALineOf100Megabytes)
{
    const TempFolder folder;
    const std::string file = folder.write("long.edl", oldCut());
    {
        std::ofstream stream(file, std::ios::binary | std::ios::app);
        const std::string part(1000000, 'A');
        stream << "004  A004  V  C  10:00:00:00 10:00:04:00 01:00:30:00 01:00:34:00\n* FROM CLIP NAME: ";
        for (int count = 0; count < 100; ++count)
            stream << part;
    }

    const Outcome outcome = runCadrel({"list", file});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.err, "");
    EXPECT_NE(outcome.out.find("A004  " + std::string(39, 'A') + "…  long.edl"), std::string::npos);
}

#if !CADREL_ADDRESS_SANITIZER // whose address space can't be limited
TEST(BadInput, LackOfMemoryIsToldAsWhatItIs)
{
    const TempFolder folder;
    std::string text = "TITLE: LONG\n";
    for (int index = 0; index < 40000; ++index)
        text += cut("001", "A001", "10:00:00:00 10:00:00:12", "01:00:00:00 01:00:00:12");
    const std::string file = folder.write("long.edl", text);
    std::string events;
    for (int index = 0; index < 40000; ++index)
        events += std::string(index == 0 ? "" : ",") + R"({"kind": "clip", "start": )" + std::to_string(index) +
                  R"(, "end": )" + std::to_string(index + 1) + "}";
    const std::string project =
        folder.write("long.stage", projectWith(R"({"kind": "audio", "name": "DIA", "events": [)" + events + "]}"));
    const std::string oldFile = folder.write("old.edl", oldCut());
    const std::string newFile = folder.write("new.edl", newCut());
    const auto runWith = [](std::size_t megabytes, std::vector<std::string> arguments) {
        arguments.insert(arguments.begin(), {"--as=" + std::to_string(megabytes * 1024 * 1024), programPath("cadrel")});
        return runProgram("prlimit", arguments);
    };
    constexpr std::size_t Ample = 1024;
    std::size_t least = 16;
    while (least < Ample && runWith(least, {"--version"}).status != 0)
        least += 4;
    ASSERT_LT(least, Ample);

    for (const std::vector<std::string>& arguments :
         {std::vector<std::string>{"list", file, "--rate", "24 fps", "--summary"},
          {"apply", project, "--old", oldFile, "--new", newFile, "--force", "--summary"}}) {
        std::size_t failures = 0;
        for (std::size_t megabytes = least + 2;; megabytes += 4) {
            ASSERT_LT(megabytes, Ample) << arguments.front();
            const Outcome outcome = runWith(megabytes, arguments);
            if (outcome.status == 0)
                break;
            ++failures;
            ASSERT_EQ(outcome.status, 1) << megabytes << " MB for " << arguments.front();
            EXPECT_EQ(outcome.err,
                      "cadrel: memory: there is not enough of it; split the files or close other programs\n")
                << megabytes << " MB for " << arguments.front();
        }
        EXPECT_GT(failures, 0U) << arguments.front();
    }
}
#endif

TEST(BadInput, AFileLargerThan256Megabytes)
{
    constexpr std::uintmax_t Largest = 256ULL * 1024 * 1024;
    const TempFolder folder;
    const std::string file = folder.write("picture.mxf", "");

    // The holes of a file take no room on the disk.
    std::filesystem::resize_file(file, Largest + 1);
    expectRefused(file, "is larger than 256 MB, which no EDL is; give the CMX EDL of a picture track");

    std::filesystem::resize_file(file, Largest);
    expectStopped(runCadrel({"list", file}), file + ": holds no events; give a CMX EDL");
}

TEST(BadInput, NamesWithBlanksAndForeignLettersAreGood)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("Rolle 3 \xc3\xa4lt.edl", oldCut());
    const std::string newFile = folder.write("\xe6\x96\xb0 cut.edl", newCut());
    const std::string change = folder / "\xc3\x84nderung 3.edl";

    const Outcome outcome = runCadrel({"generate", "--old", oldFile, "--new", newFile, "-o", change});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_TRUE(std::filesystem::exists(change));
    EXPECT_TRUE(outcome.out.starts_with("Old cut     Rolle 3 \xc3\xa4lt.edl: 3 events")) << outcome.out;
}

TEST(BadInput, AFileNameThatIsNoUtf8)
{
    const TempFolder folder;
    const std::string file = folder.write("caf\xe9.edl", oldCut());
    const std::string good = folder.write("good.edl", oldCut());

    expectStopped(runCadrel({"list", file}),
                  (folder / "caf\xc3\xa9.edl").string() + ": the name is no UTF-8 text; rename the file or its folder");
    expectStopped(runCadrel({"generate", "--old", good, "--new", good, "-o", folder / "caf\xe9"}),
                  (folder / "caf\xc3\xa9").string() + ": the name is no UTF-8 text; rename the file or its folder");
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"caf\xe9.edl", "good.edl"}));
}

TEST(BadInput, ANameCantForgeASecondLine)
{
    const Outcome outcome = runCadrel({"list", "a\nb\033[2J"});

    EXPECT_EQ(outcome.err, "cadrel: a?b?[2J: no such file; check the name and the folder\n");
}

/// An output that can't be written, in the place of the change EDL and in that of the JSON.
void expectUnwritable(const std::string& path, const std::string& problem, const Runner& run = runAsSelf)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());
    const std::string newFile = folder.write("new.edl", newCut());
    giveToUnprivileged(folder.path());
    const std::vector<std::string> command{"generate", "--old", oldFile, "--new", newFile};
    const auto with = [&](const std::vector<std::string>& more) {
        std::vector<std::string> arguments = command;
        arguments.insert(arguments.end(), more.begin(), more.end());
        return run(arguments);
    };

    expectStopped(with({"-o", path, "--overwrite"}), path + ": " + problem);
    expectStopped(with({"-o", path, "--overwrite", "--json", folder / "change.json"}), path + ": " + problem);
    expectStopped(with({"-o", folder / "change.edl", "--overwrite", "--json", path}), path + ": " + problem);
    expectStopped(run({"list", oldFile, "--overwrite", "--json", path}), path + ": " + problem);
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"new.edl", "old.edl"}));
}

TEST(BadOutput, AFullDisk)
{
    expectUnwritable("/dev/full", "can't be written; see whether the disk is full");
}

TEST(BadOutput, AFolderThatDoesNotExist)
{
    const TempFolder folder;

    expectUnwritable(folder / "none/change.edl", "the folder does not exist; make it or give another");
    expectUnwritable(folder.write("file", "x") / "change.edl",
                     "what should be the folder is a file; give another name");
}

TEST(BadOutput, AFolderInThePlaceOfTheFile)
{
    const TempFolder folder;

    std::filesystem::create_directory(folder / "reel");
    expectUnwritable(folder / "reel", "is a folder; give the name of a file in it");
    expectUnwritable(folder / "reel/", "is a folder; give the name of a file in it");
    EXPECT_TRUE(std::filesystem::is_empty(folder / "reel"));
}

TEST(BadOutput, AFolderThatTakesNoFiles)
{
    const std::string problem = "you may not write into the folder; give another folder";
    const TempFolder folder;
    std::filesystem::permissions(folder.path(),
                                 std::filesystem::perms::owner_read | std::filesystem::perms::owner_exec);
    giveToUnprivileged(folder.path());

    expectUnwritable("/proc/change.edl", problem, runCadrelUnprivileged);
    expectUnwritable(folder / "change.edl", problem, runCadrelUnprivileged);
}

TEST(BadOutput, AFileProtectedAgainstWriting)
{
    const TempFolder folder;
    const std::string file = folder.write("change.edl", "former list");
    std::filesystem::permissions(file, std::filesystem::perms::owner_read);
    giveToUnprivileged(folder.path());
    giveToUnprivileged(file);

    expectUnwritable(file, "is protected against writing; give another name", runCadrelUnprivileged);
    EXPECT_EQ(contentOf(file), "former list");
}

TEST(BadOutput, AnInterruptionLeavesNothingHalfWritten)
{
    const TempFolder folder;
    const std::string document = folder.write("change.json", "former document");
    std::string text;
    for (int index = 0; index < 50000; ++index)
        text += cut("001", "A001", "10:00:00:00 10:00:00:12", "01:00:00:00 01:00:00:12");
    const std::string file = folder.write("long.edl", text);

    const Outcome outcome = runCadrelInterrupted({"list", file, "--overwrite", "--json", document}, folder);

    EXPECT_EQ(folder.names(), (std::vector<std::string>{"change.json", "long.edl"}));
    if (outcome.status == 0)
        EXPECT_EQ(json::parse(contentOf(document)).at("events").size(), 50000U);
    else
        EXPECT_EQ(contentOf(document), "former document");
}

TEST(BadOutput, TheFileOfASplitListThatCantBeWrittenIsNamed)
{
    const TempFolder folder;
    std::string text;
    for (int index = 0; index < 1000; ++index) {
        const std::string second = std::to_string(10 + index % 50);
        const std::string minute = std::to_string(10 + index / 50);
        const std::string in = minute + ":" + second + ":00";
        const std::string out = minute + ":" + second + ":12";
        text += cut("001", std::string("R") + std::to_string(index), std::string("10:") + in + " 10:" + out,
                    std::string("01:") + in + " 01:" + out);
    }
    const std::string file = folder.write("cut.edl", text);
    std::filesystem::create_directory(folder / "change_2.edl");

    const Outcome outcome =
        runCadrel({"generate", "--old", file, "--new", file, "-o", folder / "change.edl", "--heal", "none"});

    expectStopped(outcome, (folder / "change_2.edl").string() + ": is a folder; give the name of a file in it");
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"change_2.edl", "cut.edl"}));
}

TEST(BadOutput, AFileThatMayNotGrowAnyFurtherIsRemoved)
{
    const TempFolder folder;
    std::string text;
    for (int index = 0; index < 2000; ++index)
        text += cut("001", "A001", "10:00:00:00 10:00:00:12", "01:00:00:00 01:00:00:12");
    const std::string file = folder.write("long.edl", text);
    const std::string document = folder / "long.json";

    const Outcome outcome =
        runProgram("prlimit", {"--fsize=100000", programPath("cadrel"), "list", file, "--json", document});

    expectStopped(outcome, document + ": can't be written; see whether the disk is full, or give another name");
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"long.edl"}));
}

TEST(BadOutput, TwoNamesOfOneFileAreTwoNamesAlsoWhereItDoesNotExist)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());
    std::filesystem::create_directory(folder / "sub");
    std::filesystem::create_symlink("sub/target", folder / "link");
    std::filesystem::create_symlink("link", folder / "other link");
    for (const auto& [output, document] : {std::pair{"link", "sub/target"}, std::pair{"sub/target", "link"},
                                           std::pair{"other link", "link"}, std::pair{"other link", "sub/./target"}}) {
        const Outcome outcome = runCadrel(
            {"generate", "--old", oldFile, "--new", oldFile, "-o", folder / output, "--json", folder / document});

        EXPECT_EQ(outcome.status, 2) << output << document;
        EXPECT_NE(outcome.err.find("would overwrite another file of this run"), std::string::npos) << outcome.err;
    }
    EXPECT_TRUE(std::filesystem::is_empty(folder / "sub"));
}

TEST(BadOutput, AnEmptyNameIsASlip)
{
    const TempFolder folder;
    const std::string file = folder.write("cut.edl", oldCut());

    EXPECT_EQ(runCadrel({"generate", "--old", file, "--new", file, "-o", ""}).status, 2);
    EXPECT_EQ(runCadrel({"generate", "--old", file, "--new", file, "--json", ""}).status, 2);
    EXPECT_EQ(runCadrel({"list", file, "--json", ""}).status, 2);
}

TEST(BadOutput, AFormerFileStaysWhenTheRunFails)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());
    const std::string newFile = folder.write("new.edl", newCut());
    const std::string change = folder.write("change.edl", "former list");
    const std::string document = folder.write("change.json", "former document");

    EXPECT_EQ(
        runCadrel({"generate", "--old", oldFile, "--new", newFile, "-o", change, "--overwrite", "--json", "/dev/full"})
            .status,
        1);
    EXPECT_EQ(runCadrel({"generate", "--old", oldFile, "--new", newFile, "-o", "/dev/full", "--overwrite", "--json",
                         document})
                  .status,
              1);

    EXPECT_EQ(contentOf(change), "former list");
    EXPECT_EQ(contentOf(document), "former document");
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"change.edl", "change.json", "new.edl", "old.edl"}));
}

TEST(BadOutput, StandardOutputThatTakesNothing)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());
    const std::string line = "standard output: can't be written; see whether the disk is full";

    expectStopped(runCadrel({"list", oldFile}, "/dev/full"), line);
    expectStopped(runCadrel({"list", oldFile, "--json", "-"}, "/dev/full"), line);
    expectStopped(runCadrel({"--help"}, "/dev/full"), line);
    expectStopped(
        runCadrel({"generate", "--old", oldFile, "--new", oldFile, "-o", folder / "change.edl", "--json", "-"},
                  "/dev/full"),
        line);
    // Printing comes last, and what is completely written by then stays.
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"change.edl", "old.edl"}));
}

TEST(BadOutput, AFileCompletelyWrittenStaysWhenTheSummaryCantBeShown)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());

    const Outcome outcome =
        runCadrel({"generate", "--old", oldFile, "--new", oldFile, "-o", folder / "change.edl"}, "/dev/full");

    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"change.edl", "old.edl"}));
}

TEST(BadOutput, NothingIsPrintedOfAListThatCantBeWritten)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());

    const Outcome outcome =
        runCadrel({"generate", "--old", oldFile, "--new", oldFile, "-o", "/dev/full", "--json", "-"});

    expectStopped(outcome, "/dev/full: can't be written; see whether the disk is full");
}

TEST(BadOutput, AFileThatExistsIsReplacedOnlyWhenThatIsSaid)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());
    const std::string newFile = folder.write("new.edl", newCut());
    for (const std::string command : {"generate", "notes"}) {
        const std::string file = folder.write("result.txt", "former");
        const std::vector<std::string> arguments{command, "--old", oldFile, "--new", newFile, "-o", file};

        expectStopped(runCadrel(arguments), file + ": exists already; give --overwrite to replace it, or another name");
        EXPECT_EQ(contentOf(file), "former");

        std::vector<std::string> replacing = arguments;
        replacing.emplace_back("--overwrite");
        EXPECT_EQ(runCadrel(replacing).status, 0);
        const std::string result = contentOf(file);
        EXPECT_NE(result, "former");

        replacing.emplace_back("--backup");
        folder.write("result.txt", "former");
        EXPECT_EQ(runCadrel(replacing).status, 0);
        EXPECT_EQ(contentOf(file), result);
        EXPECT_EQ(contentOf(folder / "result_backup_1.txt"), "former");
        EXPECT_EQ(folder.names(),
                  (std::vector<std::string>{"new.edl", "old.edl", "result.txt", "result_backup_1.txt"}));
        std::filesystem::remove(folder / "result_backup_1.txt");
    }
}

TEST(BadOutput, AJsonFileThatExistsIsReplacedOnlyWhenThatIsSaid)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());
    const std::string newFile = folder.write("new.edl", newCut());
    const std::string project = treePath("examples/tworeels/tworeels.stage");
    const std::string oldReels = treePath("examples/tworeels/old.edl");
    const std::string newReels = treePath("examples/tworeels/new.edl");
    const std::string change = folder / "change.edl";
    for (const std::vector<std::string>& command :
         {std::vector<std::string>{"generate", "--old", oldFile, "--new", newFile, "-o", change},
          std::vector<std::string>{"apply", project, "--old", oldReels, "--new", newReels},
          std::vector<std::string>{"list", oldFile}, std::vector<std::string>{"show", project}}) {
        SCOPED_TRACE(command.front());
        const std::string document = folder.write("a.json", "former");
        std::vector<std::string> arguments = command;
        arguments.insert(arguments.end(), {"--json", document});

        expectStopped(runCadrel(arguments),
                      document + ": exists already; give --overwrite to replace it, or another name");
        EXPECT_EQ(contentOf(document), "former");
        EXPECT_FALSE(std::filesystem::exists(change));

        arguments.emplace_back("--overwrite");
        EXPECT_EQ(runCadrel(arguments).status, 0);
        EXPECT_TRUE(json::parse(contentOf(document)).is_object());
        std::filesystem::remove(change);
    }
}

TEST(BadOutput, ABackupKeepsTheFormerJsonFileToo)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());
    const std::string newFile = folder.write("new.edl", newCut());
    const std::string project = treePath("examples/tworeels/tworeels.stage");
    const std::string oldReels = treePath("examples/tworeels/old.edl");
    const std::string newReels = treePath("examples/tworeels/new.edl");
    for (std::vector<std::string> arguments :
         {std::vector<std::string>{"generate", "--old", oldFile, "--new", newFile},
          std::vector<std::string>{"apply", project, "--old", oldReels, "--new", newReels}}) {
        SCOPED_TRACE(arguments.front());
        const std::string document = folder.write("a.json", "former");
        const std::string backup = folder / "a_backup_1.json";
        arguments.insert(arguments.end(), {"--json", document, "--overwrite", "--backup"});

        const Outcome outcome = runCadrel(arguments);

        EXPECT_EQ(outcome.status, 0) << outcome.err;
        EXPECT_EQ(contentOf(backup), "former");
        EXPECT_NE(outcome.out.find("Backup      " + backup + "\n"), std::string::npos) << outcome.out;
        std::filesystem::remove(backup);
    }
}

/// A copy of the small example project that is longer than a limit.
std::string longProject(const TempFolder& folder, std::size_t limit)
{
    // Blanks after the end of the text mean nothing.
    return folder.write("reel.stage",
                        contentOf(treePath("examples/tworeels/tworeels.stage")) + std::string(limit, ' ') + "\n");
}

ino_t inodeOf(const std::string& file)
{
    struct stat facts {};
    EXPECT_EQ(stat(file.c_str(), &facts), 0) << file;
    return facts.st_ino;
}

TEST(BadOutput, ABackupIsACopyWhereFilesCantHaveSecondNames)
{
    const TempFolder folder;
    const std::string oldFile = treePath("examples/tworeels/old.edl");
    const std::string newFile = treePath("examples/tworeels/new.edl");
    const std::string project = longProject(folder, 100000);
    const std::string before = contentOf(project);
    const ino_t inode = inodeOf(project);
    const std::string document = folder.write("a.json", "former");

    const Outcome outcome = runCadrelWithoutSecondNames({"apply", project, "--old", oldFile, "--new", newFile,
                                                         "--in-place", "--json", document, "--overwrite", "--backup"});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(contentOf(folder / "reel_backup_1.stage"), before);
    EXPECT_NE(contentOf(project), before);
    EXPECT_EQ(contentOf(folder / "a_backup_1.json"), "former");
    EXPECT_TRUE(json::parse(contentOf(document)).is_object());
    EXPECT_EQ(folder.names(),
              (std::vector<std::string>{"a.json", "a_backup_1.json", "reel.stage", "reel_backup_1.stage"}));
    EXPECT_NE(inodeOf(folder / "reel_backup_1.stage"), inode);
}

TEST(BadOutput, ABackupThatIsACopyTakesTheNextFreeNumber)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());
    const std::string newFile = folder.write("new.edl", newCut());
    const std::string change = folder.write("change.edl", "former");
    folder.write("change_backup_1.edl", "older");

    const Outcome outcome = runCadrelWithoutSecondNames(
        {"generate", "--old", oldFile, "--new", newFile, "-o", change, "--overwrite", "--backup"});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(contentOf(folder / "change_backup_1.edl"), "older");
    EXPECT_EQ(contentOf(folder / "change_backup_2.edl"), "former");
    EXPECT_NE(contentOf(change), "former");
}

TEST(BadOutput, ABackupThatCantBeCopiedWholeStopsTheRunAndLeavesEveryFileAsItWas)
{
    constexpr std::size_t Limit = 100000;
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());
    const std::string newFile = folder.write("new.edl", newCut());
    const std::string project = longProject(folder, Limit);
    const std::string before = contentOf(project);
    const std::string longText(Limit + 1, 'f');
    const std::string shortFile = folder.write("short.txt", "former");
    const std::string longFile = folder.write("long.txt", longText);
    const std::string document = folder.write("long.json", longText);
    const std::vector<std::string> names = folder.names();
    const auto run = [&](std::vector<std::string> words) {
        words.insert(words.end(), {"--overwrite", "--backup"});
        return runCadrelWithoutSecondNames(words, Limit);
    };
    const std::string full = ": can't be written; see whether the disk is full, or give another name";
    const std::string projectBackup = folder / "reel_backup_1.stage";
    const std::string documentBackup = folder / "long_backup_1.json";

    expectStopped(run({"notes", "--old", oldFile, "--new", newFile, "-o", longFile}),
                  (folder / "long_backup_1.txt").string() + full);
    // The backup of the first file is whole then, and goes too.
    expectStopped(run({"generate", "--old", oldFile, "--new", newFile, "-o", shortFile, "--json", document}),
                  documentBackup + full);
    expectStopped(run({"apply", project, "--old", treePath("examples/tworeels/old.edl"), "--new",
                       treePath("examples/tworeels/new.edl"), "--in-place"}),
                  projectBackup + full);
    const std::string exact = folder.write("exact.txt", std::string(Limit, 'f'));
    const Outcome whole = run({"notes", "--old", oldFile, "--new", newFile, "-o", exact});

    EXPECT_EQ(contentOf(longFile), longText);
    EXPECT_EQ(contentOf(shortFile), "former");
    EXPECT_EQ(contentOf(document), longText);
    EXPECT_EQ(contentOf(project), before);
    EXPECT_EQ(whole.status, 0) << whole.err;
    EXPECT_EQ(contentOf(folder / "exact_backup_1.txt"), std::string(Limit, 'f'));
    std::filesystem::remove(folder / "exact_backup_1.txt");
    std::filesystem::remove(exact);
    EXPECT_EQ(folder.names(), names);
}

TEST(BadOutput, ABackupOfTheProjectGoesWhereThatOfItsReportCantBeCopied)
{
    const TempFolder folder;
    const std::string text = contentOf(treePath("examples/tworeels/tworeels.stage"));
    const std::string project = folder.write("reel.stage", text);
    const std::size_t limit = 1000000;
    ASSERT_LT(text.size(), limit);
    const std::string document = folder.write("a.json", std::string(limit + 1, 'f'));

    const Outcome outcome = runCadrelWithoutSecondNames(
        {"apply", project, "--old", treePath("examples/tworeels/old.edl"), "--new",
         treePath("examples/tworeels/new.edl"), "--in-place", "--json", document, "--overwrite", "--backup"},
        limit);

    expectStopped(outcome, (folder / "a_backup_1.json").string() +
                               ": can't be written; see whether the disk is full, or give another name");
    EXPECT_EQ(contentOf(project), text);
    EXPECT_EQ(contentOf(document), std::string(limit + 1, 'f'));
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"a.json", "reel.stage"}));
}

TEST(BadOutput, DevicesAreWrittenAndStay)
{
    const TempFolder folder;
    const std::string oldFile = folder.write("old.edl", oldCut());

    EXPECT_EQ(
        runCadrel({"generate", "--old", oldFile, "--new", oldFile, "-o", "/dev/null", "--json", "/dev/null"}).status,
        0);
    EXPECT_FALSE(std::filesystem::is_regular_file("/dev/null"));
}

} // namespace
