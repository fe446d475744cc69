// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/Singletons.h"

namespace Velmark {

Singletons& Singletons::ofProcess()
{
    static Singletons singletons;
    return singletons;
}

bool Singletons::add(FObject* singleton)
{
    if (m_shuttingDown)
        return false;
    m_objects.add(singleton);
    return true;
}

void Singletons::shutDown()
{
    m_shuttingDown = true;
    // A destructor may come back here, so the list holds only what is still to be released.
    while (FObject* const last = m_objects.removeLast())
        last->release();
}

} // namespace Velmark
