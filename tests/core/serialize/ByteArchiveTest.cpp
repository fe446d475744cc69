// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/serialize/ByteArchive.h"

#include "tests/support/ThrownResult.h"
#include "tests/support/core/HexBytes.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <bit>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::serialize::ByteArchive;
using util::Result;

template <typename Value>
std::vector<std::uint8_t> written(const Value& value)
{
    ByteArchive archive;
    archive << value;
    return bytesOf(archive);
}

template <typename Value>
Value read(std::string_view hex)
{
    ByteArchive archive = archiveOf(hex);
    Value value{};
    archive >> value;
    EXPECT_EQ(archive.bytesLeft(), 0U) << hex;
    return value;
}

TEST(ByteArchive, WritesEachPrimitiveLittleEndianWithoutPadding)
{
    EXPECT_EQ(written(std::uint8_t{0xFE}), bytesOf("FE"));
    EXPECT_EQ(written(true), bytesOf("01"));
    EXPECT_EQ(written(false), bytesOf("00"));
    EXPECT_EQ(written(std::int32_t{1}), bytesOf("01 00 00 00"));
    EXPECT_EQ(written(std::int32_t{-2}), bytesOf("FE FF FF FF"));
    EXPECT_EQ(written(std::numeric_limits<std::int32_t>::min()), bytesOf("00 00 00 80"));
    EXPECT_EQ(written(std::uint32_t{0x01020304}), bytesOf("04 03 02 01"));
    EXPECT_EQ(written(std::uint32_t{0xFFFFFFFF}), bytesOf("FF FF FF FF"));
    EXPECT_EQ(written(1.0F), bytesOf("00 00 80 3F"));
    EXPECT_EQ(written(-0.5F), bytesOf("00 00 00 BF"));
    EXPECT_EQ(written(1.0), bytesOf("00 00 00 00 00 00 F0 3F"));
    EXPECT_EQ(written(50.0), bytesOf("00 00 00 00 00 00 49 40"));
    EXPECT_EQ(written(-2.0), bytesOf("00 00 00 00 00 00 00 C0"));
    EXPECT_EQ(written(std::string("AB")), bytesOf("02 00 00 00 41 42"));
    EXPECT_EQ(written(std::string()), bytesOf("00 00 00 00"));
}

TEST(ByteArchive, ReadsEachPrimitive)
{
    EXPECT_EQ(read<std::uint8_t>("FE"), 0xFE);
    EXPECT_EQ(read<std::int32_t>("FE FF FF FF"), -2);
    EXPECT_EQ(read<std::int32_t>("00 00 00 80"), std::numeric_limits<std::int32_t>::min());
    EXPECT_EQ(read<std::uint32_t>("04 03 02 01"), 0x01020304U);
    EXPECT_EQ(read<std::uint32_t>("FF FF FF FF"), 0xFFFFFFFFU);
    EXPECT_EQ(read<float>("00 00 80 3F"), 1.0F);
    EXPECT_EQ(read<double>("00 00 00 00 00 00 49 40"), 50.0);
    EXPECT_EQ(read<std::string>("02 00 00 00 41 42"), "AB");
    EXPECT_EQ(read<std::string>("00 00 00 00"), "");
}

TEST(ByteArchive, ReadsAnyByteButZeroAsTrue)
{
    EXPECT_FALSE(read<bool>("00"));
    EXPECT_TRUE(read<bool>("01"));
    EXPECT_TRUE(read<bool>("02"));
    EXPECT_TRUE(read<bool>("80"));
    EXPECT_TRUE(read<bool>("FF"));
}

TEST(ByteArchive, KeepsZeroBytesAndUtf8InATextAsTheyAre)
{
    const std::string text("a\0\xC3\xA9", 4);

    EXPECT_EQ(written(text), bytesOf("04 00 00 00 61 00 C3 A9"));
    EXPECT_EQ(read<std::string>("04 00 00 00 61 00 C3 A9"), text);
}

TEST(ByteArchive, ATextThatIsReadReplacesTheFormerOne)
{
    ByteArchive archive = archiveOf("00 00 00 00");
    std::string text = "former";

    archive >> text;

    EXPECT_EQ(text, "");
}

template <typename Value>
class OneByteShort : public testing::Test {
};
using Numbers = testing::Types<std::uint8_t, bool, std::int32_t, std::uint32_t, float, double>;
TYPED_TEST_SUITE(OneByteShort, Numbers);

TYPED_TEST(OneByteShort, ANumberFailsAndStaysUnread)
{
    const std::vector<std::uint8_t> bytes(sizeof(TypeParam) - 1, 0x01);
    ByteArchive archive = archiveOf(bytes);
    TypeParam value{};

    EXPECT_EQ(thrownBy([&] { archive >> value; }), Result::EndOfData);
    EXPECT_EQ(archive.bytesLeft(), bytes.size());
}

TEST(ByteArchive, AShortTextCountFailsAndStaysUnread)
{
    ByteArchive archive = archiveOf("01 00 00");
    std::string text;

    EXPECT_EQ(thrownBy([&] { archive >> text; }), Result::EndOfData);
    EXPECT_EQ(archive.bytesLeft(), 3U);
}

TEST(ByteArchive, ATextThatPassesTheEndFailsBehindItsCount)
{
    for (const char* count : {"03 00 00 00", "FF FF FF 7F", "FF FF FF FF", "00 00 00 80"}) {
        ByteArchive archive = archiveOf(std::string(count) + "41 42");
        std::string text;
        EXPECT_EQ(thrownBy([&] { archive >> text; }), Result::EndOfData) << count;
        EXPECT_EQ(archive.bytesLeft(), 2U) << count;
    }
}

TEST(ByteArchive, ReadsValuesOneBehindTheOther)
{
    ByteArchive archive = archiveOf("07 01 00 00 00 01 00 00 00 5A 00");
    std::uint8_t number = 0;
    std::int32_t whole = 0;
    std::string text;
    bool flag = true;

    archive >> number >> whole >> text >> flag;

    EXPECT_EQ(number, 7);
    EXPECT_EQ(whole, 1);
    EXPECT_EQ(text, "Z");
    EXPECT_FALSE(flag);
    EXPECT_FALSE(archive.hasBytes(1));
}

TEST(ByteArchive, WritingAppendsWhereverReadingStands)
{
    ByteArchive archive = archiveOf("01 02");
    std::uint8_t first = 0;
    archive >> first;

    archive << std::uint8_t{3};

    EXPECT_EQ(bytesOf(archive), bytesOf("01 02 03"));
    EXPECT_EQ(archive.bytesLeft(), 2U);
}

TEST(ByteArchive, IsEmptyAtFirst)
{
    const ByteArchive archive;

    EXPECT_EQ(archive.size(), 0U);
    EXPECT_EQ(archive.data(), nullptr);
    EXPECT_EQ(archive.bytesLeft(), 0U);
}

TEST(ByteArchive, RewindingReadsFromTheFirstByteAgain)
{
    ByteArchive archive = archiveOf("05 06");
    std::uint8_t value = 0;
    archive >> value >> value;

    archive.rewind();
    archive >> value;

    EXPECT_EQ(value, 5);
}

TEST(ByteArchive, ClearingDropsTheBytesAndThePosition)
{
    ByteArchive archive = archiveOf("05 06");
    std::uint8_t value = 0;
    archive >> value;

    archive.clear();

    EXPECT_EQ(archive.size(), 0U);
    EXPECT_EQ(archive.data(), nullptr);
    archive << std::uint8_t{9};
    archive >> value;
    EXPECT_EQ(value, 9);
}

TEST(ByteArchive, AssignmentReplacesTheContentAndReadsFromTheFirstByte)
{
    ByteArchive archive = archiveOf("05 06 07");
    std::uint8_t value = 0;
    archive >> value >> value;
    const std::vector<std::uint8_t> bytes = {8, 9};

    archive.assign(bytes.data(), bytes.size());
    archive >> value;

    EXPECT_EQ(value, 8);
    EXPECT_EQ(archive.size(), 2U);
}

TEST(ByteArchive, AssignmentOfNothingEmptiesIt)
{
    ByteArchive archive = archiveOf("05");

    archive.assign(nullptr, 0);

    EXPECT_EQ(archive.size(), 0U);
    EXPECT_EQ(archive.data(), nullptr);
}

TEST(ByteArchive, HasNothingLeftOnceItIsMovedFrom)
{
    ByteArchive archive = archiveOf("05 06 07");
    std::uint8_t value = 0;
    archive >> value;

    ByteArchive moved = std::move(archive);

    EXPECT_EQ(archive.bytesLeft(), 0U);
    EXPECT_FALSE(archive.hasBytes(1));
    EXPECT_EQ(thrownBy([&] { archive >> value; }), Result::EndOfData);
    moved >> value;
    EXPECT_EQ(value, 6);
    EXPECT_EQ(moved.bytesLeft(), 1U);
}

TEST(ByteArchive, HasBytesUpToTheLastOneAndNeverMore)
{
    ByteArchive archive = archiveOf("01 02 03");
    std::uint8_t value = 0;
    archive >> value;

    EXPECT_TRUE(archive.hasBytes(0));
    EXPECT_TRUE(archive.hasBytes(2));
    EXPECT_FALSE(archive.hasBytes(3));
    EXPECT_FALSE(archive.hasBytes(std::numeric_limits<std::size_t>::max()));
    EXPECT_EQ(thrownBy([&] { archive.ensureBytes(2); }), Result::Ok);
    EXPECT_EQ(thrownBy([&] { archive.ensureBytes(3); }), Result::EndOfData);
    EXPECT_EQ(thrownBy([&] { archive.ensureBytes(std::numeric_limits<std::size_t>::max()); }), Result::EndOfData);
    EXPECT_TRUE(ByteArchive().hasBytes(0));
}

TEST(ByteArchive, ChecksumIsThePublishedOne)
{
    // The check value of CRC-32, and the checksums of "a" and of one zero byte.
    EXPECT_EQ(archiveOf("31 32 33 34 35 36 37 38 39").crc32(), 0xCBF43926U);
    EXPECT_EQ(archiveOf("61").crc32(), 0xE8B7BE43U);
    EXPECT_EQ(archiveOf("00").crc32(), 0xD202EF8DU);
    EXPECT_EQ(ByteArchive().crc32(), 0U);
}

TEST(ByteArchive, ChecksumIsThatOfAllBytesWhereverReadingStands)
{
    ByteArchive archive = archiveOf("31 32 33 34 35 36 37 38 39");
    double value = 0;
    archive >> value;

    EXPECT_EQ(archive.crc32(), 0xCBF43926U);
    EXPECT_EQ(archive.bytesLeft(), 1U);
}

TEST(ByteArchive, ACountBelowOneMeansEmpty)
{
    EXPECT_EQ(archiveOf("00 00 00 00").readCount(), 0U);
    EXPECT_EQ(archiveOf("FF FF FF FF").readCount(), 0U);
    EXPECT_EQ(archiveOf("00 00 00 80").readCount(), 0U);
    EXPECT_EQ(archiveOf("01 00 00 00").readCount(), 1U);
    EXPECT_EQ(archiveOf("FF FF FF 7F").readCount(), 2147483647U);
    EXPECT_EQ(thrownBy([] { archiveOf("01 00 00").readCount(); }), Result::EndOfData);
}

TEST(ByteArchive, ACountIsWrittenUpToWhatReadsBack)
{
    ByteArchive archive;

    archive.writeCount(3);
    archive.writeCount(2147483647U);

    EXPECT_EQ(bytesOf(archive), bytesOf("03 00 00 00 FF FF FF 7F"));
    EXPECT_EQ(thrownBy([&] { archive.writeCount(2147483648U); }), Result::OutOfRange);
    EXPECT_EQ(archive.size(), 8U);
}

TEST(ByteArchive, APointerIsNoBool)
{
    EXPECT_FALSE((std::is_invocable_v<decltype([](auto& archive, auto value) -> decltype(archive << value) {
                                          return archive << value;
                                      }),
                                      ByteArchive&, const char*>));
}

TEST(ByteArchive, KeepsTheBitsOfNumbersThatAreNone)
{
    const auto quiet = std::bit_cast<double>(std::uint64_t{0x7FF8000000000123});
    const auto quietShort = std::bit_cast<float>(std::uint32_t{0x7FC00123});

    EXPECT_EQ(written(quiet), bytesOf("23 01 00 00 00 00 F8 7F"));
    EXPECT_EQ(written(quietShort), bytesOf("23 01 C0 7F"));
    EXPECT_EQ(std::bit_cast<std::uint64_t>(read<double>("23 01 00 00 00 00 F8 7F")), 0x7FF8000000000123U);
    EXPECT_EQ(std::bit_cast<std::uint32_t>(read<float>("23 01 C0 7F")), 0x7FC00123U);
}

RC_GTEST_PROP(ByteArchive, WhatWasWrittenReadsBack,
              (std::uint8_t small, bool flag, std::int32_t whole, std::uint32_t natural, float shortReal, double real,
               const std::string& text))
{
    ByteArchive archive;
    archive << small << flag << whole << natural << shortReal << real << text;
    RC_ASSERT(archive.size() == 1 + 1 + 4 + 4 + 4 + 8 + 4 + text.size());

    std::uint8_t smallRead = 0;
    bool flagRead = false;
    std::int32_t wholeRead = 0;
    std::uint32_t naturalRead = 0;
    float shortRealRead = 0;
    double realRead = 0;
    std::string textRead;
    archive >> smallRead >> flagRead >> wholeRead >> naturalRead >> shortRealRead >> realRead >> textRead;

    RC_ASSERT(smallRead == small);
    RC_ASSERT(flagRead == flag);
    RC_ASSERT(wholeRead == whole);
    RC_ASSERT(naturalRead == natural);
    RC_ASSERT(shortRealRead == shortReal);
    RC_ASSERT(realRead == real);
    RC_ASSERT(textRead == text);
    RC_ASSERT(archive.bytesLeft() == 0U);
}

} // namespace
} // namespace cadrel::tests
