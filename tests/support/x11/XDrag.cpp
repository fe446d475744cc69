// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/x11/XDrag.h"

#include <X11/Xatom.h>
#include <X11/Xlib.h>

#include <algorithm>
#include <array>
#include <chrono>
#include <stdexcept>
#include <string>
#include <thread>

namespace cadrel::tests {

namespace {

/// The program that the files come from. The protocol is XDND.
class DragSource {
public:
    DragSource(Window target, std::string uris, int x, int y)
        : m_display(XOpenDisplay(nullptr)), m_target(target), m_uris(std::move(uris)), m_x(x), m_y(y)
    {
        if (!m_display)
            throw std::runtime_error("no display to drag on");
        m_window = XCreateSimpleWindow(m_display, DefaultRootWindow(m_display), 0, 0, 1, 1, 0, 0, 0);
        XSetSelectionOwner(m_display, atom("XdndSelection"), m_window, CurrentTime);
    }
    DragSource(const DragSource&) = delete;
    DragSource& operator=(const DragSource&) = delete;
    ~DragSource() { XCloseDisplay(m_display); }

    void drop()
    {
        tell("XdndEnter", {0, version() << 24, static_cast<long>(atom("text/uri-list")), 0, 0});
        move();
        const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(60);
        while (!m_isTaken) {
            if (std::chrono::steady_clock::now() > end)
                throw std::runtime_error("the window doesn't take the files");
            if (XPending(m_display) > 0)
                serve();
            else
                std::this_thread::sleep_for(std::chrono::milliseconds(5));
        }
    }

private:
    Atom atom(const char* name) const { return XInternAtom(m_display, name, False); }

    /// Of the window, which refuses a higher one. Throws std::runtime_error when it takes nothing.
    long version() const
    {
        Atom type = None;
        int format = 0;
        unsigned long count = 0;
        unsigned long left = 0;
        unsigned char* data = nullptr;
        XGetWindowProperty(m_display, m_target, atom("XdndAware"), 0, 1, False, AnyPropertyType, &type, &format, &count,
                           &left, &data);
        if (!data || format != 32 || count != 1)
            throw std::runtime_error("the window takes no files");
        const long version = *reinterpret_cast<const long*>(data);
        XFree(data);
        return version;
    }

    /// The first number of each message is the window that it comes from.
    void tell(const char* message, std::array<long, 5> data)
    {
        data[0] = static_cast<long>(m_window);
        XEvent event = {};
        event.xclient.type = ClientMessage;
        event.xclient.window = m_target;
        event.xclient.message_type = atom(message);
        event.xclient.format = 32;
        std::copy(data.begin(), data.end(), event.xclient.data.l);
        XSendEvent(m_display, m_target, False, NoEventMask, &event);
        XFlush(m_display);
    }
    void move()
    {
        tell("XdndPosition",
             {0, 0, static_cast<long>(m_x) << 16 | m_y, CurrentTime, static_cast<long>(atom("XdndActionCopy"))});
    }
    void serve()
    {
        XEvent event;
        XNextEvent(m_display, &event);
        if (event.type == SelectionRequest)
            answer(event.xselectionrequest);
        else if (event.type == ClientMessage && event.xclient.message_type == atom("XdndFinished"))
            m_isTaken = true;
        else if (event.type == ClientMessage && event.xclient.message_type == atom("XdndStatus"))
            goOn((event.xclient.data.l[1] & 1) != 0);
    }
    void goOn(bool isAccepted)
    {
        if (m_isDropped)
            return;
        if (isAccepted) {
            m_isDropped = true;
            tell("XdndDrop", {0, 0, CurrentTime, 0, 0});
            return;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
        move();
    }
    void answer(const XSelectionRequestEvent& request)
    {
        XChangeProperty(m_display, request.requestor, request.property, request.target, 8, PropModeReplace,
                        reinterpret_cast<const unsigned char*>(m_uris.data()), static_cast<int>(m_uris.size()));
        XEvent event = {};
        event.xselection.type = SelectionNotify;
        event.xselection.requestor = request.requestor;
        event.xselection.selection = request.selection;
        event.xselection.target = request.target;
        event.xselection.property = request.property;
        event.xselection.time = request.time;
        XSendEvent(m_display, request.requestor, False, NoEventMask, &event);
        XFlush(m_display);
    }

    Display* m_display;
    Window m_target;
    Window m_window = 0;
    std::string m_uris;
    int m_x;
    int m_y;
    bool m_isDropped = false;
    bool m_isTaken = false;
};

} // namespace

void dragFilesTo(unsigned long window, const std::vector<std::filesystem::path>& files, int x, int y)
{
    std::string uris;
    for (const std::filesystem::path& file : files)
        uris += "file://" + file.string() + "\r\n";
    DragSource(window, uris, x, y).drop();
}

} // namespace cadrel::tests
