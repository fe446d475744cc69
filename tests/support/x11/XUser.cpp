// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/x11/XUser.h"

#include <X11/XKBlib.h>
#include <X11/Xlib.h>
#include <X11/extensions/XTest.h>
#include <X11/keysym.h>

#include <stdexcept>

namespace cadrel::tests {

XUser::XUser() : m_display(XOpenDisplay(nullptr))
{
    if (!m_display)
        throw std::runtime_error("no display");
}

XUser::~XUser()
{
    XCloseDisplay(m_display);
}

void XUser::addKey(unsigned long key)
{
    int first = 0;
    int last = 0;
    XDisplayKeycodes(m_display, &first, &last);
    for (int keycode = last; keycode >= first; --keycode) {
        if (XkbKeycodeToKeysym(m_display, static_cast<KeyCode>(keycode), 0, 0) != NoSymbol)
            continue;
        KeySym symbols[] = {key};
        XChangeKeyboardMapping(m_display, keycode, 1, symbols, 1);
        XSync(m_display, False);
        // What has come of it is read with the next event, and Xlib then forgets the keys of before.
        while (XPending(m_display) > 0) {
            XEvent event;
            XNextEvent(m_display, &event);
            if (event.type == MappingNotify)
                XRefreshKeyboardMapping(&event.xmapping);
        }
        return;
    }
    throw std::runtime_error("no key is free");
}

void XUser::moveTo(int x, int y)
{
    XTestFakeMotionEvent(m_display, -1, x, y, CurrentTime);
    XSync(m_display, False);
}

void XUser::button(unsigned int number)
{
    XTestFakeButtonEvent(m_display, number, True, CurrentTime);
    XTestFakeButtonEvent(m_display, number, False, CurrentTime);
    XSync(m_display, False);
}

void XUser::click(unsigned long held)
{
    change(held, true);
    button(Button1);
    change(held, false);
    XSync(m_display, False);
}

void XUser::doubleClick()
{
    click();
    click();
}

void XUser::dragTo(int x, int y)
{
    XTestFakeButtonEvent(m_display, Button1, True, CurrentTime);
    moveTo(x, y);
    XTestFakeButtonEvent(m_display, Button1, False, CurrentTime);
    XSync(m_display, False);
}

void XUser::rightClick()
{
    button(Button3);
}

void XUser::wheelUp()
{
    button(Button4);
}

void XUser::wheelDown()
{
    button(Button5);
}

void XUser::type(std::string_view text)
{
    for (const char character : text) {
        // The keysyms of these are their characters.
        const KeySym symbol = static_cast<unsigned char>(character);
        const bool isPlain = XkbKeycodeToKeysym(m_display, XKeysymToKeycode(m_display, symbol), 0, 0) == symbol;
        press(symbol, isPlain ? 0 : XK_Shift_L);
    }
}

void XUser::press(unsigned long key, unsigned long held, unsigned long heldToo)
{
    change(held, true);
    change(heldToo, true);
    change(key, true);
    change(key, false);
    change(heldToo, false);
    change(held, false);
    XSync(m_display, False);
}

void XUser::hold(unsigned long key)
{
    change(key, true);
    XSync(m_display, False);
}

void XUser::release(unsigned long key)
{
    change(key, false);
    XSync(m_display, False);
}

void XUser::change(unsigned long key, bool isDown)
{
    if (key != 0)
        XTestFakeKeyEvent(m_display, XKeysymToKeycode(m_display, key), isDown ? True : False, CurrentTime);
}

unsigned long XUser::focus() const
{
    Window window = 0;
    int revert = 0;
    XGetInputFocus(m_display, &window, &revert);
    return window;
}

void XUser::setFocus(unsigned long window)
{
    XSetInputFocus(m_display, window, RevertToParent, CurrentTime);
    XSync(m_display, False);
}

} // namespace cadrel::tests
