// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/files/EdlFolder.h"

#include "core/model/DataModel.h"
#include "core/serialize/ByteArchive.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <string>

namespace cadrel::tests {
namespace {

using core::DataModel;
using core::PropertyKey;
using core::Variant;

class EdlFolderTest : public testing::Test {
protected:
    TestProject m_project;
    TempFolder m_folder;
    DataModel m_model;
};

TEST_F(EdlFolderTest, IsThatOfTheProjectAtFirst)
{
    EXPECT_EQ(gui::edlFolderOf(m_model, L"/films/L\u00f6we/reel 3.stage"), L"/films/L\u00f6we");
    EXPECT_EQ(gui::edlFolderOf(m_model, L""), L"");
}

TEST_F(EdlFolderTest, IsThatOfTheLastEdls)
{
    m_model.setProperty(PropertyKey::LastEdlFolder, Variant(m_folder.path().string()));

    EXPECT_EQ(gui::edlFolderOf(m_model, L"/films/reel 3.stage"), widePath(m_folder.path()));
}

TEST_F(EdlFolderTest, IsThatOfTheLastEdlsAfterTheModelWasStored)
{
    m_model.setProperty(PropertyKey::LastEdlFolder, Variant(m_folder.path().string()));
    core::serialize::ByteArchive archive;
    archive << m_model;
    DataModel opened;
    archive >> opened;

    EXPECT_EQ(gui::edlFolderOf(opened, L"/films/reel 3.stage"), widePath(m_folder.path()));
}

TEST_F(EdlFolderTest, IsThatOfTheProjectWhenTheLastOneHasGoneOrIsAFile)
{
    m_model.setProperty(PropertyKey::LastEdlFolder, Variant((m_folder / "gone").string()));
    EXPECT_EQ(gui::edlFolderOf(m_model, L"/films/reel 3.stage"), L"/films");

    m_model.setProperty(PropertyKey::LastEdlFolder, Variant(m_folder.write("a.edl", "").string()));
    EXPECT_EQ(gui::edlFolderOf(m_model, L"/films/reel 3.stage"), L"/films");
}

TEST_F(EdlFolderTest, IsThatOfTheProjectWhenTheStoredOneIsNoPath)
{
    for (const std::string& stored : {std::string(), std::string("caf\xe9"), std::string("/tmp\0x", 6)}) {
        m_model.setProperty(PropertyKey::LastEdlFolder, Variant(stored));
        EXPECT_EQ(gui::edlFolderOf(m_model, L"/films/reel 3.stage"), L"/films");
    }
}

TEST_F(EdlFolderTest, IsTheFolderAlsoOfAFileWithABackslash)
{
    EXPECT_EQ(gui::folderOfFile(L"/films/a\\b.edl"), L"/films");
}

} // namespace
} // namespace cadrel::tests
