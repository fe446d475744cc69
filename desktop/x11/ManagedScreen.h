// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/plugin/XConnection.h"

#include <optional>

namespace desktop {

/// What the window manager tells of the screen and does for the windows on it, by the hints that desktops agree on (EWMH).
class ManagedScreen {
public:
    using Window = cadrel::host::XConnection::Window;

    /// Physical pixels.
    struct Area {
        int x = 0;
        int y = 0;
        int width = 0;
        int height = 0;

        bool operator==(const Area&) const = default;
    };
    enum class Extent {
        Own,       ///< the size that the user has given it
        Maximised, ///< in both directions
        Other,     ///< in one direction, or over the whole screen
    };

    bool hasManager() const;
    /// The part of the present desktop that no panels take. Nothing where that isn't told.
    std::optional<Area> workArea() const;
    Extent extentOf(Window window) const;
    /// Whether no window has the keyboard, although this one is the active one. Without a window manager every window is.
    bool hasLostKeyboard(Window window) const;
    /// Has a window come up maximised that isn't on the screen yet.
    void startMaximised(Window window) const;

private:
    cadrel::host::XConnection m_connection;
};

} // namespace desktop
