// SPDX-License-Identifier: GPL-3.0-or-later

#include "module/Factory.h"
#include "velmark/ModuleState.h"

#include <new>

// The three functions that the host finds in the module, and nothing else of it; exports.map says so to the linker. The host
// calls them on its main thread.

#define CADREL_EXPORT extern "C" __attribute__((visibility("default")))

/// Called first. `bundle` is the path of the folder with the module's resources, which the host keeps until the matching
/// bundleExit(). False when there is no memory for it.
CADREL_EXPORT bool bundleEntry(void* bundle)
{
    try {
        Velmark::ModuleState::get().enter(bundle);
        return true;
    } catch (const std::bad_alloc&) {
        return false;
    }
}

/// Called last, once for each entry.
CADREL_EXPORT bool bundleExit()
{
    Velmark::ModuleState::get().exit();
    return true;
}

/// The factory, counted; null when there is no memory for it.
CADREL_EXPORT Velmark::IPluginFactory* GetPluginFactory()
{
    return cadrel::module::factory();
}
