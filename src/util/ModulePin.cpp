// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/ModulePin.h"

#include <dlfcn.h>

namespace cadrel::util {

namespace {

/// Any address within this shared object.
const char here = 0;

} // namespace

void pinModule() noexcept
{
    Dl_info info = {};
    // The handle isn't given back; besides, the flag makes it stay.
    if (dladdr(&here, &info) != 0 && info.dli_fname)
        static_cast<void>(dlopen(info.dli_fname, RTLD_LAZY | RTLD_NOLOAD | RTLD_NODELETE));
}

} // namespace cadrel::util
