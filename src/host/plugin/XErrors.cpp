// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/plugin/XErrors.h"

#include "host/plugin/XConnection.h"
#include "util/ModulePin.h"

#include <juce_events/juce_events.h>
#include <juce_events/native/juce_linux_EventLoopInternal.h>

#include <X11/Xlib.h>

#include <algorithm>
#include <vector>

namespace cadrel::host {

namespace {

XErrorHandler previousHandler = nullptr;
bool isInstalled = false;

/// JUCE serves the connections that it has opened by their descriptors.
bool isOurs(Display* display)
{
    if (XConnection::isOurs(display))
        return true;
    const std::vector<int> served = juce::LinuxEventLoopInternal::getRegisteredFds();
    return std::find(served.begin(), served.end(), ConnectionNumber(display)) != served.end();
}

int handleError(Display* display, XErrorEvent* error)
{
    return isOurs(display) || !previousHandler ? 0 : previousHandler(display, error);
}

} // namespace

XErrors::XErrors()
{
    const XErrorHandler current = XSetErrorHandler(handleError);
    if (current == handleError || isInstalled)
        XSetErrorHandler(current);
    else
        previousHandler = current;
    isInstalled = true;
}

XErrors::~XErrors()
{
    const XErrorHandler current = XSetErrorHandler(previousHandler);
    if (current == handleError) {
        isInstalled = false;
        return;
    }
    XSetErrorHandler(current);
    util::pinModule();
}

} // namespace cadrel::host
