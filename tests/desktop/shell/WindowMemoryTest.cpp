// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/WindowMemory.h"

#include "tests/support/TempFolder.h"

#include <gtest/gtest.h>

#include <string>

namespace desktop::tests {
namespace {

WindowForm formOf(int width, int height, bool isMaximised = false, int tracksHeight = -1)
{
    return {width, height, isMaximised, tracksHeight};
}

class WindowMemoryTest : public testing::Test {
protected:
    std::optional<WindowForm> readText(const std::string& text)
    {
        cadrel::tests::writeFile(m_file, text);
        return WindowMemory(m_file).read();
    }

    cadrel::tests::TempFolder m_folder;
    const std::filesystem::path m_file = m_folder / "window.json";
};

TEST_F(WindowMemoryTest, KnowsNothingBeforeTheFirstStart)
{
    EXPECT_FALSE(WindowMemory(m_file).read());
    EXPECT_FALSE(WindowMemory("").read());
}

TEST_F(WindowMemoryTest, ReadsWhatItHasKept)
{
    for (const WindowForm& form :
         {formOf(1000, 700), formOf(800, 560, true, 0), formOf(1 << 15, 1 << 15, false, 333)}) {
        EXPECT_TRUE(WindowMemory(m_folder / "a/b/window.json").keep(form));
        EXPECT_EQ(WindowMemory(m_folder / "a/b/window.json").read(), form);
    }
}

TEST_F(WindowMemoryTest, WritesOnlyWhatIsAnotherForm)
{
    WindowMemory memory(m_file);
    EXPECT_TRUE(memory.keep(formOf(1000, 700)));
    std::filesystem::remove(m_file);
    EXPECT_TRUE(memory.keep(formOf(1000, 700)));
    EXPECT_FALSE(std::filesystem::exists(m_file));
    EXPECT_TRUE(memory.keep(formOf(1000, 701)));
    EXPECT_TRUE(std::filesystem::exists(m_file));
}

TEST_F(WindowMemoryTest, PassesOverAFileThatItHasNotWritten)
{
    EXPECT_TRUE(readText(R"({"width": 800, "height": 560, "other": [1]})"));
    for (const char* const text : {
             "",
             "[]",
             "{\"width\": 800",
             R"({"width": 800})",
             R"({"width": "800", "height": 560})",
             R"({"width": 799, "height": 560})",
             R"({"width": 800, "height": 559})",
             R"({"width": 32769, "height": 560})",
             R"({"width": 800.5, "height": 560})",
             R"({"width": 1e300, "height": 560})",
             R"({"width": 800, "height": 560, "maximised": 1})",
             R"({"width": 800, "height": 560, "tracks": -1})",
             R"({"width": 800, "width": 900, "height": 560})",
             "\xff\xfe",
         })
        EXPECT_FALSE(readText(text)) << text;
    EXPECT_FALSE(readText(R"({"width": 800, "height": 560})" + std::string(4096, ' '))) << "too long";
    std::filesystem::remove(m_file);
    std::filesystem::create_directory(m_file);
    EXPECT_FALSE(WindowMemory(m_file).read());
}

TEST_F(WindowMemoryTest, TellsThatNothingCanBeWritten)
{
    EXPECT_FALSE(WindowMemory("").keep(formOf(1000, 700)));
    EXPECT_FALSE(WindowMemory("/dev/null/window.json").keep(formOf(1000, 700)));
}

TEST(StartForm, IsTheUsualOneWhereThatFits)
{
    EXPECT_EQ(startForm({}, {1560, 1140, false}), formOf(1560, 1140));
    EXPECT_EQ(startForm({}, {1576, 1188, true}), formOf(1560, 1140)) << "with the frame";
}

TEST(StartForm, FillsTheScreenWhereTheUsualOneDoesNotFit)
{
    EXPECT_EQ(startForm({}, {1575, 1188, true}), formOf(1559, 1140, true));
    EXPECT_EQ(startForm({}, {1576, 1187, true}), formOf(1560, 1139, true));
    EXPECT_EQ(startForm({}, {1366, 768, true}), formOf(1350, 720, true));
    EXPECT_EQ(startForm({}, {1366, 768, false}), formOf(1366, 768)) << "Without a window manager nothing is maximised.";
}

TEST(StartForm, IsTheRememberedOneAsFarAsThereIsRoom)
{
    EXPECT_EQ(startForm(formOf(900, 600, false, 150), {1366, 768, true}), formOf(900, 600, false, 150));
    EXPECT_EQ(startForm(formOf(900, 600, true), {1366, 768, true}), formOf(900, 600, true));
    EXPECT_EQ(startForm(formOf(1800, 1200), {1366, 768, true}), formOf(1350, 720));
    EXPECT_EQ(startForm(formOf(900, 600, true), {1366, 768, false}), formOf(900, 600));
    EXPECT_EQ(startForm(formOf(900, 600), {0, 0, true}), formOf(1, 1));
}

} // namespace
} // namespace desktop::tests
