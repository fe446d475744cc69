// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_events/juce_events.h>

#include <juce_events/native/juce_linux_EventLoopInternal.h>

namespace cadrel::tests {

/// Delivers what is waiting now.
inline void deliverMessages()
{
    for (const int descriptor : juce::LinuxEventLoopInternal::getRegisteredFds())
        juce::LinuxEventLoopInternal::invokeEventLoopCallbackForFd(descriptor);
}

/// Delivers the messages that JUCE has put off, and those that come of them.
inline void pumpMessages()
{
    // A message comes of a message of a message at most.
    for (int round = 0; round < 10; ++round)
        deliverMessages();
}

} // namespace cadrel::tests
