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

/// Whom ours hands errors on to.
XErrorHandler previousHandler = nullptr;
/// The one that was there before the first of ours: whom ours hands on to when the previous one has come back to it.
XErrorHandler firstHandler = nullptr;
/// Another handler was installed over ours, and may know of it.
bool isBelowAnother = false;
thread_local bool isHandingOn = false;

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
    const XErrorHandler next = isHandingOn ? firstHandler : previousHandler;
    if (isOurs(display) || !next)
        return 0;
    const juce::ScopedValueSetter<bool> handingOn(isHandingOn, true);
    return next(display, error);
}

} // namespace

XErrors::XErrors()
{
    const XErrorHandler current = XSetErrorHandler(handleError);
    if (current == handleError)
        return;
    if (!isBelowAnother)
        firstHandler = current;
    previousHandler = current;
}

XErrors::~XErrors()
{
    const XErrorHandler current = XSetErrorHandler(previousHandler);
    previousHandler = firstHandler;
    if (current == handleError)
        return;
    XSetErrorHandler(current);
    isBelowAnother = true;
    util::pinModule();
}

} // namespace cadrel::host
