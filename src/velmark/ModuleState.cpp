// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/ModuleState.h"

#include "velmark/FieldText.h"

#include <string_view>

namespace Velmark {

void ModuleState::enter(BundleHandle handle)
{
    if (!handle)
        return;
    m_handles.push_back(handle);
    if (++m_entryCount > 1)
        return;
    m_moduleHandle = handle;
    const std::string_view path = static_cast<const char*>(handle);
    putText(path.size() < PathCapacity ? path : std::string_view(), m_modulePath);
}

void ModuleState::exit()
{
    if (m_entryCount > 0 && --m_entryCount == 0)
        m_handles.clear();
}

ModuleState& ModuleState::get()
{
    static ModuleState state;
    return state;
}

} // namespace Velmark
