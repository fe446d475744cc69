// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/plugin/XConnection.h"

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

namespace desktop {

/// A window of ours inside another one, for the view of a module. It has a connection of its own to the X server. Places and sizes
/// are physical pixels.
class XContainer {
public:
    using Window = cadrel::host::XConnection::Window;

    struct Place {
        int x = 0;
        int y = 0;
        int width = 1;
        int height = 1;

        bool operator==(const Place&) const = default;
    };
    /// What it shows, as 0xRRGGBB, line by line.
    struct Picture {
        int width = 0;
        int height = 0;
        std::vector<std::uint32_t> pixels;
    };

    /// A key that the view hasn't used, by the symbol that it has without Shift and Control.
    struct Key {
        unsigned long symbol = 0;
        char character = 0; ///< of ASCII; 0 for none
        bool hasShift = false;
        bool hasControl = false;
        bool hasAlt = false;
    };
    std::function<void(const Key& key)> onKey;

    /// Not yet visible.
    explicit XContainer(Window around);
    XContainer(const XContainer&) = delete;
    XContainer& operator=(const XContainer&) = delete;
    ~XContainer();

    /// False without a server; nothing else may be called then.
    bool isThere() const { return m_window != 0; }
    Window window() const { return m_window; }
    /// Readable when serve() has something to do.
    int descriptor() const;
    void serve();

    /// Whether it had been elsewhere or had another size.
    bool moveTo(const Place& place);
    void show();
    void hide();
    /// Of the part that is on the screen; nothing while it isn't shown.
    std::optional<Picture> picture() const;

    /// Drops files on the view, as if the user had dragged them there from another program. The place is in this window.
    void drop(const std::vector<std::string>& files, int x, int y);

    /// Whether the keyboard is in it or in what it holds.
    bool hasKeyboard() const;
    /// Gives the keyboard to the window around it.
    void giveKeyboardAway();

private:
    cadrel::host::XConnection m_connection;
    Window m_around;
    Window m_window = 0;
    Place m_place;
    std::string m_dropped; ///< what the view asks for: a line for each file
    bool m_isShown = false;
};

} // namespace desktop
