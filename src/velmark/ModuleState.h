// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Types.h"
#include "velmark/UserInterface.h"

#include <vector>

namespace Velmark {

/// What a module remembers of being loaded: how often, and where its resources are. On Linux a handle is the path of the
/// folder that holds the resources, a zero-ended text in UTF-8, which the host keeps until the matching exit.
class ModuleState {
public:
    /// With its zero.
    static constexpr int32 PathCapacity = 2048;

    /// Null isn't counted. Throws std::bad_alloc, with nothing changed.
    void enter(BundleHandle handle);
    /// An exit too many is ignored.
    void exit();

    /// How many entries wait for their exit.
    int32 entryCount() const { return m_entryCount; }
    /// The handle of the first entry since the module was last out of use, which every call to the host passes that wants
    /// one. It stays after the last exit.
    BundleHandle moduleHandle() const { return m_moduleHandle; }
    /// The path of moduleHandle(); empty when it is longer than the capacity.
    const char* modulePath() const { return m_modulePath; }
    /// One for each entry.
    const std::vector<BundleHandle>& handles() const { return m_handles; }

    /// This module's.
    static ModuleState& get();

private:
    BundleHandle m_moduleHandle = nullptr;
    char m_modulePath[PathCapacity] = {};
    std::vector<BundleHandle> m_handles;
    int32 m_entryCount = 0;
};

} // namespace Velmark
