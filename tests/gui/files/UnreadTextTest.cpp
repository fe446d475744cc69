// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/files/UnreadText.h"

#include "core/edl/EventList.h"
#include "core/fileio/CmxParser.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::fileio::UnreadLine;

/// Marks every text that it translates.
class MarkingConverter : public PlainConverter {
public:
    std::wstring translate(const std::wstring& text) const override { return L"<" + text + L">"; }
};

std::string utf16(const std::string& text)
{
    std::string units = "\xff\xfe";
    for (const char character : text) {
        units += character;
        units += '\0';
    }
    return units;
}

class UnreadTextTest : public testing::Test {
protected:
    /// What the user reads of an EDL.
    std::wstring textOf(const std::string& edl)
    {
        core::fileio::CmxParser parser;
        parser.readThoroughly();
        core::EventList events;
        core::Framerate shown;
        parser.parse(widePath(m_folder.write("a.edl", edl)), events, shown, false);
        return gui::textOfUnread(parser.remarks().unreadLines, 10);
    }

    TestProject m_project;
    TempFolder m_folder;
};

TEST_F(UnreadTextTest, IsEmptyWithoutALine)
{
    EXPECT_EQ(gui::textOfUnread({}, 10), L"");
}

TEST_F(UnreadTextTest, TellsAsManyLinesAsItMay)
{
    const std::vector<UnreadLine> lines{{{3, "one"}, "is odd"}, {{5, "two"}, "is odder"}, {{7, "three"}, "is odd"}};

    EXPECT_EQ(gui::textOfUnread(lines, 3),
              L"Line 3 is odd: \"one\"\nLine 5 is odder: \"two\"\nLine 7 is odd: \"three\"\n");
    EXPECT_EQ(gui::textOfUnread(lines, 2), L"Line 3 is odd: \"one\"\nLine 5 is odder: \"two\"\nand 1 more\n");
    EXPECT_EQ(gui::textOfUnread(lines, 0), L"and 3 more\n");
}

TEST_F(UnreadTextTest, CutsTextsOfMoreThanAHundredCharacters)
{
    EXPECT_EQ(gui::textOfUnread({{{1, std::string(100, 'x')}, "is odd"}}, 1),
              L"Line 1 is odd: \"" + std::wstring(100, L'x') + L"\"\n");
    EXPECT_EQ(gui::textOfUnread({{{1, std::string(101, 'x')}, "is odd"}}, 1),
              L"Line 1 is odd: \"" + std::wstring(99, L'x') + L"\u2026\"\n");
}

TEST_F(UnreadTextTest, ShowsWhatIsNoText)
{
    EXPECT_EQ(gui::textOfUnread({{{1, "caf\xe9\t\x01"}, "is odd"}}, 1), L"Line 1 is odd: \"caf\ufffd\ufffd\ufffd\"\n");
}

TEST_F(UnreadTextTest, TranslatesAllThatTheReaderSays)
{
    const MarkingConverter converter;
    util::StringUtil::setConverter(&converter);
    const std::string event = "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00";
    const std::string first = "001  A001 V C " + event;
    const std::vector<std::string> edls{
        "001  A001 V C 10:00:00:00\n",
        "001  A001 V D " + event + "\n",
        first + "\nM2   A001       fast       10:00:00:00\n",
        first + "\nM2   B001       -025.0     10:00:00:00\n",
        utf16(first),
        first + "  002  A001 V C " + event + "\n",
        first + " * FROM CLIP NAME: X\n",
        first + "\n* FROM CLIP NAME: X  A001 V C " + event + "\n",
        "\xc2\xa0" + first + "\n",
        "O" + first + "\n",
        first + "\n002  A001 V C " + event + "\r003  A001 V C " + event + "\n",
    };

    for (const std::string& edl : edls) {
        const std::wstring text = textOf(edl);
        EXPECT_TRUE(text.starts_with(L"<Line> ")) << edl;
        EXPECT_NE(text.find(L" <", 1), std::wstring::npos) << testing::PrintToString(text) << edl;
    }
}

} // namespace
} // namespace cadrel::tests
