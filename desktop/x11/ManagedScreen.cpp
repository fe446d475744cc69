// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/x11/ManagedScreen.h"

#include "desktop/x11/WindowProperties.h"

#include <X11/Xatom.h>
#include <X11/Xlib.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <vector>

namespace desktop {

namespace {

constexpr const char* State = "_NET_WM_STATE";
constexpr const char* MaximisedWidth = "_NET_WM_STATE_MAXIMIZED_HORZ";
constexpr const char* MaximisedHeight = "_NET_WM_STATE_MAXIMIZED_VERT";
constexpr const char* WholeScreen = "_NET_WM_STATE_FULLSCREEN";

} // namespace

bool ManagedScreen::hasManager() const
{
    constexpr const char* Check = "_NET_SUPPORTING_WM_CHECK";
    Display* const display = m_connection.display();
    if (!display)
        return false;
    const auto told = numbersOf(display, DefaultRootWindow(display), Check, XA_WINDOW);
    // One that has ended leaves its word, but not its window.
    return !told.empty() && numbersOf(display, told.front(), Check, XA_WINDOW) == told;
}

std::optional<ManagedScreen::Area> ManagedScreen::workArea() const
{
    constexpr std::size_t NumbersOfArea = 4;
    constexpr unsigned long Largest = 1UL << 15U;
    if (!hasManager())
        return std::nullopt;
    Display* const display = m_connection.display();
    const auto root = DefaultRootWindow(display);
    const auto areas = numbersOf(display, root, "_NET_WORKAREA", XA_CARDINAL);
    const auto present = numbersOf(display, root, "_NET_CURRENT_DESKTOP", XA_CARDINAL);
    const std::size_t first = present.empty() ? 0 : present.front() * NumbersOfArea;
    if (present.size() > 1 || first >= areas.size() || areas.size() - first < NumbersOfArea)
        return std::nullopt;
    const auto at = [&](std::size_t index) { return static_cast<int>(std::min(areas[first + index], Largest)); };
    const Area area{at(0), at(1), at(2), at(3)};
    return area.width > 0 && area.height > 0 ? std::optional(area) : std::nullopt;
}

ManagedScreen::Extent ManagedScreen::extentOf(Window window) const
{
    Display* const display = m_connection.display();
    if (!display || !hasManager())
        return Extent::Own;
    const auto states = numbersOf(display, window, State, XA_ATOM);
    const auto has = [&](const char* name) { return std::ranges::count(states, atomOf(display, name)) > 0; };
    const bool isWide = has(MaximisedWidth);
    const bool isHigh = has(MaximisedHeight);
    if (has(WholeScreen) || isWide != isHigh)
        return Extent::Other;
    return isWide ? Extent::Maximised : Extent::Own;
}

bool ManagedScreen::hasLostKeyboard(Window window) const
{
    Display* const display = m_connection.display();
    if (!display)
        return false;
    Window focused = 0;
    int revert = 0;
    XGetInputFocus(display, &focused, &revert);
    const auto root = DefaultRootWindow(display);
    if (focused != None && focused != PointerRoot && focused != root)
        return false;
    return !hasManager() || numbersOf(display, root, "_NET_ACTIVE_WINDOW", XA_WINDOW) == std::vector{window};
}

void ManagedScreen::startMaximised(Window window) const
{
    Display* const display = m_connection.display();
    if (!display)
        return;
    const std::array<Atom, 2> states{atomOf(display, MaximisedWidth), atomOf(display, MaximisedHeight)};
    XChangeProperty(display, window, atomOf(display, State), XA_ATOM, 32, PropModeAppend,
                    reinterpret_cast<const unsigned char*>(states.data()), static_cast<int>(states.size()));
    XSync(display, False);
}

} // namespace desktop
