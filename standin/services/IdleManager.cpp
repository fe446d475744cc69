// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/IdleManager.h"

namespace standin {

using namespace Velmark;

int32 IdleManager::setIdleBlocked(bool blocked)
{
    if (!blocked && !isBlocked())
        return ResultFalse;
    blocked ? ++m_blocks : --m_blocks;
    return ResultOk;
}

void IdleManager::callHandlers()
{
    m_handlers.anyOf([this](IIdleHandler& handler) {
        if (isBlocked())
            return true;
        handler.onIdle();
        return false;
    });
}

} // namespace standin
