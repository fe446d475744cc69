// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/StringConverter.h"

#include "tests/support/PlainConverter.h"
#include "tests/support/ThrownResult.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <utility>
#include <vector>

using cadrel::tests::PlainConverter;
using cadrel::tests::thrownBy;
using cadrel::util::Result;

namespace {

/// The first and the last character of each length in UTF-8, and those on both sides of the surrogates.
const std::vector<std::pair<wchar_t, std::string>> Boundaries = {
    {0x01, "\x01"},
    {0x7F, "\x7F"},
    {0x80, "\xC2\x80"},
    {0x7FF, "\xDF\xBF"},
    {0x800, "\xE0\xA0\x80"},
    {0xD7FF, "\xED\x9F\xBF"},
    {0xE000, "\xEE\x80\x80"},
    {0xFFFF, "\xEF\xBF\xBF"},
    {0x10000, "\xF0\x90\x80\x80"},
    {0x10FFFF, "\xF4\x8F\xBF\xBF"},
};

} // namespace

TEST(StringConverter, EncodesEveryLengthOfUtf8)
{
    for (const auto& [character, bytes] : Boundaries)
        EXPECT_EQ(PlainConverter().toUtf8(std::wstring(1, character)), bytes) << std::hex << +character;
}

TEST(StringConverter, DecodesEveryLengthOfUtf8)
{
    for (const auto& [character, bytes] : Boundaries)
        EXPECT_EQ(PlainConverter().toWide(bytes), std::wstring(1, character)) << std::hex << +character;
}

TEST(StringConverter, ConvertsMixedText)
{
    const std::wstring wide = L"R\u00F6lle \u20AC \U0001F3AC";
    const std::string bytes = "R\xC3\xB6lle \xE2\x82\xAC \xF0\x9F\x8E\xAC";

    EXPECT_EQ(PlainConverter().toUtf8(wide), bytes);
    EXPECT_EQ(PlainConverter().toWide(bytes), wide);
}

TEST(StringConverter, GivesAnEmptyTextForAnEmptyOne)
{
    EXPECT_EQ(PlainConverter().toUtf8(L""), "");
    EXPECT_EQ(PlainConverter().toWide(""), L"");
}

TEST(StringConverter, KeepsZeroBytesAndByteOrderMarks)
{
    const std::wstring wide = {0xFEFF, L'a', 0, L'b'};
    const std::string bytes = {'\xEF', '\xBB', '\xBF', 'a', 0, 'b'};

    EXPECT_EQ(PlainConverter().toUtf8(wide), bytes);
    EXPECT_EQ(PlainConverter().toWide(bytes), wide);
}

TEST(StringConverter, RefusesUnitsThatAreNoCharacters)
{
    for (const std::uint32_t unit : {0xD800U, 0xDBFFU, 0xDC00U, 0xDFFFU, 0x110000U, 0x7FFFFFFFU, 0xFFFFFFFFU}) {
        const std::wstring text = {L'a', static_cast<wchar_t>(unit), L'b'};

        EXPECT_EQ(thrownBy([&] { PlainConverter().toUtf8(text); }), Result::InvalidArgument) << std::hex << unit;
    }
}

TEST(StringConverter, RefusesBytesThatAreNoUtf8)
{
    const std::vector<std::string> illFormed = {
        "\x80",         // a continuation without a start
        "\xC3",         // cut off
        "\xE2\x82",     // cut off
        "\xF0\x9F\x8E", // cut off
        "\xC3(",        // a start without its continuation
        "\xE2\x82(",    // a start without its second continuation
        "\xC0\x80",
        "\xC1\xBF", // overlong forms of two bytes
        "\xE0\x80\x80",
        "\xE0\x9F\xBF",     // of three
        "\xF0\x80\x80\x80", // of four
        "\xF0\x8F\xBF\xBF", // of four
        "\xED\xA0\x80",
        "\xED\xBF\xBF",         // the first and the last surrogate
        "\xF4\x90\x80\x80",     // 0x110000
        "\xF5\x80\x80\x80",     // a start that only larger numbers have
        "\xF8\x88\x80\x80\x80", // five bytes
        "\xFF",
    };
    for (const std::string& bytes : illFormed) {
        EXPECT_EQ(thrownBy([&] { PlainConverter().toWide(bytes); }), Result::InvalidArgument)
            << testing::PrintToString(bytes);
        EXPECT_EQ(thrownBy([&] { PlainConverter().toWide("abc" + bytes); }), Result::InvalidArgument)
            << testing::PrintToString(bytes);
    }
}

RC_GTEST_PROP(StringConverter, BringsEveryTextBack, ())
{
    const auto character =
        rc::gen::oneOf(rc::gen::inRange<wchar_t>(0, 0xD800), rc::gen::inRange<wchar_t>(0xE000, 0x110000));
    const auto text = *rc::gen::container<std::wstring>(character);

    RC_ASSERT(PlainConverter().toWide(PlainConverter().toUtf8(text)) == text);
}

RC_GTEST_PROP(StringConverter, AcceptsNoOtherBytesThanItWouldWrite, (const std::string& bytes))
{
    std::wstring wide;
    const Result::Type result = thrownBy([&] { wide = PlainConverter().toWide(bytes); });

    RC_ASSERT(result == Result::InvalidArgument || PlainConverter().toUtf8(wide) == bytes);
}
