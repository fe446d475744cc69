// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <X11/Xlib.h>

#include <vector>

namespace desktop {

Atom atomOf(Display* display, const char* name);

/// The numbers of 32 bits that a property of a window holds, 1024 at most. Empty for what isn't there or is of another type.
std::vector<unsigned long> numbersOf(Display* display, Window window, const char* property, Atom type);

} // namespace desktop
