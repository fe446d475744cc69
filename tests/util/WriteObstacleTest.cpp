// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/WriteObstacle.h"

#include "tests/support/NoPrivileges.h"
#include "tests/support/TempFolder.h"

#include <gtest/gtest.h>

#include <string>

namespace cadrel::util::tests {

namespace fs = std::filesystem;

using cadrel::tests::NoPrivileges;
using cadrel::tests::TempFolder;

namespace {

std::string problemOf(const fs::path& file)
{
    const auto obstacle = WriteObstacle::of(file);
    return obstacle ? obstacle->problem : "";
}

} // namespace

TEST(WriteObstacle, IsNoneForAFileThatCanBeMadeOrReplaced)
{
    const TempFolder folder;
    EXPECT_EQ(problemOf(folder / "new"), "");
    EXPECT_EQ(problemOf(folder.write("there", "")), "");
    EXPECT_EQ(problemOf(folder / std::string(255, 'x')), "");
    EXPECT_EQ(problemOf("in-the-current-folder"), "");
}

TEST(WriteObstacle, IsToldForEachFolderAndNameThatForbidsIt)
{
    const TempFolder folder;
    folder.write("file", "");
    EXPECT_EQ(problemOf(folder.path()), "is a folder");
    EXPECT_EQ(problemOf(folder / "none" / "file"), "the folder does not exist");
    EXPECT_EQ(problemOf(folder / "file" / "below"), "what should be the folder is a file");
    EXPECT_EQ(problemOf(folder / std::string(256, 'x')), "the name is too long");
    EXPECT_EQ(problemOf("/dev/full"), "can't be written");
}

TEST(WriteObstacle, IsAProtectionAgainstWriting)
{
    const TempFolder folder;
    const fs::path file = folder.write("file", "");
    fs::permissions(folder.path(), fs::perms::all);
    fs::permissions(file, fs::perms::owner_read | fs::perms::group_read | fs::perms::others_read);
    {
        const NoPrivileges user;
        EXPECT_EQ(problemOf(file), "is protected against writing");
        EXPECT_EQ(problemOf(folder / "new"), "");
    }
    fs::permissions(file, fs::perms::all);
    fs::permissions(folder.path(), fs::perms::owner_all | fs::perms::group_read | fs::perms::group_exec);
    const NoPrivileges user;
    EXPECT_EQ(problemOf(file), "you may not write into the folder");
    EXPECT_EQ(problemOf(folder / "new"), "you may not write into the folder");
}

} // namespace cadrel::util::tests
