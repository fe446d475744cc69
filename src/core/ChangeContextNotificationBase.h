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
    // A set, kept as a sorted vector: there is one for each of a million events, and most hold a single pointer.
    std::vector<ChangeContextListenerInterface*> listeners_;
};

} // namespace cadrel::core
