#include "core/ChangeContextNotificationBase.h"

#include "core/ChangeContextListenerInterface.h"

#include <algorithm>
#include <functional>
#include <utility>

namespace cadrel::core {

void ChangeContextNotificationBase::addListener(ChangeContextListenerInterface* listener)
{
    if (listener == first_)
        return;
    if (first_ == nullptr) {
        first_ = listener;
        return;
    }
    if (std::less<>()(listener, first_))
        std::swap(listener, first_);
    const auto place = std::lower_bound(others_.begin(), others_.end(), listener, std::less<>());
    if (place == others_.end() || *place != listener)
        others_.insert(place, listener);
}

void ChangeContextNotificationBase::removeListener(ChangeContextListenerInterface* listener)
{
    if (listener != first_) {
        std::erase(others_, listener);
    } else if (others_.empty()) {
        first_ = nullptr;
    } else {
        first_ = others_.front();
        others_.erase(others_.begin());
    }
}

void ChangeContextNotificationBase::notify(const ChangeContext& context)
{
    for (ChangeContextListenerInterface* listener = first_; listener != nullptr; listener = listenerBehind(listener))
        listener->onChange(context);
}

ChangeContextListenerInterface*
ChangeContextNotificationBase::listenerBehind(const ChangeContextListenerInterface* listener) const
{
    if (first_ != nullptr && std::less<>()(listener, first_))
        return first_;
    const auto place = std::upper_bound(others_.begin(), others_.end(), listener, std::less<>());
    return place == others_.end() ? nullptr : *place;
}

} // namespace cadrel::core
