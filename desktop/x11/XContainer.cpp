// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/x11/XContainer.h"

#include "desktop/x11/WindowProperties.h"

#include <X11/Xatom.h>
#include <X11/Xlib.h>
#include <X11/Xutil.h>

#include <algorithm>
#include <array>
#include <string_view>

namespace desktop {

namespace {

/// A black frame around content that comes a moment later would flash.
constexpr unsigned long Background = 0x22292b;

bool isWithin(Display* display, Window window, Window container)
{
    while (window != container && window > PointerRoot) {
        Window root = 0;
        Window parent = 0;
        Window* children = nullptr;
        unsigned count = 0;
        if (XQueryTree(display, window, &root, &parent, &children, &count) == 0)
            return false;
        if (children)
            XFree(children);
        window = parent;
    }
    return window == container;
}

XContainer::Key keyOf(XKeyEvent event)
{
    XContainer::Key key;
    key.hasShift = (event.state & ShiftMask) != 0;
    key.hasControl = (event.state & ControlMask) != 0;
    key.hasAlt = (event.state & Mod1Mask) != 0;
    key.symbol = XLookupKeysym(&event, 0);
    event.state &= ~static_cast<unsigned>(ControlMask);
    char text[8] = {};
    KeySym ignored = NoSymbol;
    const bool isPrintable =
        XLookupString(&event, text, sizeof text, &ignored, nullptr) == 1 && text[0] >= ' ' && text[0] <= '~';
    key.character = isPrintable ? text[0] : '\0';
    return key;
}

constexpr const char* UriList = "text/uri-list";

/// With every byte in its number that has a meaning of its own there.
std::string uriOf(const std::string& file)
{
    constexpr std::string_view Plain = "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789-._~/";
    constexpr std::string_view Digits = "0123456789ABCDEF";
    std::string uri = "file://";
    for (const char each : file) {
        const auto byte = static_cast<unsigned char>(each);
        if (Plain.find(each) != std::string_view::npos)
            uri += each;
        else
            uri.append("%").append(1, Digits[byte >> 4U]).append(1, Digits[byte & 15U]);
    }
    return uri;
}

Window firstChildOf(Display* display, Window window)
{
    Window root = 0;
    Window parent = 0;
    Window* children = nullptr;
    unsigned count = 0;
    if (XQueryTree(display, window, &root, &parent, &children, &count) == 0)
        return 0;
    const Window first = count > 0 ? children[0] : 0;
    if (children)
        XFree(children);
    return first;
}

/// Of the protocol for dragging between programs: the highest that the window and we have in common; 0 when it takes nothing.
long dragVersionOf(Display* display, Window window)
{
    constexpr unsigned long Ours = 5;
    const auto theirs = numbersOf(display, window, "XdndAware", XA_ATOM);
    return theirs.empty() ? 0 : static_cast<long>(std::min(theirs.front(), Ours));
}

/// A message of the protocol for dragging between programs.
void tell(Display* display, Window window, const char* message, const std::array<long, 5>& data)
{
    XEvent event = {};
    event.xclient.type = ClientMessage;
    event.xclient.window = window;
    event.xclient.message_type = atomOf(display, message);
    event.xclient.format = 32;
    std::copy(data.begin(), data.end(), event.xclient.data.l);
    XSendEvent(display, window, False, NoEventMask, &event);
}

void answer(Display* display, const XSelectionRequestEvent& request, const std::string& text)
{
    XEvent event = {};
    event.xselection.type = SelectionNotify;
    event.xselection.requestor = request.requestor;
    event.xselection.selection = request.selection;
    event.xselection.target = request.target;
    event.xselection.time = request.time;
    if (request.target == atomOf(display, UriList)) {
        event.xselection.property = request.property;
        XChangeProperty(display, request.requestor, request.property, request.target, 8, PropModeReplace,
                        reinterpret_cast<const unsigned char*>(text.data()), static_cast<int>(text.size()));
    }
    XSendEvent(display, request.requestor, False, NoEventMask, &event);
    XFlush(display);
}

} // namespace

XContainer::XContainer(Window around) : m_around(around)
{
    Display* const display = m_connection.display();
    if (!display || around == 0)
        return;
    m_window = XCreateSimpleWindow(display, around, 0, 0, 1, 1, 0, 0, Background);
    XSelectInput(display, m_window, KeyPressMask);
    XSync(display, False);
}

XContainer::~XContainer()
{
    if (!m_window)
        return;
    if (hasKeyboard())
        giveKeyboardAway();
    XDestroyWindow(m_connection.display(), m_window);
    XSync(m_connection.display(), False);
}

int XContainer::descriptor() const
{
    return ConnectionNumber(m_connection.display());
}

void XContainer::serve()
{
    Display* const display = m_connection.display();
    while (XPending(display) > 0) {
        XEvent event;
        XNextEvent(display, &event);
        if (event.type == MappingNotify)
            XRefreshKeyboardMapping(&event.xmapping);
        if (event.type == SelectionRequest)
            answer(display, event.xselectionrequest, m_dropped);
        if (event.type == KeyPress && onKey)
            onKey(keyOf(event.xkey));
    }
}

bool XContainer::moveTo(const Place& place)
{
    if (place == m_place)
        return false;
    m_place = place;
    XMoveResizeWindow(m_connection.display(), m_window, place.x, place.y,
                      static_cast<unsigned>(std::max(place.width, 1)),
                      static_cast<unsigned>(std::max(place.height, 1)));
    XSync(m_connection.display(), False);
    return true;
}

void XContainer::show()
{
    m_isShown = true;
    XMapRaised(m_connection.display(), m_window);
    XSync(m_connection.display(), False);
}

void XContainer::hide()
{
    if (hasKeyboard())
        giveKeyboardAway();
    m_isShown = false;
    XUnmapWindow(m_connection.display(), m_window);
    XSync(m_connection.display(), False);
}

std::optional<XContainer::Picture> XContainer::picture() const
{
    Display* const display = m_connection.display();
    XWindowAttributes attributes;
    if (!m_isShown || XGetWindowAttributes(display, m_window, &attributes) == 0 || attributes.map_state != IsViewable)
        return std::nullopt;
    Window child = 0;
    int left = 0;
    int top = 0;
    XTranslateCoordinates(display, m_window, attributes.root, 0, 0, &left, &top, &child);
    const int firstX = std::max(0, -left);
    const int firstY = std::max(0, -top);
    const int lastX = std::min(attributes.width, WidthOfScreen(attributes.screen) - left);
    const int lastY = std::min(attributes.height, HeightOfScreen(attributes.screen) - top);
    if (firstX >= lastX || firstY >= lastY)
        return std::nullopt;
    XImage* const image = XGetImage(display, m_window, firstX, firstY, static_cast<unsigned>(lastX - firstX),
                                    static_cast<unsigned>(lastY - firstY), AllPlanes, ZPixmap);
    if (!image)
        return std::nullopt;
    Picture picture{attributes.width, attributes.height, {}};
    picture.pixels.assign(static_cast<std::size_t>(picture.width) * static_cast<std::size_t>(picture.height),
                          static_cast<std::uint32_t>(Background));
    for (int y = firstY; y < lastY; ++y) {
        for (int x = firstX; x < lastX; ++x)
            picture.pixels[static_cast<std::size_t>(y) * static_cast<std::size_t>(picture.width) +
                           static_cast<std::size_t>(x)] =
                static_cast<std::uint32_t>(XGetPixel(image, x - firstX, y - firstY) & 0xffffffUL);
    }
    XDestroyImage(image);
    return picture;
}

void XContainer::drop(const std::vector<std::string>& files, int x, int y)
{
    Display* const display = m_connection.display();
    const Window view = firstChildOf(display, m_window);
    const long version = view != 0 ? dragVersionOf(display, view) : 0;
    if (version == 0)
        return;
    m_dropped.clear();
    for (const std::string& file : files)
        m_dropped += uriOf(file) + "\r\n";
    int left = 0;
    int top = 0;
    Window child = 0;
    XTranslateCoordinates(display, m_window, DefaultRootWindow(display), x, y, &left, &top, &child);
    XSetSelectionOwner(display, atomOf(display, "XdndSelection"), m_window, CurrentTime);
    const long copy = static_cast<long>(atomOf(display, "XdndActionCopy"));
    tell(display, view, "XdndEnter",
         {static_cast<long>(m_window), version << 24, static_cast<long>(atomOf(display, UriList)), 0, 0});
    tell(display, view, "XdndPosition",
         {static_cast<long>(m_window), 0, (static_cast<long>(left) << 16) | top, CurrentTime, copy});
    tell(display, view, "XdndDrop", {static_cast<long>(m_window), 0, CurrentTime, 0, 0});
    XFlush(display);
}

bool XContainer::hasKeyboard() const
{
    Window focused = 0;
    int revert = 0;
    XGetInputFocus(m_connection.display(), &focused, &revert);
    return isWithin(m_connection.display(), focused, m_window);
}

void XContainer::giveKeyboardAway()
{
    XSetInputFocus(m_connection.display(), m_around, RevertToParent, CurrentTime);
    XSync(m_connection.display(), False);
}

} // namespace desktop
