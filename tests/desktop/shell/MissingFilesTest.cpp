// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/MissingFiles.h"

#include "tests/support/TempFolder.h"

#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <thread>

namespace desktop::tests {
namespace {

namespace fs = std::filesystem;

class MissingFilesTest : public testing::Test {
protected:
    void look(std::vector<fs::path> files)
    {
        m_missing.look(std::move(files));
        for (int turns = 0; turns < 1000 && m_missing.isLooking(); ++turns)
            std::this_thread::sleep_for(std::chrono::milliseconds(10));
        ASSERT_FALSE(m_missing.isLooking());
    }

    cadrel::tests::TempFolder m_folder;
    MissingFiles m_missing;
};

TEST_F(MissingFilesTest, AreThoseThatAreNotThere)
{
    const fs::path there = m_folder.write("there.stage", "{}");
    const fs::path gone = m_folder / "gone.stage";
    EXPECT_FALSE(m_missing.isMissing(gone)) << "Nobody has looked yet.";
    look({there, gone});
    EXPECT_FALSE(m_missing.isMissing(there));
    EXPECT_TRUE(m_missing.isMissing(gone));
}

TEST_F(MissingFilesTest, AreNoLongerMissingWhenTheyHaveComeBack)
{
    const fs::path file = m_folder / "reel.stage";
    look({file});
    m_folder.write("reel.stage", "{}");
    EXPECT_TRUE(m_missing.isMissing(file)) << "As far as is known.";
    look({file});
    EXPECT_FALSE(m_missing.isMissing(file));
    fs::remove(file);
    look({file});
    EXPECT_TRUE(m_missing.isMissing(file));
}

TEST_F(MissingFilesTest, CanGoWhileTheyAreLookedFor)
{
    MissingFiles missing;
    missing.look(std::vector<fs::path>(1000, m_folder / "reel.stage"));
}

} // namespace
} // namespace desktop::tests
