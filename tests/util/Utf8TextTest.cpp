// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/Utf8Text.h"

#include <gtest/gtest.h>

#include <string>

using cadrel::util::firstUtf8Character;
using cadrel::util::toShownLine;

TEST(Utf8Text, GivesTheFirstCharacterAndItsBytes)
{
    EXPECT_EQ(firstUtf8Character("a€").bytes, 1U);
    EXPECT_EQ(firstUtf8Character("a€").value, U'a');
    EXPECT_EQ(firstUtf8Character("é").bytes, 2U);
    EXPECT_EQ(firstUtf8Character("€uro").bytes, 3U);
    EXPECT_EQ(firstUtf8Character("€uro").value, U'\u20ac');
    EXPECT_EQ(firstUtf8Character("\xf0\x9f\x8e\xac!").bytes, 4U);
    EXPECT_EQ(firstUtf8Character("\xf0\x9f\x8e\xac!").value, U'\U0001f3ac');
}

TEST(Utf8Text, KnowsBytesThatAreNoCharacter)
{
    // A byte that goes on, a character that breaks off, one that is longer than it has to be, half of a UTF-16 pair, and
    // one past the last.
    for (const char* const text : {"\x80", "\xe2\x82", "\xc0\xaf", "\xed\xa0\x80", "\xf4\x90\x80\x80", "\xff"})
        EXPECT_EQ(firstUtf8Character(text).bytes, 0U) << text;
}

TEST(Utf8Text, ShowsWellFormedTextAsItIs)
{
    EXPECT_EQ(toShownLine(""), L"");
    EXPECT_EQ(toShownLine("42A-3 Maren"), L"42A-3 Maren");
    EXPECT_EQ(toShownLine("Küste €"), L"K\u00fcste \u20ac");
    EXPECT_EQ(toShownLine("\xf0\x9f\x8e\xac"), L"\U0001f3ac");
}

TEST(Utf8Text, ShowsAReplacementForEachByteThatIsNoCharacter)
{
    EXPECT_EQ(toShownLine("K\xfcste"), L"K\ufffdste");
    EXPECT_EQ(toShownLine("a\xe2\x82"), L"a\ufffd\ufffd");
}

TEST(Utf8Text, ShowsAReplacementForWhatIsInvisible)
{
    EXPECT_EQ(toShownLine("two\nlines"), L"two\ufffdlines");
    EXPECT_EQ(toShownLine("\t"), L"\ufffd");
    EXPECT_EQ(toShownLine(std::string("a\0b", 3)), L"a\ufffd"
                                                   L"b");
    // It would turn the writing direction.
    EXPECT_EQ(toShownLine("\u202egpj"), L"\ufffdgpj");
}
