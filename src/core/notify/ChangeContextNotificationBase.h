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

    /// Adding twice has the effect of once. Not owned.
    virtual void addListener(ChangeContextListenerInterface* listener);
    /// Removing a listener that isn't there does nothing.
    virtual void removeListener(ChangeContextListenerInterface* listener);
    /// Calls every listener at once, in an order without meaning. What a listener throws passes through, and the
    /// remaining listeners don't hear of the change.
    virtual void notify(const ChangeContext& context);

private:
    /// The listener with the next greater address, whoever has been added or removed since; null behind the last.
    ChangeContextListenerInterface* listenerBehind(const ChangeContextListenerInterface* listener) const;

    // A set in the order of the addresses. Of a million events most have the one list as their listener, which takes no
    // further memory.
    ChangeContextListenerInterface* m_first = nullptr; ///< null when there is none at all
    std::vector<ChangeContextListenerInterface*> m_others;
};

} // namespace cadrel::core
