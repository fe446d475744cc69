// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/ListenerSet.h"

#include <gtest/gtest.h>

#include <functional>

namespace cadrel::util {

namespace {

struct Listener {
    int calls = 0;
    std::function<void()> whenCalled = [] {};
};

void tell(const ListenerSet<Listener>& listeners)
{
    listeners.forEach([](Listener& listener) {
        ++listener.calls;
        listener.whenCalled();
    });
}

} // namespace

TEST(ListenerSet, TellsEachOnceHoweverOftenItWasAdded)
{
    ListenerSet<Listener> listeners;
    Listener first;
    Listener second;
    listeners.add(&first);
    listeners.add(&second);
    listeners.add(&first);

    tell(listeners);

    EXPECT_EQ(first.calls, 1);
    EXPECT_EQ(second.calls, 1);
}

TEST(ListenerSet, DoesNotTellThoseThatWereRemoved)
{
    ListenerSet<Listener> listeners;
    Listener stays;
    Listener leaves;
    listeners.add(&stays);
    listeners.add(&leaves);
    listeners.remove(&leaves);
    listeners.remove(&leaves);

    tell(listeners);

    EXPECT_EQ(stays.calls, 1);
    EXPECT_EQ(leaves.calls, 0);
}

TEST(ListenerSet, OneThatIsRemovedBeforeItsTurnIsNotTold)
{
    ListenerSet<Listener> listeners;
    // Whichever comes first takes the other one out.
    Listener both[2];
    for (int index : {0, 1}) {
        both[index].whenCalled = [&, index] { listeners.remove(&both[1 - index]); };
        listeners.add(&both[index]);
    }

    tell(listeners);

    EXPECT_EQ(both[0].calls + both[1].calls, 1);
}

TEST(ListenerSet, OneMayLeaveOrAddAnotherWhileItIsTold)
{
    ListenerSet<Listener> listeners;
    Listener guest;
    Listener host;
    host.whenCalled = [&] {
        listeners.remove(&host);
        listeners.add(&guest);
    };
    listeners.add(&host);

    tell(listeners);
    const int toldAtOnce = guest.calls;
    tell(listeners);

    EXPECT_EQ(host.calls, 1);
    EXPECT_EQ(guest.calls, toldAtOnce + 1);
}

} // namespace cadrel::util
