// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/DroppedFile.h"

#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"

#include <gtest/gtest.h>

#include <string>
#include <sys/stat.h>

namespace desktop::tests {

namespace fs = std::filesystem;

using cadrel::tests::TempFolder;

TEST(DroppedFile, IsAProjectByTheBeginningOfEachForm)
{
    EXPECT_EQ(droppedFileOf(R"({"format": "stage", "version": 1)"), DroppedFile::Project);
    EXPECT_EQ(droppedFileOf("\xEF\xBB\xBF\n {\n  \"format\": \"stage\""), DroppedFile::Project);
    EXPECT_EQ(droppedFileOf("<?xml version=\"1.0\"?>\n<Session version=\"7003\">"), DroppedFile::Project);
    EXPECT_EQ(droppedFileOf("<html><body>"), DroppedFile::Other);
    EXPECT_EQ(droppedFileOf("{\"format\": \"music\"}"), DroppedFile::Other);
    EXPECT_EQ(droppedFileOf("{}"), DroppedFile::Other);
}

TEST(DroppedFile, IsAnEdlByItsTitleOrAnEvent)
{
    EXPECT_EQ(droppedFileOf("TITLE: REEL 3\n"), DroppedFile::Edl);
    EXPECT_EQ(droppedFileOf("001  A001 V C 01:00:00:00 01:00:10:00 10:00:00:00 10:00:10:00"), DroppedFile::Edl);
    EXPECT_EQ(droppedFileOf("* notes\r\n001 A V C 01:00:00;00 01:00:10;00 10:00:00;00 10:00:10;00\r\n"),
              DroppedFile::Edl);
    EXPECT_EQ(droppedFileOf("\xEF\xBB\xBFTITLE: REEL 3\r"), DroppedFile::Edl);
}

TEST(DroppedFile, IsNoEdlWithThreeTimecodesInALineOrWithOtherNumbers)
{
    EXPECT_EQ(droppedFileOf("001 A V C 01:00:00:00 01:00:10:00 10:00:00:00"), DroppedFile::Other);
    EXPECT_EQ(droppedFileOf("| 1 | 01:00:00:00 01:00:10:00 10:00:00:00 10:00:10:00 |"), DroppedFile::Other);
    EXPECT_EQ(droppedFileOf("01:00:00:00 01:00:10:00 10:00:00:00 10:00:10:00"), DroppedFile::Other);
    EXPECT_EQ(droppedFileOf("01:00:00:00 01:00:10:00\n10:00:00:00 10:00:10:00"), DroppedFile::Other);
    EXPECT_EQ(droppedFileOf("1 A V C 001:00:00:00 001:00:10:00 010:00:00:00 010:00:10:00"), DroppedFile::Other);
    EXPECT_EQ(droppedFileOf("1 A V C 01:00:00:000 01:00:10:000 10:00:00:000 10:00:10:000"), DroppedFile::Other);
    EXPECT_EQ(droppedFileOf("1 A V C 01:00:00:0 01:00:10:0 10:00:00:0 10:00:10:0"), DroppedFile::Other);
}

TEST(DroppedFile, IsSomethingElseWhateverElseItIs)
{
    for (const std::string& content :
         {std::string(), std::string(" \n\t"), std::string("\0\0\0", 3), std::string("RIFF....WAVE"),
          std::string("Cadrel autosave 1\n{}"), std::string(100000, ':'), std::string(100000, '1')})
        EXPECT_EQ(droppedFileOf(content), DroppedFile::Other) << content.substr(0, 30);
}

TEST(DroppedFile, IsWhatItIsWithoutRegardToItsName)
{
    const TempFolder folder;
    EXPECT_EQ(droppedFile(folder.write("reel.txt", "TITLE: REEL 3\n")), DroppedFile::Edl);
    EXPECT_EQ(droppedFile(folder.write("reel.edl", "{\"format\": \"stage\"}")), DroppedFile::Project);
    EXPECT_EQ(droppedFile(folder.write("reel.stage", "RIFF")), DroppedFile::Other);
    EXPECT_EQ(droppedFile(folder / "nothing"), DroppedFile::Other);
}

TEST(DroppedFile, IsAProjectForAFolderWithASession)
{
    const TempFolder folder;
    EXPECT_EQ(droppedFile(folder.path()), DroppedFile::Other);
    folder.write("film.ardour", "<Session");
    EXPECT_EQ(droppedFile(folder.path()), DroppedFile::Project);
    folder.write("other.ardour", "<Session");
    EXPECT_EQ(droppedFile(folder.path()), DroppedFile::Other);
}

TEST(DroppedFile, IsSomethingElseForAPipeWhichIsNotWaitedFor)
{
    const TempFolder folder;
    ASSERT_EQ(::mkfifo((folder / "pipe").c_str(), 0600), 0);
    EXPECT_EQ(droppedFile(folder / "pipe"), DroppedFile::Other);
}

TEST(DroppedFile, TellsTheFilesOfTheExampleApart)
{
    const fs::path example = cadrel::tests::treePath("examples/reel3");
    int edls = 0;
    int projects = 0;
    for (const auto& entry : fs::directory_iterator(example)) {
        const std::string extension = entry.path().extension().string();
        if (extension == ".edl") {
            EXPECT_EQ(droppedFile(entry.path()), DroppedFile::Edl) << entry.path();
            ++edls;
        } else if (extension == ".stage") {
            EXPECT_EQ(droppedFile(entry.path()), DroppedFile::Project) << entry.path();
            ++projects;
        } else if (entry.is_regular_file()) {
            EXPECT_EQ(droppedFile(entry.path()), DroppedFile::Other) << entry.path();
        }
    }
    EXPECT_GT(edls, 0);
    EXPECT_GT(projects, 0);
}

} // namespace desktop::tests
