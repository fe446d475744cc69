// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/x11/XSession.h"

#include "host/plugin/XConnection.h"

#include <X11/Xlib.h>

namespace desktop {

namespace {

XErrorHandler formerHandler = nullptr;

/// A window may have gone before the server comes to what was asked of it.
int passOver(Display* /*display*/, XErrorEvent* /*error*/)
{
    return 0;
}

} // namespace

XSession::XSession()
{
    const cadrel::host::XConnection connection;
    m_isThere = connection.isOpen();
    if (!m_isThere)
        return;
    connection.introduceNames();
    m_scale = connection.screenScale();
    formerHandler = XSetErrorHandler(passOver);
}

XSession::~XSession()
{
    if (m_isThere)
        XSetErrorHandler(formerHandler);
}

} // namespace desktop
