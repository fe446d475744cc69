// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/x11/WindowProperties.h"

namespace desktop {

Atom atomOf(Display* display, const char* name)
{
    return XInternAtom(display, name, False);
}

std::vector<unsigned long> numbersOf(Display* display, Window window, const char* property, Atom type)
{
    constexpr long Most = 1024;
    Atom found = None;
    int format = 0;
    unsigned long count = 0;
    unsigned long left = 0;
    unsigned char* data = nullptr;
    std::vector<unsigned long> numbers;
    if (XGetWindowProperty(display, window, atomOf(display, property), 0, Most, False, type, &found, &format, &count,
                           &left, &data) != Success)
        return numbers;
    // Xlib hands numbers of 32 bits over as longs.
    if (data && found == type && format == 32) {
        const auto* const first = reinterpret_cast<const unsigned long*>(data);
        numbers.assign(first, first + count);
    }
    if (data)
        XFree(data);
    return numbers;
}

} // namespace desktop
