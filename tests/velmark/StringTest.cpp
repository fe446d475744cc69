// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/String.h"
#include "velmark/Counted.h"
#include "velmark/StringObject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cstdint>
#include <string>
#include <vector>

using namespace Velmark;

TEST(String, KeepsAnEightBitTextAndHasItInSixteenBits)
{
    // U+00E9 is C3 A9 in UTF-8.
    const ConstString text("Prise \xC3\xA9");

    EXPECT_FALSE(text.is16());
    EXPECT_EQ(text.length(), 8);
    EXPECT_STREQ(text.text8(), "Prise \xC3\xA9");
    EXPECT_EQ(std::u16string(text.text16()), u"Prise \u00E9");
}

TEST(String, KeepsASixteenBitTextAndHasItInEightBits)
{
    // U+1F3AC is the pair D83C DFAC, and F0 9F 8E AC in UTF-8.
    const ConstString text(u"a\U0001F3AC");

    EXPECT_TRUE(text.is16());
    EXPECT_EQ(text.length(), 3);
    EXPECT_EQ(std::u16string(text.text16()), (std::u16string{u'a', 0xD83C, 0xDFAC}));
    EXPECT_STREQ(text.text8(), "a\xF0\x9F\x8E\xAC");
}

TEST(String, OfNullIsEmpty)
{
    for (const ConstString& text : {ConstString(), ConstString(static_cast<const char*>(nullptr)),
                                    ConstString(static_cast<const char16_t*>(nullptr)), ConstString("")}) {
        EXPECT_TRUE(text.isEmpty());
        EXPECT_EQ(text.length(), 0);
        EXPECT_STREQ(text.text8(), "");
        EXPECT_EQ(std::u16string(text.text16()), u"");
    }
}

TEST(String, ShowsThatATextCannotBeConverted)
{
    const ConstString broken8("cut \xC3");
    EXPECT_STREQ(broken8.text8(), "cut \xC3");
    EXPECT_EQ(std::u16string(broken8.text16()), u"<StrErr_2>");

    const char16_t halfAPair[] = {u'a', 0xD83C, 0};
    const ConstString broken16(halfAPair);
    EXPECT_EQ(std::u16string(broken16.text16()), halfAPair);
    EXPECT_STREQ(broken16.text8(), "<StrErr_4>");

    EXPECT_EQ(std::u16string(ConstString("\xEF\xBB\xBF").text16()), u"<StrErr_1>");
    EXPECT_STREQ(ConstString(u"\uFEFF").text8(), "<StrErr_3>");
}

TEST(String, TellsTextsApartThatCannotBeConverted)
{
    const char16_t halfAPair[] = {u'a', 0xD83C, 0};
    const char16_t anotherHalf[] = {u'b', 0xD83C, 0};

    EXPECT_FALSE(ConstString(halfAPair) == ConstString(anotherHalf));
    EXPECT_TRUE(ConstString(halfAPair) == ConstString(halfAPair));
}

TEST(String, ComparesByCharactersWhateverTheWidths)
{
    EXPECT_EQ(ConstString("\xC3\xA9"), ConstString(u"\u00E9"));
    EXPECT_FALSE(ConstString("e") == ConstString(u"\u00E9"));
    EXPECT_LT(ConstString("Reel 1").compare(u"Reel 2"), 0);
    EXPECT_GT(ConstString(u"Reel 2").compare("Reel 1"), 0);
    EXPECT_LT(ConstString("Reel").compare("Reel 1"), 0);
    // As units of UTF-16 they would stand the other way round: FF5E against the pair that begins with D83C.
    EXPECT_LT(ConstString(u"\uFF5E").compare(u"\U0001F3AC"), 0);
}

TEST(String, AppendsInItsOwnWidth)
{
    String narrow("cut ");
    narrow.append(u"\u00E9").append("!");
    EXPECT_FALSE(narrow.is16());
    EXPECT_STREQ(narrow.text8(), "cut \xC3\xA9!");
    EXPECT_EQ(std::u16string(narrow.text16()), u"cut \u00E9!");

    String wide(u"cut ");
    wide.append("\xC3\xA9");
    EXPECT_TRUE(wide.is16());
    EXPECT_EQ(std::u16string(wide.text16()), u"cut \u00E9");
    EXPECT_STREQ(wide.text8(), "cut \xC3\xA9");
}

TEST(String, AppendsItself)
{
    String text("ab");

    text.append(text);

    EXPECT_STREQ(text.text8(), "abab");
}

TEST(String, TakesOverWhatIsAssigned)
{
    String text("old");

    text = u"new";
    EXPECT_TRUE(text.is16());
    EXPECT_STREQ(text.text8(), "new");
    text = ConstString("newer");
    EXPECT_FALSE(text.is16());
    EXPECT_EQ(std::u16string(text.text16()), u"newer");
}

TEST(String, ChangesItsWidthAndKeepsItsText)
{
    String text("\xC3\xA9");

    text.to16();
    EXPECT_TRUE(text.is16());
    EXPECT_EQ(text.length(), 1);
    EXPECT_EQ(std::u16string(text.text16()), u"\u00E9");
    text.to8();
    EXPECT_FALSE(text.is16());
    EXPECT_EQ(text.length(), 2);
    EXPECT_STREQ(text.text8(), "\xC3\xA9");
}

TEST(String, ReadsWholeNumbersOnly)
{
    int64 integer = 5;
    EXPECT_TRUE(ConstString("-9223372036854775808").readInteger(integer));
    EXPECT_EQ(integer, INT64_MIN);
    EXPECT_TRUE(ConstString(u"24").readInteger(integer));
    for (const char* text : {"", "24 ", " 24", "24.5", "9223372036854775808", "x"})
        EXPECT_FALSE(ConstString(text).readInteger(integer)) << text;
    EXPECT_EQ(integer, 24);

    double number = 5.0;
    EXPECT_TRUE(ConstString(u"23.976").readNumber(number));
    EXPECT_EQ(number, 23.976);
    EXPECT_TRUE(ConstString("-1e3").readNumber(number));
    for (const char* text : {"", "24 fps", " 24", "1e999", "x"})
        EXPECT_FALSE(ConstString(text).readNumber(number)) << text;
    EXPECT_EQ(number, -1000.0);
}

RC_GTEST_PROP(String, GoesToTheOtherWidthAndBack, ())
{
    // Any characters but the byte order mark, which isn't kept in front, and halves of pairs.
    std::u16string characters;
    for (const uint32 drawn : *rc::gen::container<std::vector<uint32>>(rc::gen::inRange(1U, 0x110000U))) {
        if (drawn == 0xFEFF || (drawn >= 0xD800 && drawn <= 0xDFFF))
            continue;
        if (drawn < 0x10000) {
            characters += static_cast<char16_t>(drawn);
            continue;
        }
        characters += static_cast<char16_t>(0xD800 + ((drawn - 0x10000) >> 10U));
        characters += static_cast<char16_t>(0xDC00 + ((drawn - 0x10000) & 0x3FFU));
    }
    const ConstString wide(characters.c_str());

    const ConstString narrow(wide.text8());

    RC_ASSERT(std::u16string(narrow.text16()) == characters);
    RC_ASSERT(narrow == wide);
}

TEST(StringObject, ExposesItsTextThroughBothInterfaces)
{
    const auto object = makeCounted<StringObject>(u"Memo \u00E9");

    const auto text = query<IString>(object);
    const auto result = query<IStringResult>(object);
    ASSERT_TRUE(text);
    ASSERT_TRUE(result);
    EXPECT_EQ(std::u16string(text->text16()), u"Memo \u00E9");
    EXPECT_STREQ(text->text8(), "Memo \xC3\xA9");
    EXPECT_EQ(object->refCount(), 3);

    EXPECT_EQ(result->setText8("one"), 0);
    EXPECT_EQ(std::u16string(text->text16()), u"one");
    EXPECT_EQ(result->setText16(u"two"), 0);
    EXPECT_STREQ(text->text8(), "two");
    EXPECT_EQ(result->setText16(nullptr), 0);
    EXPECT_STREQ(text->text8(), "");
    EXPECT_EQ(object->length(), 0);
}

TEST(StringObject, IsAnFObject)
{
    const auto object = makeCounted<StringObject>();

    EXPECT_STREQ(object->classNameOf(), "StringObject");
    EXPECT_TRUE(object->isA("FObject", true));
    EXPECT_TRUE(query<FObject>(object));
}
