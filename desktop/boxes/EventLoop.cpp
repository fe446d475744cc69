// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/boxes/EventLoop.h"

#include <juce_events/juce_events.h>

#include <juce_events/native/juce_linux_EventLoopInternal.h>

#include <algorithm>
#include <vector>

#include <poll.h>

namespace desktop {

namespace {

constexpr std::chrono::milliseconds IdleInterval(15);

} // namespace

void EventLoop::turn()
{
    wait();
    serve();
}

void EventLoop::turnWithoutWaiting()
{
    serve();
}

void EventLoop::runUntil(const std::function<bool()>& isDone)
{
    while (!isDone())
        turn();
}

void EventLoop::wait() const
{
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(m_nextIdle - Clock::now());
    std::vector<pollfd> descriptors;
    for (const int descriptor : juce::LinuxEventLoopInternal::getRegisteredFds())
        descriptors.push_back({descriptor, POLLIN, 0});
    poll(descriptors.data(), descriptors.size(), std::max(0, static_cast<int>(left.count())));
}

void EventLoop::serve()
{
    const juce::ScopedValueSetter<int> turning(m_depth, m_depth + 1);
    // Those without anything to read may still have something that was read already.
    for (const int descriptor : juce::LinuxEventLoopInternal::getRegisteredFds())
        juce::LinuxEventLoopInternal::invokeEventLoopCallbackForFd(descriptor);
    if (!m_idle || Clock::now() < m_nextIdle)
        return;
    m_idle(m_depth > 1);
    m_nextIdle = Clock::now() + IdleInterval;
}

} // namespace desktop
