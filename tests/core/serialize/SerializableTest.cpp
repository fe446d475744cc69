// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/serialize/Serializable.h"

#include "core/serialize/ByteArchive.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/HexBytes.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <string>

namespace cadrel::tests {
namespace {

using core::serialize::ByteArchive;
using core::serialize::Serializable;
using util::Result;

/// One byte in version 2, one byte more than its value in version 1.
class Number : public Serializable {
public:
    explicit Number(std::uint32_t version = 2) : Serializable(version) {}

    void readCurrent(ByteArchive& archive) override { archive >> value; }
    void write(ByteArchive& archive) const override { archive << value; }
    void readOlder(ByteArchive& archive, std::uint32_t version) override
    {
        if (version != 1)
            throw Result::UnknownVersion;
        archive >> value;
        --value;
    }

    std::uint8_t value = 0;
};

/// A class that never had another version.
class Pair : public Serializable {
public:
    explicit Pair(std::uint32_t version = 0) : Serializable(version) {}

    void readCurrent(ByteArchive& archive) override { archive >> first >> second; }
    void write(ByteArchive& archive) const override { archive << first << second; }

    Number first;
    Number second;
};

TEST(Serializable, WritesItsVersionInFrontOfItsBody)
{
    Number number;
    number.value = 7;
    ByteArchive archive;

    number.serialize(archive);

    EXPECT_EQ(bytesOf(archive), bytesOf("02 00 00 00 07"));
}

TEST(Serializable, FramesEachNestedObject)
{
    Pair pair;
    pair.first.value = 7;
    pair.second.value = 8;
    ByteArchive archive;

    archive << pair;

    EXPECT_EQ(bytesOf(archive), bytesOf("00 00 00 00"
                                        "02 00 00 00 07"
                                        "02 00 00 00 08"));
}

TEST(Serializable, ReadsABodyOfItsOwnVersion)
{
    ByteArchive archive = archiveOf("02 00 00 00 07");
    Number number;

    number.deserialize(archive);

    EXPECT_EQ(number.value, 7);
    EXPECT_EQ(archive.bytesLeft(), 0U);
}

TEST(Serializable, ReadsAnOlderBodyInItsVersionAndKeepsItsOwn)
{
    ByteArchive archive = archiveOf("01 00 00 00 07");
    Number number;

    archive >> number;

    EXPECT_EQ(number.value, 6);
    EXPECT_EQ(number.version(), 2U);
}

TEST(Serializable, RefusesANewerVersionBeforeItsBody)
{
    for (const char* version : {"03 00 00 00", "FF FF FF FF"}) {
        ByteArchive archive = archiveOf(std::string(version) + "07");
        Number number;
        EXPECT_EQ(thrownBy([&] { archive >> number; }), Result::NewerVersion) << version;
        EXPECT_EQ(number.value, 0) << version;
        EXPECT_EQ(archive.bytesLeft(), 1U) << version;
    }
}

TEST(Serializable, ChecksTheVersionOfEachNestedObjectByItself)
{
    ByteArchive newer = archiveOf("00 00 00 00  02 00 00 00 07  03 00 00 00 08");
    ByteArchive older = archiveOf("00 00 00 00  02 00 00 00 07  01 00 00 00 08");
    ByteArchive unknown = archiveOf("00 00 00 00  00 00 00 00 07  02 00 00 00 08");
    Pair pair;

    EXPECT_EQ(thrownBy([&] { newer >> pair; }), Result::NewerVersion);
    EXPECT_EQ(thrownBy([&] { unknown >> pair; }), Result::UnknownVersion);
    older >> pair;

    EXPECT_EQ(pair.first.value, 7);
    EXPECT_EQ(pair.second.value, 7);
}

TEST(Serializable, AClassWithoutOlderVersionsSupportsNone)
{
    ByteArchive archive = archiveOf("00 00 00 00  02 00 00 00 07  02 00 00 00 08");
    Pair pair(1);

    EXPECT_EQ(thrownBy([&] { archive >> pair; }), Result::NotSupported);
}

TEST(Serializable, FailsWhereTheDataEndsWithinTheFrameOrTheBody)
{
    Number number;
    for (const char* hex : {"", "02 00 00", "02 00 00 00"}) {
        ByteArchive archive = archiveOf(hex);
        EXPECT_EQ(thrownBy([&] { archive >> number; }), Result::EndOfData) << '"' << hex << '"';
    }
}

TEST(Serializable, AssignmentLeavesTheVersionToTheClass)
{
    Number older(1);
    Number number;
    number.value = 5;

    older = number;

    EXPECT_EQ(older.version(), 1U);
    EXPECT_EQ(older.value, 5);
}

} // namespace
} // namespace cadrel::tests
