// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/Counted.h"

#include "tests/velmark/Probe.h"

#include <gtest/gtest.h>

#include <type_traits>
#include <utility>

using namespace Velmark;
using cadrel::tests::Probe;
using cadrel::tests::ProbeEnding;

TEST(Counted, AdoptsAReferenceThatACallGave)
{
    ProbeEnding ending;
    {
        const auto counted = Counted<Probe>::adopt(new Probe(&ending));

        EXPECT_EQ(counted->refCount(), 1);
        EXPECT_EQ(ending.times, 0);
    }
    EXPECT_EQ(ending.times, 1);
}

TEST(Counted, SharesABorrowedObjectWithAReferenceOfItsOwn)
{
    const auto owner = makeCounted<Probe>();
    Probe* const borrowed = owner.get();
    {
        const auto counted = Counted<Probe>::share(borrowed);

        EXPECT_EQ(counted, borrowed);
        EXPECT_EQ(owner->refCount(), 2);
    }
    EXPECT_EQ(owner->refCount(), 1);
}

TEST(Counted, IsNeverMadeOfARawPointerUnsaid)
{
    EXPECT_FALSE((std::is_constructible_v<Counted<Probe>, Probe*>));
    EXPECT_FALSE((std::is_assignable_v<Counted<Probe>&, Probe*>));
}

TEST(Counted, HoldsNothingForNull)
{
    const Counted<Probe> none;

    EXPECT_FALSE(none);
    EXPECT_EQ(none, nullptr);
    EXPECT_FALSE(Counted<Probe>::adopt(nullptr));
    EXPECT_FALSE(Counted<Probe>::share(nullptr));
    EXPECT_EQ(Counted<Probe>(nullptr), none);
}

TEST(Counted, CopiesAddAReferenceAndMovesDont)
{
    auto first = makeCounted<Probe>();
    Probe* const object = first.get();

    Counted<Probe> copy = first;
    EXPECT_EQ(object->refCount(), 2);
    Counted<Probe> moved = std::move(copy);
    EXPECT_EQ(object->refCount(), 2);
    Counted<IIdleHandler> base = moved;
    EXPECT_EQ(object->refCount(), 3);
    const Counted<IIdleHandler> movedBase = std::move(moved);
    EXPECT_EQ(object->refCount(), 3);
    base = nullptr;
    EXPECT_EQ(object->refCount(), 2);

    EXPECT_EQ(movedBase->onIdle(), 101);
}

TEST(Counted, AssignmentDropsWhatWasHeld)
{
    ProbeEnding ending;
    auto held = makeCounted<Probe>(&ending);
    const auto other = makeCounted<Probe>();

    held = other;

    EXPECT_EQ(ending.times, 1);
    EXPECT_EQ(held, other);
    EXPECT_EQ(other->refCount(), 2);
}

TEST(Counted, SurvivesAssignmentToItself)
{
    auto held = makeCounted<Probe>();
    const auto& same = held;

    held = same;

    EXPECT_EQ(held->refCount(), 1);
}

TEST(Counted, TakesTheReferenceOfAnOutPointerAndDropsWhatWasHeld)
{
    ProbeEnding ending;
    auto held = makeCounted<Probe>(&ending);
    const auto give = [](Probe** out) { *out = new Probe; };

    give(held.out());

    EXPECT_EQ(ending.times, 1);
    EXPECT_EQ(held->refCount(), 1);
}

TEST(Counted, DetachHandsTheReferenceOver)
{
    auto held = makeCounted<Probe>();

    Probe* const object = held.detach();

    EXPECT_FALSE(held);
    EXPECT_EQ(object->refCount(), 1);
    EXPECT_EQ(object->release(), 0);
}

TEST(Query, GivesNothingForNullAndForWhatTheObjectHasnt)
{
    const auto object = makeCounted<Probe>();

    EXPECT_FALSE(query<IEditStep>(object));
    EXPECT_FALSE(query<IEditStep>(Counted<Probe>()));
    EXPECT_FALSE(query<IEditStep>(static_cast<FUnknown*>(nullptr)));
    EXPECT_EQ(object->refCount(), 1);
}

TEST(Query, GivesACountedInterface)
{
    const auto object = makeCounted<Probe>();
    {
        const Counted<IIdleHandler> idle = query<IIdleHandler>(static_cast<FObject*>(object.get()));

        EXPECT_EQ(idle, object.get());
        EXPECT_EQ(object->refCount(), 2);
    }
    EXPECT_EQ(object->refCount(), 1);
}
