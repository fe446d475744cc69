// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/settings/Variant.h"

#include "tests/support/ThrownResult.h"
#include "tests/support/core/HexBytes.h"
#include "util/Result.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <limits>
#include <vector>

using cadrel::core::Variant;
using cadrel::core::serialize::ByteArchive;
using cadrel::tests::archiveOf;
using cadrel::tests::bytesOf;
using cadrel::tests::thrownBy;
using cadrel::util::Result;

namespace {

std::vector<std::uint8_t> written(const Variant& variant)
{
    ByteArchive archive;
    archive << variant;
    return bytesOf(archive);
}

Variant readFrom(std::string_view hex)
{
    ByteArchive archive = archiveOf(hex);
    Variant variant;
    archive >> variant;
    EXPECT_EQ(archive.bytesLeft(), 0U);
    return variant;
}

} // namespace

TEST(Variant, IsOfNoTypeWhenMadeFromNothing)
{
    const Variant variant;

    EXPECT_EQ(variant.valueType(), -1);
    EXPECT_FALSE(variant.toBool());
    EXPECT_EQ(variant.toInt(), 0);
    EXPECT_EQ(variant.toText(), "");
}

TEST(Variant, HasTheTypeThatItWasMadeFrom)
{
    EXPECT_EQ(Variant(true).valueType(), 0);
    EXPECT_EQ(Variant(3).valueType(), 1);
    EXPECT_EQ(Variant(1.5F).valueType(), 2);
    EXPECT_EQ(Variant(std::string("x")).valueType(), 3);
    EXPECT_EQ(Variant("x").valueType(), 3);
    EXPECT_EQ(Variant(1.5).valueType(), 4);
}

TEST(Variant, HoldsABoolAsANumber)
{
    EXPECT_TRUE(Variant(true).toBool());
    EXPECT_FALSE(Variant(false).toBool());
    EXPECT_EQ(Variant(true).toDouble(), 1.0);
    EXPECT_EQ(Variant(false).toDouble(), 0.0);
}

TEST(Variant, ConvertsANumberToEveryOtherKind)
{
    EXPECT_EQ(Variant(3).toDouble(), 3.0);
    EXPECT_EQ(Variant(3).toFloat(), 3.0F);
    EXPECT_TRUE(Variant(3).toBool());
    EXPECT_TRUE(Variant(0.25).toBool());
    EXPECT_FALSE(Variant(-0.0).toBool());
    EXPECT_EQ(Variant(0.1).toFloat(), 0.1F);
    EXPECT_EQ(Variant(1.5F).toDouble(), 1.5);
}

TEST(Variant, TruncatesToAnInteger)
{
    EXPECT_EQ(Variant(2.9).toInt(), 2);
    EXPECT_EQ(Variant(-2.9).toInt(), -2);
    EXPECT_EQ(Variant(2147483647.9).toInt(), 2147483647);
    EXPECT_EQ(Variant(-2147483648.9).toInt(), std::numeric_limits<std::int32_t>::min());
}

TEST(Variant, GivesTheNearestIntegerForANumberBeyond32Bits)
{
    const double infinity = std::numeric_limits<double>::infinity();

    EXPECT_EQ(Variant(2147483648.0).toInt(), std::numeric_limits<std::int32_t>::max());
    EXPECT_EQ(Variant(1e300).toInt(), std::numeric_limits<std::int32_t>::max());
    EXPECT_EQ(Variant(infinity).toInt(), std::numeric_limits<std::int32_t>::max());
    EXPECT_EQ(Variant(-1e300).toInt(), std::numeric_limits<std::int32_t>::min());
    EXPECT_EQ(Variant(-infinity).toInt(), std::numeric_limits<std::int32_t>::min());
}

TEST(Variant, GivesZeroForANumberThatIsNone)
{
    EXPECT_EQ(Variant(std::numeric_limits<double>::quiet_NaN()).toInt(), 0);
}

TEST(Variant, GivesZeroForATextAsANumber)
{
    EXPECT_EQ(Variant(std::string("x")).toInt(), 0);
    EXPECT_EQ(Variant(std::string("12")).toDouble(), 0.0);
    EXPECT_FALSE(Variant("true").toBool());
    EXPECT_EQ(Variant("x").toText(), "x");
}

TEST(Variant, GivesAnEmptyTextForANumber)
{
    EXPECT_EQ(Variant(12).toText(), "");
}

TEST(Variant, IsAssignedATextWithTheNumberZero)
{
    Variant variant(12);

    variant = Variant("x");

    EXPECT_EQ(variant.valueType(), Variant::String);
    EXPECT_EQ(variant.toText(), "x");
    EXPECT_EQ(variant.toDouble(), 0.0);
}

TEST(Variant, IsAssignedANumberWithAnEmptyText)
{
    Variant variant("x");

    variant = Variant(2.5);

    EXPECT_EQ(variant.valueType(), Variant::Double);
    EXPECT_EQ(variant.toDouble(), 2.5);
    EXPECT_EQ(variant.toText(), "");
}

TEST(Variant, IsAssignedNothing)
{
    Variant variant("x");

    variant = Variant();

    EXPECT_EQ(variant.valueType(), Variant::None);
    EXPECT_EQ(variant.toText(), "");
}

TEST(Variant, WritesItsTypeAndItsNumberIn32Bits)
{
    EXPECT_EQ(written(Variant()), bytesOf("01000000 FFFFFFFF 00000000"));
    EXPECT_EQ(written(Variant(true)), bytesOf("01000000 00000000 0000803F"));
    EXPECT_EQ(written(Variant(3)), bytesOf("01000000 01000000 00004040"));
    EXPECT_EQ(written(Variant(-1.5F)), bytesOf("01000000 02000000 0000C0BF"));
}

TEST(Variant, WritesATextWithItsLength)
{
    EXPECT_EQ(written(Variant("ab")), bytesOf("01000000 03000000 02000000 6162"));
}

TEST(Variant, WritesADoubleIn64Bits)
{
    EXPECT_EQ(written(Variant(2.5)), bytesOf("01000000 04000000 0000000000000440"));
}

TEST(Variant, ReadsEveryType)
{
    EXPECT_EQ(readFrom("01000000 FFFFFFFF 00000000").valueType(), Variant::None);
    EXPECT_EQ(readFrom("01000000 00000000 0000803F").valueType(), Variant::Bool);
    EXPECT_TRUE(readFrom("01000000 00000000 0000803F").toBool());
    EXPECT_EQ(readFrom("01000000 01000000 00004040").valueType(), Variant::Integer);
    EXPECT_EQ(readFrom("01000000 01000000 00004040").toInt(), 3);
    EXPECT_EQ(readFrom("01000000 02000000 0000C0BF").valueType(), Variant::Float);
    EXPECT_EQ(readFrom("01000000 02000000 0000C0BF").toFloat(), -1.5F);
    EXPECT_EQ(readFrom("01000000 03000000 02000000 6162").valueType(), Variant::String);
    EXPECT_EQ(readFrom("01000000 03000000 02000000 6162").toText(), "ab");
    EXPECT_EQ(readFrom("01000000 04000000 0000000000000440").valueType(), Variant::Double);
    EXPECT_EQ(readFrom("01000000 04000000 0000000000000440").toDouble(), 2.5);
}

TEST(Variant, ReadsVersion0AsVersion1)
{
    EXPECT_EQ(readFrom("00000000 01000000 00004040").toInt(), 3);
    EXPECT_EQ(readFrom("00000000 03000000 02000000 6162").toText(), "ab");
    EXPECT_EQ(readFrom("00000000 04000000 0000000000000440").toDouble(), 2.5);
}

TEST(Variant, ReadsAnUnknownTypeAsAText)
{
    for (const char* type : {"05000000", "FEFFFFFF", "FFFFFF7F"}) {
        const Variant variant = readFrom("01000000 " + std::string(type) + " 02000000 6162");

        EXPECT_EQ(variant.valueType(), Variant::String) << type;
        EXPECT_EQ(variant.toText(), "ab") << type;
    }
}

TEST(Variant, ReadsANumberOverATextAndATextOverANumber)
{
    ByteArchive archive = archiveOf("01000000 01000000 00004040 01000000 03000000 01000000 61");
    Variant text("x");
    Variant number(12);

    archive >> text >> number;

    EXPECT_EQ(text.toInt(), 3);
    EXPECT_EQ(text.toText(), "");
    EXPECT_EQ(number.toInt(), 0);
    EXPECT_EQ(number.toText(), "a");
}

TEST(Variant, KeepsOnly24BitsOfAnIntegerInAStream)
{
    ByteArchive archive;
    archive << Variant(16777217);
    Variant variant;

    archive >> variant;

    EXPECT_EQ(bytesOf(archive), bytesOf("01000000 01000000 0000804B"));
    EXPECT_EQ(variant.toInt(), 16777216);
}

TEST(Variant, SaturatesTheLargestIntegerThatAStreamHasRoundedUp)
{
    ByteArchive archive;
    archive << Variant(std::numeric_limits<std::int32_t>::max());
    Variant variant;

    archive >> variant;

    EXPECT_EQ(variant.toDouble(), 2147483648.0);
    EXPECT_EQ(variant.toInt(), std::numeric_limits<std::int32_t>::max());
}

TEST(Variant, RefusesANewerVersion)
{
    EXPECT_EQ(thrownBy([] { readFrom("02000000 01000000 00004040"); }), Result::NewerVersion);
}

TEST(Variant, KnowsNoOlderVersionThan0)
{
    ByteArchive archive = archiveOf("01000000 00004040");
    Variant variant;

    EXPECT_EQ(thrownBy([&] { variant.readOlder(archive, 1); }), Result::UnknownVersion);
}

TEST(Variant, StaysAsItWasWhenTheBytesEnd)
{
    for (const char* hex : {"", "01000000", "01000000 01000000 000040", "01000000 03000000 02000000 61",
                            "01000000 03000000 FFFFFFFF", "01000000 04000000 00000000000004"}) {
        ByteArchive archive = archiveOf(std::string_view(hex));
        Variant variant(2.5);

        EXPECT_EQ(thrownBy([&] { archive >> variant; }), Result::EndOfData) << hex;
        EXPECT_EQ(variant.valueType(), Variant::Double) << hex;
        EXPECT_EQ(variant.toDouble(), 2.5) << hex;
    }
}

RC_GTEST_PROP(Variant, BringsTextsFloatsAndDoublesBack, (const std::string& text, float narrow, double wide))
{
    ByteArchive archive;
    archive << Variant(text) << Variant(narrow) << Variant(wide);
    Variant readText;
    Variant readNarrow;
    Variant readWide;

    archive >> readText >> readNarrow >> readWide;

    RC_ASSERT(readText.toText() == text);
    RC_ASSERT(readNarrow.toFloat() == narrow);
    RC_ASSERT(readWide.toDouble() == wide);
    RC_ASSERT(archive.bytesLeft() == 0U);
}
