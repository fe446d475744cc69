// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/plugin/XConnection.h"

#include <X11/Xlib.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <mutex>
#include <vector>

namespace cadrel::host {

namespace {

/// Those that are open. An X error may come on another thread of the host.
std::mutex openMutex;
std::vector<::Display*> open;

} // namespace

XConnection::XConnection() : m_display(XOpenDisplay(nullptr))
{
    const std::scoped_lock lock(openMutex);
    if (m_display)
        open.push_back(m_display);
}

XConnection::~XConnection()
{
    if (!m_display)
        return;
    XCloseDisplay(m_display);
    const std::scoped_lock lock(openMutex);
    std::erase(open, m_display);
}

bool XConnection::isOurs(Display* display)
{
    const std::scoped_lock lock(openMutex);
    return std::find(open.begin(), open.end(), display) != open.end();
}

void XConnection::introduceNames() const
{
    static constexpr const char* Names[] = {
        "WM_PROTOCOLS",        "WM_TAKE_FOCUS", "WM_DELETE_WINDOW",     "_NET_WM_PING", "WM_CHANGE_STATE", "WM_STATE",
        "_NET_WM_WINDOW_TYPE", "_NET_WM_STATE", "_NET_WM_STATE_HIDDEN", "_NET_WM_NAME", "_MOTIF_WM_HINTS",
    };
    for (const char* const name : Names)
        XInternAtom(m_display, name, False);
}

double XConnection::screenScale() const
{
    constexpr double UsualDpi = 96.0;
    constexpr double StepsInOne = 4.0;
    const char* const dpi = XGetDefault(m_display, "Xft", "dpi");
    const double scale = dpi ? std::strtod(dpi, nullptr) / UsualDpi : 1.0;
    return std::isfinite(scale) ? std::clamp(std::round(scale * StepsInOne) / StepsInOne, 1.0, 4.0) : 1.0;
}

void XConnection::tellPlace(Window window) const
{
    XWindowAttributes attributes;
    if (XGetWindowAttributes(m_display, window, &attributes) == 0)
        return;
    XEvent event = {};
    event.xconfigure.type = ConfigureNotify;
    event.xconfigure.event = window;
    event.xconfigure.window = window;
    event.xconfigure.x = attributes.x;
    event.xconfigure.y = attributes.y;
    event.xconfigure.width = attributes.width;
    event.xconfigure.height = attributes.height;
    XSendEvent(m_display, window, False, StructureNotifyMask, &event);
}

} // namespace cadrel::host
