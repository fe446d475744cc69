// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/RecentFiles.h"

#include "tests/support/FileSizeLimit.h"
#include "tests/support/TempFolder.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <optional>
#include <string>

namespace desktop::tests {

namespace fs = std::filesystem;

using cadrel::tests::contentOf;
using cadrel::tests::FileSizeLimit;
using cadrel::tests::TempFolder;
using cadrel::tests::writeFile;

namespace {

/// A variable of the environment with another value, or without one, while this lives.
class Environment {
public:
    Environment(const char* name, const char* value) : m_name(name)
    {
        if (const char* const former = std::getenv(name))
            m_former = former;
        set(value);
    }
    Environment(const Environment&) = delete;
    Environment& operator=(const Environment&) = delete;
    ~Environment() { set(m_former ? m_former->c_str() : nullptr); }

private:
    void set(const char* value) { value ? ::setenv(m_name, value, 1) : ::unsetenv(m_name); }

    const char* m_name;
    std::optional<std::string> m_former;
};

} // namespace

class RecentFilesTest : public testing::Test {
protected:
    std::vector<std::string> paths() const
    {
        std::vector<std::string> paths;
        for (const RecentFiles::Entry& entry : files.entries())
            paths.push_back(entry.path.string());
        return paths;
    }

    TempFolder folder;
    fs::path list = folder / "a" / "b" / "recent.json";
    RecentFiles files{list};
};

TEST_F(RecentFilesTest, AreNoneAtFirst)
{
    EXPECT_TRUE(files.entries().empty());
}

TEST_F(RecentFilesTest, StandInTheOrderInWhichTheyWereOpenedTheNewestFirst)
{
    for (const char* const path : {"/a", "/b", "/c", "/a"})
        EXPECT_TRUE(files.add(path));

    EXPECT_EQ(paths(), (std::vector<std::string>{"/a", "/c", "/b"}));
    EXPECT_TRUE(files.remove("/c"));
    EXPECT_FALSE(files.remove("/c"));
    EXPECT_EQ(paths(), (std::vector<std::string>{"/a", "/b"}));
    EXPECT_TRUE(files.clear());
    EXPECT_TRUE(files.entries().empty());
}

TEST_F(RecentFilesTest, AreTwentyAtMost)
{
    for (int number = 1; number <= 21; ++number)
        files.add(std::string("/").append(std::to_string(number)));

    EXPECT_EQ(paths().size(), 20U);
    EXPECT_EQ(paths().front(), "/21");
    EXPECT_EQ(paths().back(), "/2");
}

TEST_F(RecentFilesTest, TellWhichAreMissing)
{
    const fs::path there = folder.write("reel3.stage", "");
    files.add(there);
    files.add(folder / "gone.stage");
    files.add(folder.path());

    const auto entries = files.entries();
    ASSERT_EQ(entries.size(), 3U);
    EXPECT_TRUE(entries[0].isMissing); // a folder
    EXPECT_TRUE(entries[1].isMissing);
    EXPECT_FALSE(entries[2].isMissing);
}

TEST_F(RecentFilesTest, KeepNamesWithAnyCharacter)
{
    const std::string path = "/film \"3\"\\\n\t\x01 caf\xc3\xa9.stage";
    EXPECT_TRUE(files.add(path));
    EXPECT_EQ(paths(), std::vector<std::string>{path});
}

TEST_F(RecentFilesTest, RefuseWhatCannotBeKept)
{
    EXPECT_FALSE(files.add("/caf\xe9.stage"));
    EXPECT_FALSE(files.add("relative.stage"));
    EXPECT_FALSE(files.add(""));
    EXPECT_FALSE(RecentFiles("").add("/a"));
    EXPECT_TRUE(files.entries().empty());
}

TEST_F(RecentFilesTest, TakeNothingFromAListThatIsNone)
{
    fs::create_directories(list.parent_path());
    for (const std::string& content :
         {std::string(), std::string("null"), std::string("[]"), std::string("{\"recent\": 5}"),
          std::string("{\"recent\": [\"/a\""), std::string("\xff\xfe"), std::string(2000000, '['),
          std::string("{\"recent\": [[[[\"/a\"]]]]}"), std::string("{\"recent\": [\"/a\"], \"recent\": [\"/b\"]}")}) {
        writeFile(list, content);
        EXPECT_TRUE(files.entries().empty()) << content.substr(0, 50);
    }
    EXPECT_TRUE(files.add("/a"));
    EXPECT_EQ(paths(), std::vector<std::string>{"/a"});
}

TEST_F(RecentFilesTest, TakeWhatIsGoodFromAList)
{
    fs::create_directories(list.parent_path());
    std::string many = "{\"recent\": [1, null, {}, \"\", \"relative\", \"/a\\u0000b\", \"/a\", \"/a\"";
    for (int number = 1; number <= 30; ++number)
        many.append(", \"/").append(std::to_string(number)).append("\"");
    writeFile(list, many.append("]}"));

    EXPECT_EQ(paths().size(), 20U);
    EXPECT_EQ(paths().front(), "/a");
    EXPECT_EQ(paths().back(), "/19");
}

TEST_F(RecentFilesTest, StayAsTheyWereOnAFullDisk)
{
    files.add("/a");
    const std::string before = contentOf(list);
    {
        const FileSizeLimit full(3);
        EXPECT_FALSE(files.add("/b"));
    }
    EXPECT_EQ(contentOf(list), before);
}

TEST_F(RecentFilesTest, AreNoneWhereTheListIsAFolder)
{
    fs::create_directories(list);
    EXPECT_TRUE(files.entries().empty());
    EXPECT_FALSE(files.add("/a"));
}

TEST_F(RecentFilesTest, OfSeveralProgramsComeTogether)
{
    RecentFiles other(list);
    files.add("/a");
    other.add("/b");
    files.add("/c");
    EXPECT_EQ(paths(), (std::vector<std::string>{"/c", "/b", "/a"}));
}

TEST(RecentFilesPlace, IsInTheFolderForStateOfTheUser)
{
    const Environment home("HOME", "/home/ann");
    {
        const Environment state("XDG_STATE_HOME", "/state");
        EXPECT_EQ(RecentFiles::defaultFile(), "/state/cadrel/recent.json");
    }
    for (const char* const value : {static_cast<const char*>(nullptr), "", "relative"}) {
        const Environment state("XDG_STATE_HOME", value);
        EXPECT_EQ(RecentFiles::defaultFile(), "/home/ann/.local/state/cadrel/recent.json");
    }
}

TEST(RecentFilesPlace, IsNowhereWithoutAHome)
{
    const Environment state("XDG_STATE_HOME", nullptr);
    for (const char* const value : {static_cast<const char*>(nullptr), "", "relative"}) {
        const Environment home("HOME", value);
        EXPECT_EQ(RecentFiles::defaultFile(), "");
    }
}

} // namespace desktop::tests
