// SPDX-License-Identifier: GPL-3.0-or-later

// How long the whole program takes to open a project of 200 tracks of 5,000 clips.

#include "standin/changes/ChangeLog.h"
#include "standin/file/ProjectFile.h"
#include "tests/desktop/shell/DesktopUser.h"
#include "tests/support/Sanitizer.h"
#include "tests/support/TempFolder.h"
#include "tests/support/standin/ManyClips.h"
#include "tests/support/x11/VirtualScreen.h"

#include <gtest/gtest.h>

#include <iostream>

namespace desktop::tests {

TEST(DesktopSpeed, OpensAMillionClipsInFiveSecondsOfTwoProcessors)
{
#if CADREL_ADDRESS_SANITIZER
    GTEST_SKIP() << "takes too long under the sanitizers";
#endif
    constexpr int Tracks = 200;
    constexpr int Clips = 5000;
    constexpr double MostSeconds = 5.0 * 2;
    const cadrel::tests::TempFolder folder;
    {
        standin::ChangeLog log;
        const auto project = Velmark::makeCounted<standin::Project>(log);
        standin::tests::addManyClips(*project, Tracks, Clips);
        standin::ProjectFile::write(*project, folder / "film.stage");
    }
    const cadrel::tests::VirtualScreen screen{1400, 1250};

    DesktopUser user(folder / "", {(folder / "film.stage").string()});
    user.waitForTitle("the project is open", [](const std::string& text) { return text == "film.stage - Cadrel"; });
    user.waitForRest(5);

    const double seconds = user.processorSeconds();
    std::cout << seconds << " s\n";
    EXPECT_GT(seconds, 0.0);
    EXPECT_LT(seconds, MostSeconds);
}

} // namespace desktop::tests
