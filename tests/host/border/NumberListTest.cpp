// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/border/NumberList.h"

#include "host/border/HostFailure.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/host/AlteredContext.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/Attributes.h"
#include "velmark/ClassId.h"
#include "velmark/Tracks.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <vector>

using namespace Velmark;

namespace cadrel::host {

using cadrel::tests::thrownBy;
using util::Result;
using Numbers = std::vector<double>;

namespace {

constexpr const char* Key = "Cadrel:Test";

class NumberListTest : public testing::Test {
protected:
    void write(const Numbers& numbers)
    {
        host.edit(u"Write", [&] { writeNumbers(host.context(), *node, Key, numbers); });
    }
    void setBytes(const std::vector<std::uint8_t>& bytes)
    {
        const auto list = required(create<IAttributeData>(host.context()));
        requireOk(list->setBinary(AttributeKey::Numbers, bytes.data(), static_cast<int32>(bytes.size()), true));
        requireOk(node->setAttribute(Key, FVariant::object(list.get()), true));
    }

    standin::tests::TestHost host;
    const standin::tests::TestHost::Node node = host.addTrack(TypeWord::Audio, u"DX");
};

} // namespace

TEST_F(NumberListTest, ReadsWhatWasWritten)
{
    for (const Numbers& numbers : {Numbers{}, Numbers{0.0}, Numbers{-1.5, 86400.1, 1e300, 0.1}}) {
        write(numbers);

        EXPECT_EQ(readNumbers(*node, Key), numbers);
    }
}

TEST_F(NumberListTest, FollowsTheUndoListOfTheHost)
{
    write({1.0});
    write({2.0, 3.0});

    ASSERT_TRUE(host.undo());
    EXPECT_EQ(readNumbers(*node, Key), Numbers{1.0});
    ASSERT_TRUE(host.undo());
    EXPECT_FALSE(readNumbers(*node, Key));
}

TEST_F(NumberListTest, HasNothingWhereThereIsNoList)
{
    EXPECT_FALSE(readNumbers(*node, Key));
    const standin::tests::TestHost::Node other = host.addTrack(TypeWord::Audio, u"FX");
    for (const FVariant& value : {FVariant::integer(1), FVariant::string("1 2"), FVariant::object(other.get())}) {
        node->setAttribute(Key, value, false);
        EXPECT_FALSE(readNumbers(*node, Key));
    }
}

TEST_F(NumberListTest, HasNothingWhereTheBytesAreNoNumbers)
{
    for (const std::size_t size : {1U, 7U, 9U, 15U}) {
        setBytes(std::vector<std::uint8_t>(size, 0));
        EXPECT_FALSE(readNumbers(*node, Key)) << size;
    }
    setBytes(std::vector<std::uint8_t>(16, 0));
    EXPECT_EQ(readNumbers(*node, Key), (Numbers{0.0, 0.0}));
}

TEST_F(NumberListTest, HasNothingWhereANumberIsNotFinite)
{
    using Limits = std::numeric_limits<double>;
    for (const double number : {Limits::infinity(), -Limits::infinity(), Limits::quiet_NaN()}) {
        write({1.0, number});
        EXPECT_FALSE(readNumbers(*node, Key));
    }
}

TEST_F(NumberListTest, MissesTheListsOfAHostThatHasNone)
{
    tests::AlteredContext context(host.context());
    context.hide(ClassId::AttributeList);

    EXPECT_EQ(thrownBy([&] { writeNumbers(&context, *node, Key, {1.0}); }), Result::HostObjectMissing);
    EXPECT_FALSE(readNumbers(*node, Key));
}

TEST_F(NumberListTest, IsRemovedOnceAndNotMissedAfterwards)
{
    write({1.0});

    removeNumbers(*node, Key);
    EXPECT_NE(node->hasAttribute(Key), ResultOk);
    EXPECT_EQ(thrownBy([&] { removeNumbers(*node, Key); }), Result::Ok);
}

} // namespace cadrel::host
