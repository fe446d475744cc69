// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/JsonText.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cmath>
#include <cstdlib>
#include <cstring>
#include <string>

using cadrel::util::appendJsonNumber;
using cadrel::util::appendJsonText;

namespace {

std::string numberText(double number)
{
    std::string text;
    appendJsonNumber(text, number);
    return text;
}

std::string quotedText(std::string_view content)
{
    std::string text;
    appendJsonText(text, content);
    return text;
}

} // namespace

TEST(JsonText, EscapesWhatCannotStandInIt)
{
    EXPECT_EQ(quotedText("say \"no\" \\ yes/no"), R"("say \"no\" \\ yes/no")");
    EXPECT_EQ(quotedText("a\nb\tc"), R"("a\nb\tc")");
    EXPECT_EQ(quotedText(std::string_view("\0\x01\x1f\x7f", 4)), "\"\\u0000\\u0001\\u001f\x7f\"");
    EXPECT_EQ(quotedText("T\xc3\xb6ne"), "\"T\xc3\xb6ne\"");
}

TEST(JsonNumber, HasAsFewDigitsAsLeadBack)
{
    EXPECT_EQ(numberText(0.1), "0.1");
    EXPECT_EQ(numberText(3600.0), "3600");
    EXPECT_EQ(numberText(1.0 / 24.0), "0.041666666666666664");
    EXPECT_EQ(numberText(-2.5), "-2.5");
    EXPECT_EQ(numberText(0.0), "0");
}

TEST(JsonNumber, IsPlainUnlessItHasTooManyZeros)
{
    EXPECT_EQ(numberText(1e9), "1000000000");
    EXPECT_EQ(numberText(123456789012345.0), "123456789012345");
    EXPECT_EQ(numberText(1e15), "1e+15");
    EXPECT_EQ(numberText(0.000001), "0.000001");
    EXPECT_EQ(numberText(0.0000001), "1e-07");
    EXPECT_EQ(numberText(5e-324), "5e-324");
}

RC_GTEST_PROP(JsonNumber, ReadsBackExactly, (std::uint64_t bits))
{
    double number = 0.0;
    std::memcpy(&number, &bits, sizeof number);
    RC_PRE(std::isfinite(number));

    RC_ASSERT(std::strtod(numberText(number).c_str(), nullptr) == number);
}
