// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/standin/TestHost.h"

#include "standin/base/AttributeList.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>

#include <array>
#include <limits>

using namespace Velmark;

namespace standin::tests {

namespace {

constexpr std::array<uint8, 4> Block{1, 0, 255, 7};

} // namespace

TEST(AttributeList, GivesBackWhatWasSet)
{
    TestHost host;
    const auto list = create<IAttributeData>(host.context());
    EXPECT_EQ(list->setBinary("block", Block.data(), 4, true), ResultOk);

    EXPECT_EQ(list->getBinarySize("block"), 4);
    std::array<uint8, 4> read{};
    EXPECT_EQ(list->getBinary("block", read.data(), 4), ResultOk);
    EXPECT_EQ(read, Block);
}

TEST(AttributeList, HasACopyWhetherOneIsAskedForOrNot)
{
    const auto list = makeCounted<AttributeList>();
    std::array<uint8, 4> bytes = Block;
    list->setBinary("block", bytes.data(), 4, false);

    bytes.fill(0);

    std::array<uint8, 4> read{};
    list->getBinary("block", read.data(), 4);
    EXPECT_EQ(read, Block);
}

TEST(AttributeList, FillsTheFirstBytesOfALargerBlock)
{
    const auto list = makeCounted<AttributeList>();
    list->setBinary("block", Block.data(), 4, true);

    std::array<uint8, 4> read{9, 9, 9, 9};
    EXPECT_EQ(list->getBinary("block", read.data(), 2), ResultOk);

    EXPECT_EQ(read, (std::array<uint8, 4>{1, 0, 9, 9}));
}

TEST(AttributeList, WritesNothingWhereThereIsLess)
{
    const auto list = makeCounted<AttributeList>();
    list->setBinary("block", Block.data(), 4, true);
    std::array<uint8, 5> read{9, 9, 9, 9, 9};

    EXPECT_NE(list->getBinary("block", read.data(), 5), ResultOk);
    EXPECT_NE(list->getBinary("other", read.data(), 1), ResultOk);

    EXPECT_EQ(read, (std::array<uint8, 5>{9, 9, 9, 9, 9}));
    EXPECT_EQ(list->getBinarySize("other"), -1);
}

TEST(AttributeList, AnEmptyBlockIsThere)
{
    const auto list = makeCounted<AttributeList>();
    EXPECT_EQ(list->setBinary("empty", nullptr, 0, true), ResultOk);

    EXPECT_EQ(list->getBinarySize("empty"), 0);
    EXPECT_EQ(list->getBinary("empty", nullptr, 0), ResultOk);
}

TEST(AttributeList, ReplacesWhatStoodUnderTheKey)
{
    const auto list = makeCounted<AttributeList>();
    list->setBinary("block", Block.data(), 4, true);

    EXPECT_EQ(list->setBinary("block", Block.data(), 1, true), ResultOk);

    EXPECT_EQ(list->getBinarySize("block"), 1);
}

TEST(AttributeList, RefusesWhatCannotBe)
{
    const auto list = makeCounted<AttributeList>();
    list->setBinary("block", Block.data(), 4, true);
    std::array<uint8, 4> read{};

    EXPECT_NE(list->setBinary(nullptr, Block.data(), 4, true), ResultOk);
    EXPECT_NE(list->setBinary("\xc0\x80", Block.data(), 4, true), ResultOk);
    EXPECT_NE(list->setBinary("block", nullptr, 4, true), ResultOk);
    EXPECT_NE(list->setBinary("block", Block.data(), -1, true), ResultOk);
    EXPECT_NE(list->setBinary("block", Block.data(), std::numeric_limits<int32>::min(), true), ResultOk);
    EXPECT_NE(list->getBinary(nullptr, read.data(), 4), ResultOk);
    EXPECT_NE(list->getBinary("block", nullptr, 4), ResultOk);
    EXPECT_NE(list->getBinary("block", read.data(), -1), ResultOk);
    EXPECT_EQ(list->getBinarySize(nullptr), -1);

    EXPECT_EQ(list->getBinarySize("block"), 4);
}

TEST(Attribute, ListsAreEqualWhenTheirContentIs)
{
    const auto attributeOf = [](const Counted<AttributeList>& list) {
        return Attribute{Counted<FUnknown>(Counted<FObject>(list)), true};
    };
    const auto a = makeCounted<AttributeList>();
    const auto b = makeCounted<AttributeList>();
    a->set("block", {1, 2});
    b->set("block", {1, 2});
    EXPECT_EQ(attributeOf(a), attributeOf(b));

    b->set("block", {1, 3});
    EXPECT_FALSE(attributeOf(a) == attributeOf(b));
}

} // namespace standin::tests
