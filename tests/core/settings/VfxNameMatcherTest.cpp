// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/settings/VfxNameMatcher.h"

#include "tests/support/ThrownResult.h"
#include "util/Result.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <regex>

using cadrel::core::VfxNameMatcher;
using cadrel::core::VfxPatternEntry;
using cadrel::tests::thrownBy;
using cadrel::util::Result;

using Rows = std::vector<std::pair<std::string, std::string>>;

namespace {

VfxNameMatcher compiled(const Rows& rows)
{
    VfxNameMatcher matcher;
    matcher.compile(rows);
    return matcher;
}

/// The definition of the patterns: each row is a regular expression.
std::string stripByRegularExpressions(const Rows& rows, const std::string& name)
{
    const auto toExpression = [](const std::string& text) {
        const std::string dotsMeant = std::regex_replace(text, std::regex("\\."), "\\.");
        return std::regex_replace(dotsMeant, std::regex("\\*"), ".");
    };
    std::string stripped = name;
    for (const auto& [prefix, postfix] : rows) {
        const std::string expression = toExpression(prefix);
        const std::regex pattern("(" + expression + ")([0-9]*)(" + toExpression(postfix) + ")");
        std::smatch match;
        if (!std::regex_match(name, match, pattern) || match.length() == 0)
            continue;
        if (expression.size() < stripped.size()) {
            const std::size_t end = stripped.find_first_not_of("0123456789", expression.size());
            stripped.erase(expression.size(), std::min(end, stripped.size()) - expression.size());
        }
    }
    return stripped;
}

/// A text that a prefix or postfix stands for: each "*" is given a character.
rc::Gen<std::string> textOf(const std::string& rowText)
{
    return rc::gen::map(rc::gen::container<std::string>(rowText.size(), rc::gen::element('A', '1', '.', '\n', '\xC3')),
                        [rowText](std::string text) {
                            for (std::size_t index = 0; index < text.size(); ++index) {
                                if (rowText[index] != '*')
                                    text[index] = rowText[index];
                            }
                            return text;
                        });
}

template <typename... Characters>
rc::Gen<std::string> shortText(Characters... characters)
{
    return rc::gen::resize(3, rc::gen::container<std::string>(rc::gen::element(characters...)));
}

} // namespace

TEST(VfxNameMatcher, StripsTheDigitsBehindThePrefix)
{
    const VfxNameMatcher matcher = compiled({{"VFX_", ""}});

    EXPECT_EQ(matcher.stripVersion("VFX_0123"), "VFX_");
    EXPECT_TRUE(matcher.hasVersion("VFX_0123"));
}

TEST(VfxNameMatcher, LeavesANameWithLettersForDigits)
{
    const VfxNameMatcher matcher = compiled({{"VFX_", ""}});

    EXPECT_EQ(matcher.stripVersion("VFX_ABC"), "VFX_ABC");
    EXPECT_FALSE(matcher.hasVersion("VFX_ABC"));
}

TEST(VfxNameMatcher, FindsNoVersionWhereNoDigitStands)
{
    const VfxNameMatcher matcher = compiled({{"VFX_", ""}});

    EXPECT_EQ(matcher.stripVersion("VFX_"), "VFX_");
    EXPECT_FALSE(matcher.hasVersion("VFX_"));
}

TEST(VfxNameMatcher, MatchesTheWholeName)
{
    const VfxNameMatcher matcher = compiled({{"VFX_", "_A"}});

    EXPECT_TRUE(matcher.hasVersion("VFX_01_A"));
    EXPECT_FALSE(matcher.hasVersion("xVFX_01_A"));
    EXPECT_FALSE(matcher.hasVersion("VFX_01_Ax"));
    EXPECT_FALSE(matcher.hasVersion("VFX_01"));
    EXPECT_FALSE(matcher.hasVersion("01_A"));
    EXPECT_FALSE(matcher.hasVersion(""));
}

TEST(VfxNameMatcher, TellsCapitalsFromSmallLetters)
{
    EXPECT_FALSE(compiled({{"VFX_", ""}}).hasVersion("vfx_01"));
}

TEST(VfxNameMatcher, TakesAStarForOneCharacterOfAnyKind)
{
    const VfxNameMatcher matcher = compiled({{"A*", "_v"}});

    EXPECT_EQ(matcher.stripVersion("AB12_v"), "AB_v");
    EXPECT_EQ(matcher.stripVersion("A912_v"), "A9_v");
    EXPECT_EQ(matcher.stripVersion("A 12_v"), "A _v");
    EXPECT_EQ(matcher.stripVersion("A\xC3"
                                   "12_v"),
              "A\xC3_v");
}

TEST(VfxNameMatcher, TakesAStarForNeitherNoneNorTwoCharacters)
{
    const VfxNameMatcher matcher = compiled({{"A*", "_v"}});

    EXPECT_FALSE(matcher.hasVersion("A_v"));
    EXPECT_FALSE(matcher.hasVersion("ABC12_v"));
    // The one digit is the star's, and none is left for the version.
    EXPECT_FALSE(matcher.hasVersion("A1_v"));
}

TEST(VfxNameMatcher, TakesAStarForNoEndOfALine)
{
    const VfxNameMatcher matcher = compiled({{"A*", ""}});

    EXPECT_FALSE(matcher.hasVersion("A\n12"));
    EXPECT_FALSE(matcher.hasVersion("A\r12"));
    EXPECT_TRUE(matcher.hasVersion("A\v12"));
}

TEST(VfxNameMatcher, TakesADotForADot)
{
    const VfxNameMatcher matcher = compiled({{"", ".v"}});

    EXPECT_EQ(matcher.stripVersion("12.v"), ".v");
    EXPECT_FALSE(matcher.hasVersion("12xv"));
}

TEST(VfxNameMatcher, CountsEachDotOfThePrefixTwiceForTheDigitsPlace)
{
    // The compiled prefix is V\. with its 3 characters: the first digit of the version stays.
    const VfxNameMatcher matcher = compiled({{"V.", "_a"}});

    EXPECT_EQ(matcher.stripVersion("V.123_a"), "V.1_a");
    EXPECT_TRUE(matcher.hasVersion("V.12_a"));
    EXPECT_FALSE(matcher.hasVersion("V.1_a"));
}

TEST(VfxNameMatcher, ErasesNothingBehindTheEndOfTheName)
{
    // The compiled prefix V\.\. has 5 characters.
    const VfxNameMatcher matcher = compiled({{"V..", ""}});

    EXPECT_EQ(matcher.stripVersion("V..1"), "V..1");
    EXPECT_EQ(matcher.stripVersion("V..12"), "V..12");
    EXPECT_EQ(matcher.stripVersion("V..123"), "V..12");
}

TEST(VfxNameMatcher, TakesAllOtherCharactersAsThemselves)
{
    EXPECT_EQ(compiled({{"a-Z_", "-_"}}).stripVersion("a-Z_07-_"), "a-Z_-_");
    EXPECT_FALSE(compiled({{"a-Z_", ""}}).hasVersion("bZ_07"));
}

TEST(VfxNameMatcher, StripsDigitsInFrontOfAPostfixAlone)
{
    EXPECT_EQ(compiled({{"", "_v"}}).stripVersion("0012_v"), "_v");
}

TEST(VfxNameMatcher, KeepsTheDigitsOfThePrefix)
{
    EXPECT_EQ(compiled({{"S01", ""}}).stripVersion("S0123"), "S01");
}

TEST(VfxNameMatcher, ErasesTheWholeRunOfDigitsAlsoWhereThePostfixBeginsWithOne)
{
    EXPECT_EQ(compiled({{"A", "2K"}}).stripVersion("A0122K"), "AK");
    EXPECT_EQ(compiled({{"A", "2K"}}).stripVersion("A2K"), "AK");
}

TEST(VfxNameMatcher, AppliesSeveralRowsToOneResult)
{
    // The first row erases the 2 at place 2, the second what is then left of the digits at place 1.
    EXPECT_EQ(compiled({{"A*", ""}, {"A", ""}}).stripVersion("A12"), "A");
    // The other way round the first row erases both, and place 2 lies behind the end.
    EXPECT_EQ(compiled({{"A", ""}, {"A*", ""}}).stripVersion("A12"), "A");
}

TEST(VfxNameMatcher, MatchesEveryRowWithTheUnchangedName)
{
    // What the first row leaves, A_1, doesn't fit the second, which yet erases at place 2.
    EXPECT_EQ(compiled({{"A", "_1"}, {"A9", "_1"}}).stripVersion("A95_1"), "A_");
    // "12" fits the second row, what the first leaves of it doesn't.
    EXPECT_EQ(compiled({{"1", ""}, {"", "2"}}).stripVersion("12"), "");
}

TEST(VfxNameMatcher, HasNoVersionWithoutRows)
{
    EXPECT_EQ(compiled({}).stripVersion("VFX_01"), "VFX_01");
    EXPECT_FALSE(VfxNameMatcher().hasVersion("VFX_01"));
}

TEST(VfxNameMatcher, TakesANameOfAnyLength)
{
    const std::string digits(1'000'000, '7');

    EXPECT_EQ(compiled({{"VFX_", "_v"}}).stripVersion("VFX_" + digits + "_v"), "VFX__v");
}

TEST(VfxNameMatcher, RefusesARowOfTwoEmptyTexts)
{
    EXPECT_EQ(thrownBy([] { compiled({{"", ""}}); }), Result::InvalidArgument);
}

TEST(VfxNameMatcher, RefusesARowWithACharacterThatIsNotAllowed)
{
    EXPECT_EQ(thrownBy([] { compiled({{"A/B", ""}}); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([] { compiled({{"A", "/B"}}); }), Result::InvalidArgument);
}

TEST(VfxNameMatcher, AllowsLettersDigitsDotStarMinusAndUnderscore)
{
    const auto isAllowed = [](char character) {
        return (character >= 'A' && character <= 'Z') || (character >= 'a' && character <= 'z') ||
               (character >= '0' && character <= '9') || character == '.' || character == '*' || character == '-' ||
               character == '_';
    };
    for (int byte = 0; byte < 256; ++byte) {
        const auto character = static_cast<char>(byte);
        const Result::Type expected = isAllowed(character) ? Result::Ok : Result::InvalidArgument;

        EXPECT_EQ(thrownBy([&] { compiled({{std::string(1, character), ""}}); }), expected) << byte;
        EXPECT_EQ(thrownBy([&] { compiled({{"", std::string(1, character)}}); }), expected) << byte;
    }
}

TEST(VfxNameMatcher, KeepsTheRowsBeforeARefusedOne)
{
    VfxNameMatcher matcher;

    EXPECT_EQ(thrownBy([&] { matcher.compile({{"VFX_", ""}, {"A/B", ""}, {"CG_", ""}}); }), Result::InvalidArgument);
    EXPECT_TRUE(matcher.hasVersion("VFX_01"));
    EXPECT_FALSE(matcher.hasVersion("CG_01"));
}

TEST(VfxNameMatcher, ForgetsTheFormerRows)
{
    VfxNameMatcher matcher = compiled({{"VFX_", ""}});

    matcher.compile({{"CG_", ""}});

    EXPECT_FALSE(matcher.hasVersion("VFX_01"));
    EXPECT_TRUE(matcher.hasVersion("CG_01"));

    EXPECT_EQ(thrownBy([&] { matcher.compile({{"", ""}}); }), Result::InvalidArgument);
    EXPECT_FALSE(matcher.hasVersion("CG_01"));
}

TEST(VfxNameMatcher, CompilesTheEnabledRowsThatAreNotEmpty)
{
    VfxNameMatcher matcher;

    matcher.compileEnabled({VfxPatternEntry("VFX_", "", true), VfxPatternEntry("CG_", "", false),
                            VfxPatternEntry("", "", true), VfxPatternEntry("", "_v", true)});

    EXPECT_TRUE(matcher.hasVersion("VFX_01"));
    EXPECT_FALSE(matcher.hasVersion("CG_01"));
    EXPECT_TRUE(matcher.hasVersion("01_v"));
}

TEST(VfxNameMatcher, RefusesAnEnabledRowAsAnyOther)
{
    VfxNameMatcher matcher;

    EXPECT_EQ(thrownBy([&] { matcher.compileEnabled({VfxPatternEntry("A/B", "", false)}); }), Result::Ok);
    EXPECT_EQ(thrownBy([&] { matcher.compileEnabled({VfxPatternEntry("A/B", "", true)}); }), Result::InvalidArgument);
}

RC_GTEST_PROP(VfxNameMatcher, StripsWhatTheRegularExpressionsOfItsRowsStrip, ())
{
    const auto rowText = shortText('A', '.', '*', '1', '2', '_', '-');
    const auto row = rc::gen::suchThat(rc::gen::pair(rowText, rowText),
                                       [](const auto& texts) { return !texts.first.empty() || !texts.second.empty(); });
    const Rows rows = *rc::gen::nonEmpty(rc::gen::resize(3, rc::gen::container<Rows>(row)));
    const auto [prefix, postfix] = *rc::gen::elementOf(rows);
    const auto anyText = shortText('A', '.', '1', '\n', '\r', '_');
    const std::string name = *rc::gen::oneOf(textOf(prefix), anyText) + *shortText('1', '2', '9') +
                             *rc::gen::oneOf(textOf(postfix), anyText);

    const std::string expected = stripByRegularExpressions(rows, name);

    RC_CLASSIFY(expected != name, "has a version");
    RC_ASSERT(compiled(rows).stripVersion(name) == expected);
    RC_ASSERT(compiled(rows).hasVersion(name) == (expected != name));
}
