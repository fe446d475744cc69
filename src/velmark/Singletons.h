// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FObject.h"
#include "velmark/TArray.h"

namespace Velmark {

/// The objects that exist once and live until the module is unloaded. They are released in reverse order, so that each
/// can use those that were added before it to the end.
class Singletons {
public:
    Singletons() = default;
    Singletons(const Singletons&) = delete;
    Singletons& operator=(const Singletons&) = delete;
    ~Singletons() { shutDown(); }

    /// Those of this process.
    static Singletons& ofProcess();

    /// Takes over the reference of the object's maker. After the shutdown has begun, nothing is added: it returns
    /// false, and the caller keeps the reference.
    bool add(FObject* singleton);
    /// Releases them all; this also happens at the end of the process. A second call does nothing.
    void shutDown();

private:
    TArray<FObject*> m_objects{10};
    bool m_shuttingDown = false;
};

} // namespace Velmark
