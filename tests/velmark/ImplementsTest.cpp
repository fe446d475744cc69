// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/Implements.h"
#include "velmark/Counted.h"

#include "tests/velmark/Probe.h"

#include <gtest/gtest.h>

using namespace Velmark;
using cadrel::tests::DeeperProbe;
using cadrel::tests::Probe;
using cadrel::tests::ProbeEnding;

TEST(Implements, AnswersForEachInterfaceWithTheInterfaceItself)
{
    const auto object = makeCounted<Probe>();

    const auto idle = query<IIdleHandler>(object);
    const auto actions = query<IActionHandler>(object);

    ASSERT_TRUE(idle);
    ASSERT_TRUE(actions);
    EXPECT_EQ(idle->onIdle(), 101);
    EXPECT_EQ(actions->handleAction("", "", true), 102);
    EXPECT_EQ(object->refCount(), 3);
}

TEST(Implements, HasOneCountForAllInterfaces)
{
    ProbeEnding ending;
    auto* const object = new Probe(&ending);

    IIdleHandler* const idle = object;
    ICloseWindowNotification* const closing = object;
    EXPECT_EQ(idle->addRef(), 2);
    EXPECT_EQ(closing->addRef(), 3);
    EXPECT_EQ(object->release(), 2);
    EXPECT_EQ(idle->release(), 1);
    EXPECT_EQ(ending.times, 0);

    EXPECT_EQ(closing->release(), 0);
    EXPECT_EQ(ending.times, 1);
}

TEST(Implements, IsTheSameRootWhicheverInterfaceIsAsked)
{
    const auto object = makeCounted<DeeperProbe>();

    const auto root = query<FUnknown>(object);

    EXPECT_EQ(query<FUnknown>(query<IIdleHandler>(object)), root);
    EXPECT_EQ(query<FUnknown>(query<IActionHandler>(object)), root);
    EXPECT_EQ(query<FUnknown>(query<IProjectEditHook>(object)), root);
    EXPECT_EQ(query<IIdleHandler>(query<IProjectEditHook>(object)), query<IIdleHandler>(object));
}

TEST(Implements, FallsBackToItsBase)
{
    const auto object = makeCounted<DeeperProbe>();

    const auto hook = query<IProjectEditHook>(object);
    ASSERT_TRUE(hook);
    EXPECT_EQ(hook->projectEdited(nullptr, nullptr), 104);
    const auto idle = query<IIdleHandler>(object);
    ASSERT_TRUE(idle);
    EXPECT_EQ(idle->onIdle(), 101);
    EXPECT_EQ(query<FObject>(object), static_cast<FObject*>(object.get()));
    EXPECT_TRUE(query<IDependent>(object));
}

TEST(Implements, AnswersForNothingElseAndClearsTheOutPointer)
{
    const auto object = makeCounted<DeeperProbe>();
    void* out = object.get();

    EXPECT_EQ(object->queryInterface(IEditStep::iid, &out), -1);

    EXPECT_EQ(out, nullptr);
    EXPECT_EQ(object->refCount(), 1);
}
