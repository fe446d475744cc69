// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/stage/Base64.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <string>

namespace standin::tests {

namespace {

Bytes bytesOf(std::string_view text)
{
    return {text.begin(), text.end()};
}

// The test vectors of RFC 4648, section 10.
TEST(Base64, WritesThePublishedExamples)
{
    EXPECT_EQ(toBase64(bytesOf("")), "");
    EXPECT_EQ(toBase64(bytesOf("f")), "Zg==");
    EXPECT_EQ(toBase64(bytesOf("fo")), "Zm8=");
    EXPECT_EQ(toBase64(bytesOf("foo")), "Zm9v");
    EXPECT_EQ(toBase64(bytesOf("foob")), "Zm9vYg==");
    EXPECT_EQ(toBase64(bytesOf("fooba")), "Zm9vYmE=");
    EXPECT_EQ(toBase64(bytesOf("foobar")), "Zm9vYmFy");
}

TEST(Base64, UsesAllDigits)
{
    // 63 is 111111, 62 is 111110, 61 is 111101.
    EXPECT_EQ(toBase64({0xFF, 0xFF, 0xFF}), "////");
    EXPECT_EQ(toBase64({0xFB, 0xEF, 0xBE}), "++++");
    EXPECT_EQ(toBase64({0xF7, 0xDF, 0x7D}), "9999");
    EXPECT_EQ(toBase64({0x00, 0x00, 0x00}), "AAAA");
}

RC_GTEST_PROP(Base64, ReadsBackWhatWasWritten, (const Bytes& bytes))
{
    RC_ASSERT(fromBase64(toBase64(bytes)) == bytes);
}

TEST(Base64, RefusesTextOfAnotherLength)
{
    EXPECT_EQ(fromBase64("Zg"), std::nullopt);
    EXPECT_EQ(fromBase64("Zg="), std::nullopt);
    EXPECT_EQ(fromBase64("Zm9vY"), std::nullopt);
}

TEST(Base64, RefusesOtherCharacters)
{
    EXPECT_EQ(fromBase64("Zm9-"), std::nullopt);
    EXPECT_EQ(fromBase64("Zm 9"), std::nullopt);
    EXPECT_EQ(fromBase64("Zm9\xff"), std::nullopt);
    EXPECT_EQ(fromBase64(std::string_view("Zm\0v", 4)), std::nullopt);
}

TEST(Base64, RefusesPaddingElsewhereThanAtTheEnd)
{
    EXPECT_EQ(fromBase64("===="), std::nullopt);
    EXPECT_EQ(fromBase64("Z==="), std::nullopt);
    EXPECT_EQ(fromBase64("=Zm9"), std::nullopt);
    EXPECT_EQ(fromBase64("Zg==Zm9v"), std::nullopt);
}

TEST(Base64, RefusesASecondWayToWriteTheSameBytes)
{
    // The last four bits of "h" and the last two of "9" belong to no byte.
    EXPECT_EQ(fromBase64("Zh=="), std::nullopt);
    EXPECT_EQ(fromBase64("Zm9="), std::nullopt);
}

} // namespace

} // namespace standin::tests
