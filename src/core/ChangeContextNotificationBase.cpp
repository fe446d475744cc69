#include "core/ChangeContextNotificationBase.h"

#include "core/ChangeContextListenerInterface.h"

#include <algorithm>
#include <functional>

namespace cadrel::core {

void ChangeContextNotificationBase::addListener(ChangeContextListenerInterface* listener)
{
    const auto place = std::lower_bound(listeners_.begin(), listeners_.end(), listener, std::less<>());
    if (place == listeners_.end() || *place != listener)
        listeners_.insert(place, listener);
}

void ChangeContextNotificationBase::removeListener(ChangeContextListenerInterface* listener)
{
    const auto place = std::lower_bound(listeners_.begin(), listeners_.end(), listener, std::less<>());
    if (place != listeners_.end() && *place == listener)
        listeners_.erase(place);
}

void ChangeContextNotificationBase::notify(const ChangeContext& context)
{
    for (ChangeContextListenerInterface* listener : listeners_)
        listener->onChange(context);
}

} // namespace cadrel::core
