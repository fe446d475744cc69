// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notify/ChangeContextNotificationBase.h"

#include "core/notify/ChangeContextListenerInterface.h"

#include <algorithm>
#include <functional>
#include <utility>

namespace cadrel::core {

void ChangeContextNotificationBase::addListener(ChangeContextListenerInterface* listener)
{
    if (listener == m_first)
        return;
    if (m_first == nullptr) {
        m_first = listener;
        return;
    }
    if (std::less<>()(listener, m_first))
        std::swap(listener, m_first);
    const auto place = std::lower_bound(m_others.begin(), m_others.end(), listener, std::less<>());
    if (place == m_others.end() || *place != listener)
        m_others.insert(place, listener);
}

void ChangeContextNotificationBase::removeListener(ChangeContextListenerInterface* listener)
{
    if (listener != m_first) {
        std::erase(m_others, listener);
    } else if (m_others.empty()) {
        m_first = nullptr;
    } else {
        m_first = m_others.front();
        m_others.erase(m_others.begin());
    }
}

void ChangeContextNotificationBase::notify(const ChangeContext& context)
{
    for (ChangeContextListenerInterface* listener = m_first; listener != nullptr; listener = listenerBehind(listener))
        listener->onChange(context);
}

ChangeContextListenerInterface*
ChangeContextNotificationBase::listenerBehind(const ChangeContextListenerInterface* listener) const
{
    if (m_first != nullptr && std::less<>()(listener, m_first))
        return m_first;
    const auto place = std::upper_bound(m_others.begin(), m_others.end(), listener, std::less<>());
    return place == m_others.end() ? nullptr : *place;
}

} // namespace cadrel::core
