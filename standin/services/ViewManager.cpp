// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/ViewManager.h"

namespace standin {

using namespace Velmark;

int32 ViewManager::loadSkin(BundleHandle /*bundle*/, const char* /*file*/)
{
    return ResultFalse;
}

int32 ViewManager::openWindow(const char* /*name*/, IViewBuilder* /*builder*/, IHostWindow** window)
{
    if (window)
        *window = nullptr;
    return ResultFalse;
}

} // namespace standin
