// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/border/NodeReading.h"

#include "host/border/HostFailure.h"
#include "tests/support/host/FakeProject.h"

#include <gtest/gtest.h>

using namespace Velmark;

namespace cadrel::host {

using tests::FakeNode;
using util::Result;

TEST(NodeReading, GathersTheChildrenInTheOrderOfTheHost)
{
    FakeNode node;
    node.children = {makeCounted<FakeNode>(3.0, 4.0), makeCounted<FakeNode>(1.0, 2.0)};

    const auto children = childrenOf(node);

    ASSERT_EQ(children.size(), 2U);
    EXPECT_EQ(children[0].get(), node.children[0].get());
    EXPECT_EQ(children[1].get(), node.children[1].get());
}

TEST(NodeReading, KeepsTheChildrenThatTheHostDropsMeanwhile)
{
    FakeNode node;
    node.children = {makeCounted<FakeNode>(1.0, 2.0)};

    const auto children = childrenOf(node);
    node.children.clear();

    EXPECT_EQ(children[0]->getStart(nullptr), 1.0);
}

TEST(NodeReading, MissesAChildThatTheHostDoesNotGive)
{
    FakeNode node;
    node.children = {makeCounted<FakeNode>(1.0, 2.0), nullptr};

    EXPECT_EQ(resultOf([&] { childrenOf(node); }), Result::HostObjectMissing);
}

TEST(NodeReading, MissesTheWalkThatTheHostDoesNotGive)
{
    struct Childless : FakeNode {
        INodeIterator* newChildIterator() override { return nullptr; }
    };
    Childless node;

    EXPECT_EQ(resultOf([&] { childrenOf(node); }), Result::HostObjectMissing);
}

TEST(NodeReading, ReadsANameAsWideText)
{
    FakeNode node;

    EXPECT_EQ(nameOf(node), L"");
    node.nodeName = u"T\u00fcr \U0001F6AA";
    EXPECT_EQ(nameOf(node), L"T\u00fcr \U0001F6AA");
}

TEST(NodeReading, MissesANameThatTheHostDoesNotGive)
{
    FakeNode node;
    node.nodeName = nullptr;

    EXPECT_EQ(resultOf([&] { nameOf(node); }), Result::HostObjectMissing);
}

} // namespace cadrel::host
