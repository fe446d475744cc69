// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/Attributes.h"
#include "velmark/Counted.h"

#include "tests/velmark/Probe.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <utility>

using namespace Velmark;
using cadrel::tests::Probe;

namespace {

template <class Value>
Value bytesAt(const FVariant& variant, std::size_t offset)
{
    Value value;
    std::memcpy(&value, reinterpret_cast<const char*>(&variant) + offset, sizeof(Value));
    return value;
}

uint16 typeWord(const FVariant& variant)
{
    return bytesAt<uint16>(variant, 0);
}

/// Eight bytes, whatever they stand for.
uint64 valueWord(const FVariant& variant)
{
    return bytesAt<uint64>(variant, 8);
}

uint64 address(const void* pointer)
{
    return reinterpret_cast<std::uintptr_t>(pointer);
}

} // namespace

TEST(FVariant, IsEmptyAtFirst)
{
    const FVariant variant;

    EXPECT_EQ(typeWord(variant), 0);
    EXPECT_EQ(variant.type(), 0);
    EXPECT_FALSE(variant.isInteger());
    EXPECT_FALSE(variant.isString());
    EXPECT_FALSE(variant.isObject());
}

TEST(FVariant, HoldsAnInteger)
{
    const FVariant variant = FVariant::integer(-3);

    EXPECT_EQ(typeWord(variant), 1);
    EXPECT_EQ(valueWord(variant), 0xFFFFFFFFFFFFFFFDU);
    EXPECT_TRUE(variant.isInteger());
    EXPECT_EQ(variant.asInteger(), -3);
    EXPECT_EQ(variant.asString(), nullptr);
    EXPECT_EQ(variant.asObject(), nullptr);
}

TEST(FVariant, BorrowsAText)
{
    const char* const text = "A104";
    const FVariant variant = FVariant::string(text);

    EXPECT_EQ(typeWord(variant), 4);
    EXPECT_EQ(valueWord(variant), address(text));
    EXPECT_TRUE(variant.isString());
    EXPECT_EQ(variant.asString(), text);
    EXPECT_EQ(variant.asInteger(), 0);
    EXPECT_EQ(variant.asObject(), nullptr);
}

TEST(FVariant, HoldsAReferenceToItsObjectAsLongAsItLives)
{
    const auto object = makeCounted<Probe>();
    FObject* const base = object.get();
    {
        const FVariant variant = FVariant::object(base);

        EXPECT_EQ(typeWord(variant), 8);
        EXPECT_EQ(valueWord(variant), address(base));
        EXPECT_TRUE(variant.isObject());
        EXPECT_EQ(variant.asObject(), base);
        EXPECT_EQ(variant.asInteger(), 0);
        EXPECT_EQ(variant.asString(), nullptr);
        EXPECT_EQ(object->refCount(), 2);
    }
    EXPECT_EQ(object->refCount(), 1);
}

TEST(FVariant, MayHoldNoObject)
{
    const FVariant variant = FVariant::object(nullptr);

    EXPECT_TRUE(variant.isObject());
    EXPECT_EQ(variant.asObject(), nullptr);
}

TEST(FVariant, CopiesShareTheObjectAndMovesTakeIt)
{
    const auto object = makeCounted<Probe>();
    FVariant variant = FVariant::object(static_cast<FObject*>(object.get()));

    FVariant copy = variant;
    EXPECT_EQ(object->refCount(), 3);
    const FVariant moved = std::move(copy);
    EXPECT_EQ(object->refCount(), 3);
    EXPECT_EQ(moved.asObject(), variant.asObject());
    variant = FVariant::integer(1);
    EXPECT_EQ(object->refCount(), 2);
    EXPECT_EQ(variant.asInteger(), 1);
    variant = moved;

    EXPECT_EQ(object->refCount(), 3);
}

TEST(AttributeKey, IsWrittenExactlyAsAgreed)
{
    EXPECT_STREQ(AttributeKey::Storage, "CaDr");
    EXPECT_STREQ(AttributeKey::StorageData, "CaDrData");
    EXPECT_STREQ(AttributeKey::StorageChecksum, "CaDs");
    EXPECT_STREQ(AttributeKey::LockState, "Cadrel:LockState");
    EXPECT_STREQ(AttributeKey::MarkerType, "Cadrel:MarkerType");
    EXPECT_STREQ(AttributeKey::VideoType, "Cadrel:VideoType");
    EXPECT_STREQ(AttributeKey::FolderType, "Cadrel:FolderType");
    EXPECT_STREQ(AttributeKey::EventUserId, "CadrEventUserId");
    EXPECT_STREQ(AttributeKey::Reel, "User:STR_MAReel");
}
