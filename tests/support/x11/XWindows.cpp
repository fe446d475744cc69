// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/x11/XWindows.h"

#include "velmark/PlugView.h"

#include <X11/Xlib.h>
#include <X11/Xutil.h>
#include <png.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <stdexcept>

namespace cadrel::tests {

namespace {

/// Xlib makes a new text for each keysym that is the number of a character, which nobody can give back.
std::string nameOf(KeySym symbol)
{
    constexpr KeySym Unicode = 0x01000000;
    if ((symbol & 0xff000000) == Unicode)
        return "character " + std::to_string(symbol - Unicode);
    const char* const name = XKeysymToString(symbol);
    return name ? name : "key " + std::to_string(symbol);
}

Window windowOf(standin::NativeWindow& window)
{
    return static_cast<Window>(reinterpret_cast<std::uintptr_t>(window.parent()));
}

} // namespace

class XWindows::XWindow : public standin::NativeWindow {
public:
    XWindow(XWindows& owner, const std::string& title, int width, int height, Listener& listener)
        : m_owner(owner), m_listener(listener)
    {
        Display* const display = m_owner.m_display;
        m_window = XCreateSimpleWindow(display, DefaultRootWindow(display), 40, 30, static_cast<unsigned>(width),
                                       static_cast<unsigned>(height), 0, 0, 0);
        XStoreName(display, m_window, title.c_str());
        XSelectInput(display, m_window, StructureNotifyMask | FocusChangeMask | KeyPressMask | KeyReleaseMask);
        m_owner.m_windows[m_window] = this;
        XSync(display, False);
    }
    ~XWindow() override
    {
        m_owner.m_windows.erase(m_window);
        if (m_isThere)
            XDestroyWindow(m_owner.m_display, m_window);
        XSync(m_owner.m_display, False);
    }

    void* parent() override { return reinterpret_cast<void*>(static_cast<std::uintptr_t>(m_window)); }
    void setSize(std::int32_t width, std::int32_t height) override
    {
        XResizeWindow(m_owner.m_display, m_window, static_cast<unsigned>(width), static_cast<unsigned>(height));
        XSync(m_owner.m_display, False);
    }
    void show() override
    {
        XMapRaised(m_owner.m_display, m_window);
        XSync(m_owner.m_display, False);
    }

    void tell(const XEvent& event)
    {
        switch (event.type) {
        case ConfigureNotify:
            if (event.xconfigure.width == m_width && event.xconfigure.height == m_height)
                break;
            m_width = event.xconfigure.width;
            m_height = event.xconfigure.height;
            m_listener.resizedByUser(m_width, m_height);
            break;
        case FocusIn:
        case FocusOut:
            if (event.xfocus.detail != NotifyInferior)
                m_listener.focusChanged(event.type == FocusIn);
            break;
        case KeyPress:
        case KeyRelease: {
            XKeyEvent key = event.xkey;
            KeySym symbol = NoSymbol;
            XLookupString(&key, nullptr, 0, &symbol, nullptr);
            m_owner.m_keyEvents.push_back((event.type == KeyPress ? "press " : "release ") + nameOf(symbol));
            if (event.type == KeyPress)
                m_owner.m_keys.push_back(XLookupKeysym(&key, 0));
            break;
        }
        case DestroyNotify:
            m_isThere = m_isThere && event.xdestroywindow.window != m_window;
            break;
        default:
            break;
        }
    }

private:
    XWindows& m_owner;
    Listener& m_listener;
    Window m_window;
    int m_width = 0;
    int m_height = 0;
    bool m_isThere = true;
};

XWindows::XWindows() : m_display(XOpenDisplay(nullptr))
{
    if (!m_display)
        throw std::runtime_error("no display");
}

XWindows::~XWindows()
{
    XCloseDisplay(m_display);
}

const char* XWindows::parentType() const
{
    return Velmark::ParentType::X11Window;
}

std::unique_ptr<standin::NativeWindow> XWindows::createWindow(const std::string& title, std::int32_t width,
                                                              std::int32_t height,
                                                              standin::NativeWindow::Listener& listener)
{
    return std::make_unique<XWindow>(*this, title, width, height, listener);
}

void XWindows::serve()
{
    while (XPending(m_display) > 0) {
        XEvent event;
        XNextEvent(m_display, &event);
        const auto window = m_windows.find(event.xany.window);
        if (window != m_windows.end())
            window->second->tell(event);
    }
}

void XWindows::destroy(standin::NativeWindow& window)
{
    XDestroyWindow(m_display, windowOf(window));
    XSync(m_display, False);
}

unsigned long XWindows::colourAt(int x, int y) const
{
    XImage* const image = XGetImage(m_display, DefaultRootWindow(m_display), x, y, 1, 1, AllPlanes, ZPixmap);
    const unsigned long colour = XGetPixel(image, 0, 0) & 0xffffffUL;
    XDestroyImage(image);
    return colour;
}

int XWindows::windowCount() const
{
    Window root = 0;
    Window parent = 0;
    Window* windows = nullptr;
    unsigned count = 0;
    XQueryTree(m_display, DefaultRootWindow(m_display), &root, &parent, &windows, &count);
    const auto isShown = [this](Window window) {
        XWindowAttributes attributes;
        return XGetWindowAttributes(m_display, window, &attributes) != 0 && attributes.map_state == IsViewable;
    };
    const auto shown = std::count_if(windows, windows + count, isShown);
    if (windows)
        XFree(windows);
    return static_cast<int>(shown);
}

/// Of the screen, so that menus are in it.
class XWindows::Picture {
public:
    Picture(Display* display, Window window)
    {
        XWindowAttributes place;
        XGetWindowAttributes(display, window, &place);
        const Window screen = DefaultRootWindow(display);
        Window child = 0;
        XTranslateCoordinates(display, window, screen, 0, 0, &place.x, &place.y, &child);
        m_image = XGetImage(display, screen, place.x, place.y, static_cast<unsigned>(place.width),
                            static_cast<unsigned>(place.height), AllPlanes, ZPixmap);
        if (!m_image)
            throw std::runtime_error("the window isn't on the screen");
    }
    Picture(const Picture&) = delete;
    Picture& operator=(const Picture&) = delete;
    ~Picture() { XDestroyImage(m_image); }

    int width() const { return m_image->width; }
    int height() const { return m_image->height; }
    std::vector<char> bytes() const
    {
        return {m_image->data, m_image->data + std::ptrdiff_t{m_image->bytes_per_line} * m_image->height};
    }
    /// Red, green and blue of each pixel, line by line.
    std::vector<std::uint8_t> colours() const
    {
        std::vector<std::uint8_t> colours;
        for (int y = 0; y < height(); ++y) {
            for (int x = 0; x < width(); ++x) {
                const unsigned long colour = XGetPixel(m_image, x, y);
                for (const int shift : {16, 8, 0})
                    colours.push_back(static_cast<std::uint8_t>(colour >> shift));
            }
        }
        return colours;
    }

private:
    XImage* m_image;
};

std::vector<char> XWindows::pixelsOf(standin::NativeWindow& window) const
{
    return pixelsOf(windowOf(window));
}

std::vector<char> XWindows::pixelsOf(unsigned long window) const
{
    return Picture(m_display, window).bytes();
}

void XWindows::writePicture(standin::NativeWindow& window, const std::filesystem::path& file) const
{
    writePicture(windowOf(window), file);
}

void XWindows::writePicture(unsigned long window, const std::filesystem::path& file) const
{
    const Picture picture(m_display, window);
    const std::vector<std::uint8_t> colours = picture.colours();
    png_image header{};
    header.version = PNG_IMAGE_VERSION;
    header.width = static_cast<png_uint_32>(picture.width());
    header.height = static_cast<png_uint_32>(picture.height());
    header.format = PNG_FORMAT_RGB;
    if (png_image_write_to_file(&header, file.c_str(), 0, colours.data(), 0, nullptr) == 0)
        throw std::runtime_error("can't write " + file.string());
}

} // namespace cadrel::tests
