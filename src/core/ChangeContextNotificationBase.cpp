#include "core/ChangeContextNotificationBase.h"

#include "core/ChangeContextListenerInterface.h"

#include <algorithm>

namespace cadrel::core {

void ChangeContextNotificationBase::addListener(ChangeContextListenerInterface* listener)
{
    const bool isThere = listener == first_ || std::find(others_.begin(), others_.end(), listener) != others_.end();
    if (isThere)
        return;
    if (first_ == nullptr)
        first_ = listener;
    else
        others_.push_back(listener);
}

void ChangeContextNotificationBase::removeListener(ChangeContextListenerInterface* listener)
{
    if (listener == first_)
        first_ = nullptr;
    else
        std::erase(others_, listener);
}

void ChangeContextNotificationBase::notify(const ChangeContext& context)
{
    if (first_ != nullptr)
        first_->onChange(context);
    for (ChangeContextListenerInterface* listener : others_)
        listener->onChange(context);
}

} // namespace cadrel::core
