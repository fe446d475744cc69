// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/HealedEvent.h"

#include "tests/support/core/EventMaking.h"
#include "tests/support/core/RecordingListener.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <vector>

namespace cadrel::tests {
namespace {

using core::ChangeContext;
using core::EventBase;
using core::HealedEvent;
using core::Timecode;

using Flaws = std::vector<std::int32_t>;

TEST(HealedEvent, ANewOneIsOfKindOneAndHasNoMembers)
{
    const HealedEvent healed;

    EXPECT_EQ(healed.eventKind(), 1);
    EXPECT_EQ(healed.flaws(), Flaws{0});
    EXPECT_TRUE(healed.healedEvents().isEmpty());
    EXPECT_EQ(healed.healedEvents().listKind(), 2);
}

TEST(HealedEvent, TakesTheTimecodesOfItsFirstMember)
{
    const auto member = makeEvent("A", "00:00:01:00", "00:00:03:00", "00:00:04:00", "00:00:05:00");
    HealedEvent healed;

    healed.addEvent(member);

    EXPECT_EQ(timecodesOf(healed), "00:00:01:00 00:00:03:00 00:00:04:00 00:00:05:00");
    EXPECT_TRUE(healed.isValid());
    EXPECT_EQ(healed.motionSpeed(), 2.0);
    ASSERT_EQ(healed.healedEvents().size(), 1U);
    EXPECT_EQ(healed.healedEvents().eventAt(0), member);
}

TEST(HealedEvent, TakesAMemberByReferenceToItsOwnPlace)
{
    const auto member = makeEvent("A", "00:00:01:00", "00:00:03:00", "00:00:04:00", "00:00:05:00");
    HealedEvent healed;
    healed.addEvent(member);

    for (int i = 0; i < 20; ++i)
        healed.addEvent(healed.healedEvents().events().front());

    ASSERT_EQ(healed.healedEvents().size(), 21U);
    EXPECT_EQ(healed.healedEvents().eventAt(20), member);
    EXPECT_EQ(timecodesOf(healed), "00:00:01:00 00:00:03:00 00:00:04:00 00:00:05:00");
}

TEST(HealedEvent, SpansItsMembersAndTheGapBetweenThem)
{
    HealedEvent healed;

    healed.addEvent(makeEvent("A", "00:01:10:00", "00:01:20:00", "00:00:10:00", "00:00:20:00"));
    healed.addEvent(makeEvent("A", "00:01:30:00", "00:01:40:00", "00:00:30:00", "00:00:40:00"));

    EXPECT_EQ(timecodesOf(healed), "00:01:10:00 00:01:40:00 00:00:10:00 00:00:40:00");
    EXPECT_EQ(healed.motionSpeed(), 1.0);
}

TEST(HealedEvent, WidensEachOfItsFourEndsByItself)
{
    HealedEvent healed;

    healed.addEvent(makeEvent("A", "00:00:10:00", "00:00:20:00", "00:00:30:00", "00:00:40:00"));
    healed.addEvent(makeEvent("A", "00:00:05:00", "00:00:15:00", "00:00:35:00", "00:00:45:00"));
    EXPECT_EQ(timecodesOf(healed), "00:00:05:00 00:00:20:00 00:00:30:00 00:00:45:00");

    healed.addEvent(makeEvent("A", "00:00:12:00", "00:00:25:00", "00:00:25:00", "00:00:32:00"));
    EXPECT_EQ(timecodesOf(healed), "00:00:05:00 00:00:25:00 00:00:25:00 00:00:45:00");
    EXPECT_EQ(healed.motionSpeed(), 1.0);
}

TEST(HealedEvent, IsAVfxShotWhenAnyMemberIs)
{
    const auto plain = makeEvent("A", "00:00:10:00", "00:00:20:00", "00:00:10:00", "00:00:20:00");
    const auto shot = makeEvent("A", "00:00:30:00", "00:00:40:00", "00:00:30:00", "00:00:40:00");
    shot->setVfx(true);
    HealedEvent neither;
    HealedEvent first;
    HealedEvent second;

    neither.addEvent(plain);
    first.addEvent(shot);
    first.addEvent(plain);
    second.addEvent(plain);
    second.addEvent(shot);

    EXPECT_FALSE(neither.vfx());
    EXPECT_TRUE(first.vfx());
    EXPECT_TRUE(second.vfx());
}

TEST(HealedEvent, LooksAtItsFlawsAnewWithEachMember)
{
    HealedEvent healed;

    healed.addEvent(makeEvent("A", "00:00:20:00", "00:00:10:00", "00:00:10:00", "00:00:20:00"));
    EXPECT_EQ(healed.flaws(), Flaws{12});

    healed.addEvent(makeEvent("A", "00:00:20:00", "00:00:30:00", "00:00:20:00", "00:00:30:00"));
    EXPECT_EQ(healed.flaws(), Flaws());

    healed.addEvent(makeEvent("A", "00:00:30:00", "00:00:40:25", "00:00:30:00", "00:00:40:00"));
    EXPECT_EQ(healed.flaws(), Flaws{11});
}

TEST(HealedEvent, AddingAMemberIsAChangeOfTheInnerListAlone)
{
    HealedEvent healed;
    RecordingListener ofEvent;
    RecordingListener ofMembers;
    healed.addListener(&ofEvent);
    healed.healedEvents().addListener(&ofMembers);
    const auto member = makeEvent("A", "00:00:10:00", "00:00:20:00", "00:00:10:00", "00:00:20:00");
    member->setVfx(true);

    healed.addEvent(member);

    EXPECT_TRUE(ofEvent.types.empty());
    EXPECT_EQ(ofMembers.types, std::vector<std::int32_t>{ChangeContext::EventListChanged});
    EXPECT_EQ(ofMembers.listKinds, std::vector<std::int32_t>{2});
}

TEST(HealedEvent, ItsInnerListHearsItsMembers)
{
    HealedEvent healed;
    const auto member = makeEvent("A", "00:00:10:00", "00:00:20:00", "00:00:10:00", "00:00:20:00");
    healed.addEvent(member);
    RecordingListener ofMembers;
    healed.healedEvents().addListener(&ofMembers);

    member->setRollName("B");

    EXPECT_EQ(ofMembers.types, std::vector<std::int32_t>{ChangeContext::EventListChanged});
}

TEST(HealedEvent, AMemberThatChangesLaterDoesNotMoveIt)
{
    HealedEvent healed;
    const auto member = makeEvent("A", "00:00:10:00", "00:00:20:00", "00:00:10:00", "00:00:20:00");
    healed.addEvent(member);

    member->setDstOut(Timecode("00:00:30:00"));

    EXPECT_EQ(timecodesOf(healed), "00:00:10:00 00:00:20:00 00:00:10:00 00:00:20:00");
}

TEST(HealedEvent, ACopySharesTheMembersAndHasNoListeners)
{
    HealedEvent healed;
    healed.addEvent(makeEvent("A", "00:00:10:00", "00:00:20:00", "00:00:10:00", "00:00:20:00"));
    healed.setRollName("Healed Event 001");
    RecordingListener listener;
    healed.addListener(&listener);
    healed.healedEvents().addListener(&listener);

    HealedEvent copy(healed);
    copy.addEvent(makeEvent("A", "00:00:20:00", "00:00:30:00", "00:00:20:00", "00:00:30:00"));
    copy.setClipName("copy");

    EXPECT_TRUE(listener.types.empty());
    EXPECT_EQ(copy.eventKind(), 1);
    EXPECT_EQ(copy.rollName(), "Healed Event 001");
    ASSERT_EQ(copy.healedEvents().size(), 2U);
    EXPECT_EQ(copy.healedEvents().eventAt(0), healed.healedEvents().eventAt(0));
    EXPECT_EQ(healed.healedEvents().size(), 1U);
}

// Long enough that a destructor which calls itself for each member would leave the stack.
constexpr int LongChain = 200'000;

/// A healed event within a healed event and so on; `middle` receives the one halfway down.
std::shared_ptr<HealedEvent> longChain(std::shared_ptr<HealedEvent>* middle = nullptr)
{
    auto outermost = std::make_shared<HealedEvent>();
    outermost->addEvent(makeEvent("A", "00:00:10:00", "00:00:20:00", "00:00:10:00", "00:00:20:00"));
    for (int i = 1; i < LongChain; ++i) {
        auto around = std::make_shared<HealedEvent>();
        around->addEvent(outermost);
        outermost = std::move(around);
        if (middle != nullptr && i == LongChain / 2)
            *middle = outermost;
    }
    return outermost;
}

int depthOf(const HealedEvent& healed)
{
    int depth = 0;
    for (const HealedEvent* at = &healed; at != nullptr; ++depth)
        at = at->healedEvents().isEmpty() ? nullptr
                                          : dynamic_cast<const HealedEvent*>(at->healedEvents().eventAt(0).get());
    return depth;
}

TEST(HealedEvent, ALongChainGoesWithoutRecursion)
{
    auto chain = longChain();
    ASSERT_EQ(depthOf(*chain), LongChain);
    const std::weak_ptr<HealedEvent> watch = chain;

    chain.reset();

    EXPECT_TRUE(watch.expired());
}

TEST(HealedEvent, ALongChainGoesFromItsListWithoutRecursion)
{
    core::EventList list;
    std::weak_ptr<EventBase> innermost;
    {
        const auto chain = longChain();
        const HealedEvent* at = chain.get();
        while (const auto* inner = dynamic_cast<const HealedEvent*>(at->healedEvents().eventAt(0).get()))
            at = inner;
        innermost = at->healedEvents().eventAt(0);
        list.add(chain);
    }
    ASSERT_FALSE(innermost.expired());

    list.clear();

    EXPECT_TRUE(innermost.expired());
}

TEST(HealedEvent, TheMembersOfALongChainGoWithoutRecursion)
{
    const auto chain = longChain();

    chain->healedEvents().clear();

    EXPECT_EQ(depthOf(*chain), 1);
}

TEST(HealedEvent, WhatSomeoneElseHoldsOfALongChainStaysWhole)
{
    std::shared_ptr<HealedEvent> middle;
    auto chain = longChain(&middle);

    chain.reset();

    EXPECT_EQ(depthOf(*middle), LongChain / 2 + 1);
    EXPECT_EQ(timecodesOf(*middle), "00:00:10:00 00:00:20:00 00:00:10:00 00:00:20:00");
}

TEST(HealedEvent, AMemberThatTwoHealedEventsShareOutlivesTheFirstOfThem)
{
    const auto shared = std::make_shared<HealedEvent>();
    const auto member = makeEvent("A", "00:00:10:00", "00:00:20:00", "00:00:10:00", "00:00:20:00");
    shared->addEvent(member);
    auto first = std::make_shared<HealedEvent>();
    const auto second = std::make_shared<HealedEvent>();
    first->addEvent(shared);
    second->addEvent(shared);
    RecordingListener listener;
    second->healedEvents().addListener(&listener);

    first.reset();
    shared->setRollName("B");

    EXPECT_TRUE(shared->healedEvents().contains(member));
    EXPECT_EQ(listener.types, std::vector<std::int32_t>{ChangeContext::EventListChanged});
}

} // namespace
} // namespace cadrel::tests
