// SPDX-License-Identifier: GPL-3.0-or-later

// What the program takes before it begins to work.

#include "tests/app/ProgramRun.h"
#include "tests/support/Sanitizer.h"
#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <string>
#include <vector>

#include <sys/resource.h>

namespace cadrel::tests {

namespace {

/// Of the processor, by all programs that have run and ended.
double millisecondsOfPrograms()
{
    rusage usage{};
    getrusage(RUSAGE_CHILDREN, &usage);
    const auto millisecondsOf = [](const timeval& time) {
        return 1e3 * static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) / 1e3;
    };
    return millisecondsOf(usage.ru_utime) + millisecondsOf(usage.ru_stime);
}

/// What a run of the program says, with all that the system loads for it.
std::string loadedBy(const std::string& program, std::vector<std::string> arguments)
{
    arguments.insert(arguments.begin(), {"LD_DEBUG=libs", programPath(program)});
    const Outcome outcome = runProgram("/usr/bin/env", arguments);
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    return outcome.err;
}

bool hasLibrary(const std::string& loaded, const std::string& name)
{
    return loaded.find("/" + name + ".so") != std::string::npos;
}

} // namespace

TEST(Start, TakesLessThanTenMilliseconds)
{
    if (CADREL_ADDRESS_SANITIZER)
        GTEST_SKIP() << "A sanitizer takes its own time.";
    std::vector<double> runs;

    for (int run = 0; run < 25; ++run) {
        const double before = millisecondsOfPrograms();
        EXPECT_EQ(runCadrel({"--version"}).status, 0);
        runs.push_back(millisecondsOfPrograms() - before);
    }

    // What else runs on the machine makes single runs slower, and none faster.
    std::sort(runs.begin(), runs.end());
    std::printf("from %.1f ms, half of them under %.1f ms\n", runs.front(), runs[runs.size() / 2]);
    EXPECT_LT(runs.front(), 10.0);
}

TEST(Start, NoCommandLoadsTheLibrariesOfVideos)
{
    const TempFolder folder;
    const auto reel = [](const std::string& name) { return treePath("examples/tworeels/" + name); };
    const std::vector<std::string> cuts{"--old", reel("old.edl"), "--new", reel("new.edl")};
    const auto with = [&cuts](std::vector<std::string> command) {
        command.insert(command.end(), cuts.begin(), cuts.end());
        return command;
    };

    for (const auto& command : {std::vector<std::string>{"--version"},
                                {"list", reel("new.edl"), "--rate", "24 fps"},
                                with({"generate", "--rate", "24 fps", "-o", (folder / "change.edl").string()}),
                                with({"notes", "--rate", "24 fps", "-o", (folder / "notes.html").string()}),
                                with({"apply", reel("tworeels.stage"), "-o", (folder / "new.stage").string()})}) {
        const std::string loaded = loadedBy("cadrel", command);
        EXPECT_TRUE(hasLibrary(loaded, "libstdc++"));
        for (const char* const library : {"libavformat", "libavcodec", "libavutil", "libswscale"})
            EXPECT_FALSE(hasLibrary(loaded, library)) << command.front() << " loads " << library;
    }
    // That it is found where it is needed shows that the search sees it.
    EXPECT_TRUE(hasLibrary(loadedBy("cadrel", {"show", reel("tworeels.stage"), "--media"}), "libavformat"));
}

} // namespace cadrel::tests
