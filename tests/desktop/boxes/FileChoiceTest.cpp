// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/boxes/FileChoice.h"

#include "tests/support/TempFolder.h"

#include <gtest/gtest.h>

namespace desktop::tests {
namespace {

const FileFilters Edl{{"edl", "EDL"}};
const FileFilters Video{{"mov", "QuickTime"}, {"mp4", "MPEG-4"}};

TEST(FileChoice, FitsWhatHasTheExtensionOfAFilterInAnyLetters)
{
    EXPECT_TRUE(fits("/film/cut.edl", Edl));
    EXPECT_TRUE(fits("/film/CUT.EDL", Edl));
    EXPECT_TRUE(fits("cut.mp4", Video));
    EXPECT_FALSE(fits("cut.edl.txt", Edl));
    EXPECT_FALSE(fits("edl", Edl));
    EXPECT_FALSE(fits("cut", Edl));
    EXPECT_FALSE(fits("cut.", Edl));
    EXPECT_FALSE(fits(".edl", Edl)) << "The name of a hidden file is no extension.";
}

TEST(FileChoice, FitsEveryNameWithoutFilters)
{
    EXPECT_TRUE(fits("cut", {}));
    EXPECT_TRUE(fits("cut.txt", {}));
}

TEST(FileChoice, AddsTheFirstExtensionToANameThatHasNoneOfThem)
{
    EXPECT_EQ(withExtension("/film/cut", Edl), "/film/cut.edl");
    EXPECT_EQ(withExtension("/film/cut.v2", Edl), "/film/cut.v2.edl");
    EXPECT_EQ(withExtension("/film/cut.", Video), "/film/cut..mov");
}

TEST(FileChoice, LeavesANameAsItIsThatHasAnExtensionAlready)
{
    EXPECT_EQ(withExtension("/film/cut.EDL", Edl), "/film/cut.EDL");
    EXPECT_EQ(withExtension("/film/cut.mp4", Video), "/film/cut.mp4");
    EXPECT_EQ(withExtension("/film/cut", {}), "/film/cut");
    EXPECT_EQ(withExtension("/film/", Edl), "/film/") << "A folder is no name.";
}

TEST(FolderMemory, BeginsWhereItIsWishedOrElseWhereTheLastFileWas)
{
    const cadrel::tests::TempFolder folder;
    FolderMemory memory("/home/user");
    EXPECT_EQ(memory.startOf(""), "/home/user");
    EXPECT_EQ(memory.startOf(folder / ""), folder / "");
    EXPECT_EQ(memory.startOf(folder / "missing"), "/home/user");

    memory.remember("/film/reel3/cut.edl");
    EXPECT_EQ(memory.startOf(""), "/film/reel3");
    EXPECT_EQ(memory.startOf(folder / ""), folder / "");
}

} // namespace
} // namespace desktop::tests
