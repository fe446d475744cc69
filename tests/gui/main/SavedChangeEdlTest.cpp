// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/SavedChangeEdl.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "tests/support/TempFolder.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <filesystem>

namespace cadrel::tests {
namespace {

namespace fs = std::filesystem;

using core::EventList;
using core::Framerate;
using gui::SavedChangeEdl;
using util::Result;

class SavedChangeEdlTest : public testing::Test {
protected:
    void fill(std::size_t count)
    {
        const auto event = makeEvent("A001", "10:00:00:00", "10:00:05:00", "01:00:00:00", "01:00:05:00");
        for (std::size_t index = 0; index < count; ++index)
            m_list.add(event);
    }
    SavedChangeEdl saved() const { return {m_list, widePath(m_folder / "change.edl")}; }

    TestProject m_project;
    TempFolder m_folder;
    EventList m_list;
};

TEST_F(SavedChangeEdlTest, AsksNothingOfTheFileThatTheUserHasNamed)
{
    fill(999);
    m_folder.write("change.edl", "old");
    m_folder.write("change_1.edl", "old");

    EXPECT_EQ(saved().question(), L"");
    saved().write();
    EXPECT_NE(contentOf(m_folder / "change.edl"), "old");
    EXPECT_EQ(contentOf(m_folder / "change_1.edl"), "old");
}

TEST_F(SavedChangeEdlTest, AsksBeforeNumberedFilesAreOverwritten)
{
    fill(1000);
    EXPECT_EQ(saved().question(), L"");
    m_folder.write("change_2.edl", "old");
    m_folder.write("change_3.edl", "old");

    EXPECT_EQ(
        saved().question(),
        L"The Change EDL has more events than one file can hold. These files would be overwritten:\nchange_2.edl");
    m_folder.write("change_1.edl", "old");
    EXPECT_EQ(saved().question(), L"The Change EDL has more events than one file can hold. These files would be "
                                  L"overwritten:\nchange_1.edl\nchange_2.edl");
}

TEST_F(SavedChangeEdlTest, NamesTenFilesAtMost)
{
    fill(11 * 999 + 1);
    for (int number = 1; number <= 12; ++number)
        m_folder.write("change_" + std::to_string(number) + ".edl", "old");

    const std::wstring question = saved().question();
    EXPECT_NE(question.find(L"change_10.edl\nand 2 more"), std::wstring::npos);
    EXPECT_EQ(question.find(L"change_11.edl"), std::wstring::npos);
}

TEST_F(SavedChangeEdlTest, WritesALongListIntoNumberedFiles)
{
    fill(1000);
    saved().write();

    EXPECT_TRUE(fs::exists(m_folder / "change_1.edl"));
    EXPECT_TRUE(fs::exists(m_folder / "change_2.edl"));
    EXPECT_FALSE(fs::exists(m_folder / "change.edl"));
}

TEST_F(SavedChangeEdlTest, SaysThatTimecodesAreDropFrameWhereTheyAre)
{
    m_project.framerate = Framerate(30, true, 1);
    fill(1);
    saved().write();

    EXPECT_NE(contentOf(m_folder / "change.edl").find("FCM: DROP FRAME"), std::string::npos);
}

TEST_F(SavedChangeEdlTest, ThrowsWhyAFileCannotBeWritten)
{
    EXPECT_EQ(thrownBy([this] { saved().write(); }), Result::InvalidArgument);
    fill(1);
    const SavedChangeEdl nowhere(m_list, widePath(m_folder / "no" / "change.edl"));
    EXPECT_EQ(thrownBy([&] { nowhere.write(); }), Result::FileAccessFailed);
}

} // namespace
} // namespace cadrel::tests
