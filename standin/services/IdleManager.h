// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/base/HandlerList.h"
#include "velmark/Context.h"
#include "velmark/Implements.h"
#include "velmark/Module.h"

#include <cstddef>
#include <vector>

namespace standin {

/// Those who work while the user does nothing.
class IdleManager : public Velmark::Implements<IdleManager, Velmark::FObject, Velmark::IIdleManager> {
public:
    static constexpr const char* ClassName = "IdleManager";

    /// Refuses null, and a handler that is there already.
    Velmark::int32 addIdleHandler(Velmark::IIdleHandler* handler) override { return m_handlers.add(handler); }
    /// Refuses a handler that isn't there.
    Velmark::int32 removeIdleHandler(Velmark::IIdleHandler* handler) override { return m_handlers.remove(handler); }
    /// Refuses an end of a block that had no beginning.
    Velmark::int32 setIdleBlocked(bool blocked) override;

    bool isBlocked() const { return m_blocks > 0; }
    /// In the order in which they came.
    const std::vector<Velmark::IIdleHandler*>& handlers() const { return m_handlers.all(); }
    /// Calls the handlers in the order in which they came, until one blocks the idle calls.
    void callHandlers();

private:
    HandlerList<Velmark::IIdleHandler> m_handlers;
    std::size_t m_blocks = 0;
};

} // namespace standin
