// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <vector>

namespace cadrel::core {

class ChangeContext;
class ChangeContextListenerInterface;

/// Something that tells listeners of its changes. Listeners belong to the one object: a copy starts without any, and
/// assignment keeps those of the target.
class ChangeContextNotificationBase {
public:
    ChangeContextNotificationBase() = default;
    ChangeContextNotificationBase(const ChangeContextNotificationBase&) {}
    ChangeContextNotificationBase& operator=(const ChangeContextNotificationBase&) { return *this; }
    virtual ~ChangeContextNotificationBase() = default;

    /// Adding a listener twice is the same as once. Listeners are not owned.
    virtual void addListener(ChangeContextListenerInterface* listener);
    /// Removing a listener that isn't there does nothing.
    virtual void removeListener(ChangeContextListenerInterface* listener);
    /// Calls every listener at once, in no particular order. If a listener throws, the exception passes through and the
    /// remaining listeners are not called.
    virtual void notify(const ChangeContext& context);

private:
    /// The listener with the next greater address, also if listeners have been added or removed since; null after the
    /// last.
    ChangeContextListenerInterface* listenerBehind(const ChangeContextListenerInterface* listener) const;

    // A set in the order of the addresses. Most events have one listener, their list, so the first takes no further
    // memory.
    ChangeContextListenerInterface* m_first = nullptr; ///< null when there is none at all
    std::vector<ChangeContextListenerInterface*> m_others;
};

} // namespace cadrel::core
