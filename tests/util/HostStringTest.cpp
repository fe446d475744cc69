// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/HostString.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <string>
#include <vector>

using cadrel::util::HostString;

namespace {

std::u16string madeFrom(const std::wstring& wide)
{
    const HostString text(wide);
    return std::u16string(text.utf16(), text.length());
}

std::wstring madeFrom(const std::u16string& utf16)
{
    const HostString text(utf16);
    return std::wstring(text.wide(), text.length());
}

} // namespace

TEST(HostString, MakesUtf16OfAWideText)
{
    const HostString text(std::wstring(L"Cut \u00E9\u20AC"));

    EXPECT_EQ(text.length(), 6U);
    EXPECT_EQ(text.utf16(), std::u16string(u"Cut \u00E9\u20AC"));
    EXPECT_EQ(text.wide(), std::wstring(L"Cut \u00E9\u20AC"));
}

TEST(HostString, MakesAWideTextOfUtf16)
{
    const HostString text(std::u16string(u"Cut \u00E9\u20AC"));

    EXPECT_EQ(text.length(), 6U);
    EXPECT_EQ(text.wide(), std::wstring(L"Cut \u00E9\u20AC"));
    EXPECT_EQ(text.utf16(), std::u16string(u"Cut \u00E9\u20AC"));
}

TEST(HostString, WritesCharactersBeyondSixteenBitsAsPairs)
{
    // 0x1F3AC - 0x10000 = 0xF3AC: its upper ten bits are 0x3C, its lower ten 0x3AC.
    EXPECT_EQ(madeFrom(std::wstring{0x1F3AC}), (std::u16string{0xD83C, 0xDFAC}));
    EXPECT_EQ(madeFrom(std::wstring{0xFFFF}), (std::u16string{0xFFFF}));
    EXPECT_EQ(madeFrom(std::wstring{0x10000}), (std::u16string{0xD800, 0xDC00}));
    EXPECT_EQ(madeFrom(std::wstring{0x10FFFF}), (std::u16string{0xDBFF, 0xDFFF}));
}

TEST(HostString, ReadsPairsAsOneCharacter)
{
    EXPECT_EQ(madeFrom(std::u16string{0xD83C, 0xDFAC, 'a'}), (std::wstring{0x1F3AC, L'a'}));
    EXPECT_EQ(madeFrom(std::u16string{0xD800, 0xDC00}), (std::wstring{0x10000}));
    EXPECT_EQ(madeFrom(std::u16string{0xDBFF, 0xDFFF}), (std::wstring{0x10FFFF}));
    EXPECT_EQ(madeFrom(std::u16string{0xD7FF, 0xE000}), (std::wstring{0xD7FF, 0xE000}));
}

TEST(HostString, CountsTheUnitsOfTheFormThatItMade)
{
    EXPECT_EQ(HostString(std::wstring{0x1F3AC}).length(), 2U);
    EXPECT_EQ(HostString(std::u16string{0xD83C, 0xDFAC}).length(), 1U);
}

TEST(HostString, EndsBothFormsWithAZeroUnit)
{
    const HostString fromWide(std::wstring(L"ab"));
    const HostString fromUtf16(std::u16string(u"ab"));

    EXPECT_EQ(fromWide.utf16()[2], u'\0');
    EXPECT_EQ(fromWide.wide()[2], L'\0');
    EXPECT_EQ(fromUtf16.utf16()[2], u'\0');
    EXPECT_EQ(fromUtf16.wide()[2], L'\0');
}

TEST(HostString, IsEmptyInBothFormsForAnEmptyText)
{
    const HostString fromWide{std::wstring()};
    const HostString fromUtf16{std::u16string()};

    for (const HostString& text : {fromWide, fromUtf16}) {
        EXPECT_EQ(text.length(), 0U);
        EXPECT_EQ(text.utf16()[0], u'\0');
        EXPECT_EQ(text.wide()[0], L'\0');
    }
}

TEST(HostString, ShowsThatNothingIsLeftOfAWideText)
{
    const HostString text(std::wstring{0xFEFF});

    EXPECT_EQ(text.utf16(), std::u16string(u"<StrErr_1>"));
    EXPECT_EQ(text.length(), 10U);
    EXPECT_EQ(text.wide(), (std::wstring{0xFEFF}));
}

TEST(HostString, ShowsThatAWideTextIsIllFormed)
{
    for (const std::uint32_t unit : {0xD800U, 0xDBFFU, 0xDC00U, 0xDFFFU, 0x110000U, 0xFFFFFFFFU}) {
        const HostString text(std::wstring{L'a', static_cast<wchar_t>(unit)});

        EXPECT_EQ(text.utf16(), std::u16string(u"<StrErr_2>")) << std::hex << unit;
        EXPECT_EQ(text.length(), 10U);
    }
}

TEST(HostString, ShowsThatNothingIsLeftOfUtf16)
{
    const HostString text(std::u16string{0xFEFF});

    EXPECT_EQ(text.wide(), std::wstring(L"<StrErr_3>"));
    EXPECT_EQ(text.length(), 10U);
    EXPECT_EQ(text.utf16(), (std::u16string{0xFEFF}));
}

TEST(HostString, ShowsThatUtf16IsIllFormed)
{
    const std::vector<std::u16string> illFormed = {
        {0xD83C},         // half a pair at the end
        {0xD83C, 'a'},    // half a pair before a character
        {0xD83C, 0xD83C}, // two first halves
        {0xDFAC},         // a second half alone
        {0xDFAC, 0xD83C}, // the wrong way round
        {'a', 0xDC00},
    };
    for (const std::u16string& utf16 : illFormed) {
        const HostString text(utf16);

        EXPECT_EQ(text.wide(), std::wstring(L"<StrErr_4>"));
        EXPECT_EQ(text.length(), 10U);
    }
}

TEST(HostString, DropsAByteOrderMarkAtTheFrontOnly)
{
    EXPECT_EQ(madeFrom(std::wstring{0xFEFF, L'a', 0xFEFF}), (std::u16string{u'a', 0xFEFF}));
    EXPECT_EQ(madeFrom(std::u16string{0xFEFF, u'a', 0xFEFF}), (std::wstring{L'a', 0xFEFF}));
    EXPECT_EQ(madeFrom(std::wstring{0xFEFF, 0xFEFF}), (std::u16string{0xFEFF}));
}

RC_GTEST_PROP(HostString, BringsEveryTextBack, ())
{
    const auto character =
        rc::gen::oneOf(rc::gen::inRange<wchar_t>(1, 0xD800), rc::gen::inRange<wchar_t>(0xE000, 0xFEFF),
                       rc::gen::inRange<wchar_t>(0xFF00, 0x110000));
    const auto text = *rc::gen::container<std::wstring>(character);

    RC_ASSERT(madeFrom(madeFrom(text)) == text);
}
