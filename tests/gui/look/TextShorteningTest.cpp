// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/TextShortening.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <string>

using cadrel::gui::TextShortening;

namespace {

/// Letters of 6 pixels, digits of 5, blanks of none.
double width(const std::wstring& text)
{
    double sum = 0.0;
    for (const wchar_t letter : text)
        sum += letter == L' ' ? 0.0 : letter >= L'0' && letter <= L'9' ? 5.0 : 6.0;
    return sum;
}

std::wstring cut(const std::wstring& text, double boxWidth)
{
    return TextShortening::cut(text, boxWidth, width);
}

/// The rule itself, letter by letter.
std::wstring cutOneByOne(std::wstring text, double boxWidth)
{
    if (text.empty() || width(text) <= boxWidth)
        return text;
    while (!text.empty() && width(text) > boxWidth - 10.0)
        text.pop_back();
    return text + L"...";
}

} // namespace

TEST(TextShortening, LeavesATextThatFitsAsItIs)
{
    EXPECT_EQ(cut(L"Harbour", 42.0), L"Harbour");
    EXPECT_EQ(cut(L"Harbour", 100.0), L"Harbour");
    EXPECT_EQ(cut(L"", 5.0), L"");
    EXPECT_EQ(cut(L"", -5.0), L"");
}

TEST(TextShortening, CutsATextThatIsATouchTooWide)
{
    // 41.5 less 10 holds five letters of 6.
    EXPECT_EQ(cut(L"Harbour", 41.5), L"Harbo...");
}

TEST(TextShortening, FillsTheBoxLessTenPixels)
{
    EXPECT_EQ(cut(L"Harbour", 40.0), L"Harbo...");
    EXPECT_EQ(cut(L"Harbour", 39.9), L"Harb...");
    EXPECT_EQ(cut(L"Harbour", 16.0), L"H...");
}

TEST(TextShortening, LeavesTheDotsAloneInABoxOfTenPixelsOrLess)
{
    EXPECT_EQ(cut(L"Harbour", 15.9), L"...");
    EXPECT_EQ(cut(L"Harbour", 11.0), L"...");
    EXPECT_EQ(cut(L"Harbour", 10.0), L"...");
    EXPECT_EQ(cut(L"Harbour", 9.0), L"...");
    EXPECT_EQ(cut(L"Harbour", 0.0), L"...");
    EXPECT_EQ(cut(L"Harbour", -1.0), L"...");
}

TEST(TextShortening, LeavesATextOfSeveralLinesAsItIs)
{
    EXPECT_EQ(cut(L"Harbour\nReeds", 30.0), L"Harbour\nReeds");
    EXPECT_EQ(cut(L"Harbour\r\nReeds", 30.0), L"Harbour\r\nReeds");
}

TEST(TextShortening, MeasuresALongTextAFewTimes)
{
    int measured = 0;
    const auto counting = [&measured](const std::wstring& text) {
        ++measured;
        return width(text);
    };

    const std::wstring result = TextShortening::cut(std::wstring(1800, L'x'), 70.0, counting);

    EXPECT_EQ(result, L"xxxxxxxxxx...");
    EXPECT_LE(measured, 12);
}

RC_GTEST_PROP(TextShorteningLaws, CutsAsDroppingLetterAfterLetterDoes, ())
{
    const auto text = *rc::gen::container<std::wstring>(rc::gen::elementOf(std::wstring(L"ab 01")));
    const auto boxWidth = *rc::gen::inRange(-10, 120);

    RC_ASSERT(cut(text, boxWidth) == cutOneByOne(text, boxWidth));
}

TEST(TextShortening, MeasuresATextThatItRemembersNoMore)
{
    TextShortening shortening;
    int measured = 0;
    const auto counting = [&measured](const std::wstring& text) {
        ++measured;
        return width(text);
    };
    EXPECT_EQ(shortening.cutOnce(L"Harbour", 40.0, L"plain", counting), L"Harbo...");
    measured = 0;

    EXPECT_EQ(shortening.cutOnce(L"Harbour", 40.0, L"plain", counting), L"Harbo...");
    EXPECT_EQ(measured, 0);
}

TEST(TextShortening, KeepsBoxesAndFontsApart)
{
    TextShortening shortening;
    const auto wide = [](const std::wstring& text) { return 2.0 * width(text); };

    EXPECT_EQ(shortening.cutOnce(L"Harbour", 40.0, L"plain", width), L"Harbo...");
    EXPECT_EQ(shortening.cutOnce(L"Harbour", 22.0, L"plain", width), L"Ha...");
    EXPECT_EQ(shortening.cutOnce(L"Harbour", 40.0, L"bold", wide), L"Ha...");
    EXPECT_EQ(shortening.cutOnce(L"Harbour", 40.0, L"plain", width), L"Harbo...");
}

TEST(TextShortening, RemembersABoundedNumberOfTexts)
{
    TextShortening shortening;
    for (std::size_t i = 0; i < TextShortening::Capacity + 1; ++i)
        shortening.cutOnce(std::to_wstring(i), 100.0, L"plain", width);

    EXPECT_EQ(shortening.size(), 1U);
    EXPECT_EQ(shortening.cutOnce(L"7", 100.0, L"plain", width), L"7");
}

TEST(TextShortening, RemembersNoMoreOfALongTextThanItsBeginning)
{
    TextShortening shortening;
    std::size_t longest = 0;
    const auto noting = [&longest](const std::wstring& text) {
        longest = std::max(longest, text.size());
        return width(text);
    };
    const std::wstring beginning(TextShortening::LongestRemembered, L'x');

    EXPECT_EQ(shortening.cutOnce(beginning + L'y', 40.0, L"plain", noting), L"xxxxx...");
    EXPECT_EQ(shortening.cutOnce(beginning + std::wstring(100000, L'z'), 40.0, L"plain", noting), L"xxxxx...");

    EXPECT_EQ(longest, beginning.size());
    EXPECT_EQ(shortening.size(), 1U);
}

TEST(TextShortening, ShowsALongTextWholeWhereTheBoxHasRoomForIt)
{
    TextShortening shortening;
    const std::wstring text(TextShortening::LongestRemembered + 10, L'x');
    const std::wstring more = text + L'y';
    const double boxWidth = width(text);

    EXPECT_EQ(shortening.cutOnce(text, boxWidth, L"plain", width), text);
    EXPECT_EQ(shortening.cutOnce(more, boxWidth, L"plain", width), TextShortening::cut(more, boxWidth, width));
    EXPECT_EQ(shortening.size(), 1U);
}

TEST(TextShortening, LeavesALongTextOfSeveralLinesAsItIs)
{
    TextShortening shortening;
    const std::wstring text = std::wstring(TextShortening::LongestRemembered, L'x') + L"\ny";

    EXPECT_EQ(shortening.cutOnce(text, 40.0, L"plain", width), text);
}

RC_GTEST_PROP(TextShorteningLaws, CutsARememberedTextAsAnyOther, ())
{
    TextShortening shortening;
    const auto length =
        *rc::gen::inRange<std::size_t>(TextShortening::LongestRemembered - 3, TextShortening::LongestRemembered + 4);
    const std::wstring text(length, *rc::gen::elementOf(std::wstring(L"ab1")));
    const auto boxWidth = width(text) + *rc::gen::inRange(-40, 20);

    const std::wstring expected = TextShortening::cut(text, boxWidth, width);
    RC_ASSERT(shortening.cutOnce(text, boxWidth, L"plain", width) == expected);
    RC_ASSERT(shortening.cutOnce(text, boxWidth, L"plain", width) == expected);
}
