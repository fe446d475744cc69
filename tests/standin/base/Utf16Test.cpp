// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/base/Utf16.h"

#include <gtest/gtest.h>

#include <string>

namespace standin::tests {

namespace {

TEST(Utf16, ConvertsTheFirstAndTheLastCharacterOfEachLength)
{
    const struct {
        std::u16string utf16;
        std::string utf8;
    } texts[] = {
        {std::u16string(1, u'\0'), std::string(1, '\0')},
        {u"\u007f", "\x7f"},
        {u"\u0080", "\xc2\x80"},
        {u"\u07ff", "\xdf\xbf"},
        {u"\u0800", "\xe0\xa0\x80"},
        {u"\ud7ff", "\xed\x9f\xbf"},
        {u"\ue000", "\xee\x80\x80"},
        {u"\uffff", "\xef\xbf\xbf"},
        {u"\U00010000", "\xf0\x90\x80\x80"},
        {u"\U0010ffff", "\xf4\x8f\xbf\xbf"},
    };
    for (const auto& text : texts) {
        EXPECT_EQ(toUtf8(text.utf16), text.utf8);
        EXPECT_TRUE(toUtf16(text.utf8) == text.utf16) << text.utf8;
    }
}

TEST(Utf16, ConvertsWholeTexts)
{
    EXPECT_EQ(toUtf8(u"T\u00f6ne \u58f0 \U0001f3ac!"), "T\xc3\xb6ne \xe5\xa3\xb0 \xf0\x9f\x8e\xac!");
    EXPECT_TRUE(toUtf16("T\xc3\xb6ne \xe5\xa3\xb0 \xf0\x9f\x8e\xac!") == u"T\u00f6ne \u58f0 \U0001f3ac!");
    EXPECT_EQ(toUtf8(u""), "");
    EXPECT_TRUE(toUtf16("").empty());
}

TEST(Utf16, KeepsAByteOrderMark)
{
    EXPECT_EQ(toUtf8(u"\ufeffx"), "\xef\xbb\xbfx");
    EXPECT_TRUE(toUtf16("\xef\xbb\xbfx") == u"\ufeffx");
}

} // namespace

} // namespace standin::tests
