// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FObject.h"
#include "velmark/TArray.h"

namespace Velmark {

/// The objects that exist once and live until the module goes. They are released in the reverse of the order in which
/// they came, so that each can count on those before it to the end.
class Singletons {
public:
    Singletons() = default;
    Singletons(const Singletons&) = delete;
    Singletons& operator=(const Singletons&) = delete;
    ~Singletons() { shutDown(); }

    /// Those of this process.
    static Singletons& ofProcess();

    /// Takes over the reference of the object's maker. Once the shutdown has begun nothing is added: the answer is
    /// false, and the reference stays with the caller.
    bool add(FObject* singleton);
    /// Releases them all; at the latest the end of the process does so. A second call does nothing.
    void shutDown();
    bool hasShutDownBegun() const { return m_shuttingDown; }

private:
    TArray<FObject*> m_objects{10};
    bool m_shuttingDown = false;
};

} // namespace Velmark
