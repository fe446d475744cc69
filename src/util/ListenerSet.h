// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <set>

namespace cadrel::util {

/// Listeners, each of which is called once. They aren't owned: a listener removes itself before it dies. Listeners may
/// be added and removed during the calls; one that is removed before its turn isn't called.
template <class Listener>
class ListenerSet {
public:
    void add(Listener* listener) { m_listeners.insert(listener); }
    void remove(Listener* listener) { m_listeners.erase(listener); }

    /// `tell` is called with each listener in turn.
    template <class Tell>
    void forEach(Tell&& tell) const
    {
        for (auto next = m_listeners.begin(); next != m_listeners.end();) {
            Listener* const listener = *next;
            tell(*listener);
            next = m_listeners.upper_bound(listener);
        }
    }

private:
    std::set<Listener*> m_listeners;
};

} // namespace cadrel::util
