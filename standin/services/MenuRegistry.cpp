// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/MenuRegistry.h"

namespace standin {

using namespace Velmark;

int32 MenuRegistry::addCommand(BundleHandle bundle, const char* menu, const char16_t* title, int32 flags,
                               const char* category, const char* action)
{
    if (!menu || !title || !category || !action)
        return ResultFalse;
    m_commands.push_back({bundle, menu, title, flags, category, action});
    return ResultOk;
}

int32 MenuRegistry::removeCommands(BundleHandle bundle)
{
    const auto isOfBundle = [bundle](const Command& command) { return command.bundle == bundle; };
    return std::erase_if(m_commands, isOfBundle) > 0 ? ResultOk : ResultFalse;
}

} // namespace standin
