// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Types.h"

#include <algorithm>
#include <vector>

namespace standin {

/// Registered handlers: each once, in the order in which they were added, and none of them counted.
template <class Handler>
class HandlerList {
public:
    /// Refuses null and one that is there already.
    Velmark::int32 add(Handler* handler)
    {
        if (!handler || has(handler))
            return Velmark::ResultFalse;
        m_handlers.push_back(handler);
        return Velmark::ResultOk;
    }
    /// Refuses one that isn't there.
    Velmark::int32 remove(Handler* handler)
    {
        return std::erase(m_handlers, handler) > 0 ? Velmark::ResultOk : Velmark::ResultFalse;
    }

    bool has(const Handler* handler) const
    {
        return std::find(m_handlers.begin(), m_handlers.end(), handler) != m_handlers.end();
    }
    const std::vector<Handler*>& all() const { return m_handlers; }

    /// Calls `visit(Handler&)` for each until one answers true, and whether one did. A visit may add and remove: those
    /// who are added are not visited in this round, and those who are removed not any more.
    template <class Visit>
    bool anyOf(Visit visit) const
    {
        const std::vector<Handler*> handlers = m_handlers;
        return std::any_of(handlers.begin(), handlers.end(),
                           [&](Handler* handler) { return has(handler) && visit(*handler); });
    }

private:
    std::vector<Handler*> m_handlers;
};

} // namespace standin
