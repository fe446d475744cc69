// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/StringUtil.h"

#include "tests/support/TempFolder.h"
#include "tests/support/ThrownResult.h"
#include "util/Result.h"
#include "util/StringConverter.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <filesystem>

using cadrel::tests::TempFolder;
using cadrel::tests::thrownBy;
using cadrel::util::Result;
using cadrel::util::StringConverter;
using cadrel::util::StringUtil;

using Pieces = std::vector<std::string>;

namespace {

/// A converter whose translations can be told from the texts.
class ShoutingConverter : public StringConverter {
public:
    std::wstring translate(const std::wstring& text) const override { return text + L"!"; }
};

class StringUtilWithConverter : public testing::Test {
protected:
    StringUtilWithConverter() { StringUtil::setConverter(&m_converter); }
    ~StringUtilWithConverter() override { StringUtil::setConverter(nullptr); }

private:
    ShoutingConverter m_converter;
};

class StringUtilRemoveFile : public StringUtilWithConverter {
protected:
    TempFolder folder;
};

} // namespace

TEST(StringUtil, FailsWithoutAConverter)
{
    EXPECT_EQ(thrownBy([] { StringUtil::toUtf8(L"a"); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([] { StringUtil::toWide("a"); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([] { StringUtil::translate(L"a"); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([] { StringUtil::toPrintable(L"a"); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([] { StringUtil::removeFile(L"/no/such/file"); }), Result::NotAvailable);
}

TEST(StringUtil, ForgetsARemovedConverter)
{
    const ShoutingConverter converter;
    StringUtil::setConverter(&converter);
    StringUtil::setConverter(nullptr);

    EXPECT_EQ(thrownBy([] { StringUtil::toUtf8(L"a"); }), Result::NotAvailable);
}

TEST_F(StringUtilWithConverter, ForwardsToTheConverter)
{
    EXPECT_EQ(StringUtil::toUtf8(L"\u00E9"), "\xC3\xA9");
    EXPECT_EQ(StringUtil::toWide("\xC3\xA9"), L"\u00E9");
    EXPECT_EQ(StringUtil::translate(L"Cut"), L"Cut!");
}

TEST_F(StringUtilWithConverter, LetsTheConvertersFailurePass)
{
    EXPECT_EQ(thrownBy([] { StringUtil::toWide("\xFF"); }), Result::InvalidArgument);
}

TEST_F(StringUtilWithConverter, PrintsATabAsAQuestionMark)
{
    EXPECT_EQ(StringUtil::toPrintable(L"REEL\t3"), "REEL?3");
}

TEST_F(StringUtilWithConverter, PrintsOnlyTheCharactersFrom32To126)
{
    EXPECT_EQ(StringUtil::toPrintable(L" ~"), " ~");
    EXPECT_EQ(StringUtil::toPrintable(std::wstring{0, 1, 31, 127}), "????");
}

TEST_F(StringUtilWithConverter, PrintsAQuestionMarkForEachByteOfALongCharacter)
{
    EXPECT_EQ(StringUtil::toPrintable(L"a\u00E9b\u20ACc\U0001F3AC"), "a??b???c????");
}

TEST_F(StringUtilRemoveFile, DeletesTheFileOfAWideName)
{
    const std::filesystem::path file = folder.write("R\xC3\xB6lle 3.edl", "text");

    EXPECT_TRUE(StringUtil::removeFile(StringUtil::toWide(file.string())));
    EXPECT_FALSE(std::filesystem::exists(file));
}

TEST_F(StringUtilRemoveFile, IsFalseForAFileThatIsNotThere)
{
    EXPECT_FALSE(StringUtil::removeFile((folder / "none.edl").wstring()));
    EXPECT_FALSE(StringUtil::removeFile(L""));
}

TEST_F(StringUtilRemoveFile, LeavesAFolderAlone)
{
    EXPECT_FALSE(StringUtil::removeFile(folder.path().wstring()));
    EXPECT_TRUE(std::filesystem::exists(folder.path()));
}

TEST_F(StringUtilRemoveFile, LeavesTheFileAloneWhoseNameEndsAtAZeroInTheGivenOne)
{
    const std::filesystem::path file = folder.write("reel.edl", "text");

    EXPECT_FALSE(StringUtil::removeFile(file.wstring() + std::wstring(1, L'\0') + L".bak"));
    EXPECT_TRUE(std::filesystem::exists(file));
}

TEST(StringUtil, MakesCapitalsOfAsciiLettersOnly)
{
    EXPECT_EQ(StringUtil::toUpperAscii("azAZ09`{@[ \xC3\xA9"), "AZAZ09`{@[ \xC3\xA9");
    EXPECT_EQ(StringUtil::toUpperAscii(""), "");
}

TEST(StringUtil, TrimsBlanksLineFeedsTabsAndCarriageReturns)
{
    EXPECT_EQ(StringUtil::trim(" \n\t\rcut \t to\r\n"), "cut \t to");
    EXPECT_EQ(StringUtil::trim("cut"), "cut");
}

TEST(StringUtil, TrimsNothingElse)
{
    EXPECT_EQ(StringUtil::trim("\vcut\f"), "\vcut\f");
    EXPECT_EQ(StringUtil::trim("\xC2\xA0 "), "\xC2\xA0");
}

TEST(StringUtil, TrimsAnAllBlankTextToNothing)
{
    EXPECT_EQ(StringUtil::trim("   "), "");
    EXPECT_EQ(StringUtil::trim(" \n\t\r"), "");
    EXPECT_EQ(StringUtil::trim(""), "");
}

TEST(StringUtil, TrimsAViewWithoutACopy)
{
    const std::string text = "  cut ";

    const std::string_view trimmed = StringUtil::trimView(text);

    EXPECT_EQ(trimmed, "cut");
    EXPECT_EQ(trimmed.data(), text.data() + 2);
}

RC_GTEST_PROP(StringUtil, TrimsATrimmedTextNoFurther, ())
{
    const auto text = *rc::gen::container<std::string>(rc::gen::element(' ', '\n', '\t', '\r', 'a', 'b'));

    const std::string trimmed = StringUtil::trim(text);

    RC_ASSERT(StringUtil::trim(trimmed) == trimmed);
}

TEST(StringUtil, SplitsWithTheEmptyPieces)
{
    EXPECT_EQ(StringUtil::split("a::b", ':', false), (Pieces{"a", "", "b"}));
    EXPECT_EQ(StringUtil::split(":a", ':', false), (Pieces{"", "a"}));
}

TEST(StringUtil, SplitsWithoutTheEmptyPieces)
{
    EXPECT_EQ(StringUtil::split("a::b", ':', true), (Pieces{"a", "b"}));
    EXPECT_EQ(StringUtil::split("::", ':', true), Pieces());
}

TEST(StringUtil, SplitsOffNoEmptyPieceAtTheEnd)
{
    EXPECT_EQ(StringUtil::split("a:b:", ':', false), (Pieces{"a", "b"}));
    EXPECT_EQ(StringUtil::split("a::", ':', false), (Pieces{"a", ""}));
    EXPECT_EQ(StringUtil::split("", ':', false), Pieces());
}

TEST(StringUtil, SplitsIntoTrimmedPieces)
{
    EXPECT_EQ(StringUtil::split(" a b : c\t", ':', false), (Pieces{"a b", "c"}));
}

TEST(StringUtil, KeepsAPieceThatIsEmptyOnlyWhenTrimmed)
{
    EXPECT_EQ(StringUtil::split("a: :b: ", ':', true), (Pieces{"a", "", "b", ""}));
}

TEST(StringUtil, TakesTheSlashForTheSeparatorUnlessThereIsABackslash)
{
    EXPECT_EQ(StringUtil::separatorOf(L"/x/edl.txt"), L'/');
    EXPECT_EQ(StringUtil::separatorOf(L"edl.txt"), L'/');
    EXPECT_EQ(StringUtil::separatorOf(L"C:\\x\\edl.txt"), L'\\');
    EXPECT_EQ(StringUtil::separatorOf(L"/x\\y/edl.txt"), L'\\');
}

TEST(StringUtil, CutsAPathIntoFolderAndFileName)
{
    EXPECT_EQ(StringUtil::directoryOf(L"/x/y/edl.txt"), L"/x/y/");
    EXPECT_EQ(StringUtil::fileNameOf(L"/x/y/edl.txt"), L"edl.txt");
    EXPECT_EQ(StringUtil::directoryOf(L"C:\\x\\edl.txt"), L"C:\\x\\");
    EXPECT_EQ(StringUtil::fileNameOf(L"C:\\x\\edl.txt"), L"edl.txt");
}

TEST(StringUtil, FindsNoFolderInABareFileName)
{
    EXPECT_EQ(StringUtil::directoryOf(L"edl.txt"), L"");
    EXPECT_EQ(StringUtil::fileNameOf(L"edl.txt"), L"edl.txt");
}

TEST(StringUtil, FindsNoFileNameInAFolder)
{
    EXPECT_EQ(StringUtil::directoryOf(L"/x/"), L"/x/");
    EXPECT_EQ(StringUtil::fileNameOf(L"/x/"), L"");
}

TEST(StringUtil, CountsASlashAsPartOfTheNameInABackslashPath)
{
    EXPECT_EQ(StringUtil::directoryOf(L"C:\\x\\y/edl.txt"), L"C:\\x\\");
    EXPECT_EQ(StringUtil::fileNameOf(L"C:\\x\\y/edl.txt"), L"y/edl.txt");
}

TEST(StringUtil, CutsAFileNameAtItsLastDot)
{
    EXPECT_EQ(StringUtil::baseNameOf(L"/x/reel.3.edl"), L"reel.3");
    EXPECT_EQ(StringUtil::extensionOf(L"/x/reel.3.edl"), L"edl");
    EXPECT_EQ(StringUtil::baseNameOf(L"/x/.edl"), L"");
    EXPECT_EQ(StringUtil::extensionOf(L"/x/.edl"), L"edl");
    EXPECT_EQ(StringUtil::baseNameOf(L"/x/reel."), L"reel");
    EXPECT_EQ(StringUtil::extensionOf(L"/x/reel."), L"");
}

TEST(StringUtil, FindsNoExtensionInTheDotOfAFolder)
{
    EXPECT_EQ(StringUtil::baseNameOf(L"/x.y/reel"), L"reel");
    EXPECT_EQ(StringUtil::extensionOf(L"/x.y/reel"), L"");
}

TEST(StringUtil, PutsAnIndexBeforeTheExtension)
{
    EXPECT_EQ(StringUtil::withIndex(L"/x/edl.txt", 2), L"/x/edl_2.txt");
    EXPECT_EQ(StringUtil::withIndex(L"C:\\x\\reel.3.edl", 10), L"C:\\x\\reel.3_10.edl");
    EXPECT_EQ(StringUtil::withIndex(L"edl.txt", 1), L"edl_1.txt");
}

TEST(StringUtil, PutsTheDotAlsoBehindTheIndexOfANameWithoutOne)
{
    EXPECT_EQ(StringUtil::withIndex(L"/x.y/edl", 1), L"/x.y/edl_1.");
}
