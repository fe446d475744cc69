// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

#include <sys/types.h>

namespace cadrel::tests {

/// This process sees no X server, even where there is one by chance.
class NoScreen {
public:
    NoScreen();
};

/// An X server of its own for one test, without a window manager, with a screen of 1600 x 1000 unless told otherwise. While
/// it lives, the environment names it as the display of this process. Without one, the process sees no server at all.
class VirtualScreen {
public:
    /// Throws std::runtime_error when the server doesn't start.
    explicit VirtualScreen(int width = 1600, int height = 1000);
    VirtualScreen(const VirtualScreen&) = delete;
    VirtualScreen& operator=(const VirtualScreen&) = delete;
    ~VirtualScreen();

    /// Makes the names known that a window manager would.
    void introduceNames();
    /// What the user has set as dots per inch for all programs; any text, as a user may have written it.
    void setDpi(const std::string& dpi);

private:
    pid_t m_server = 0;
};

} // namespace cadrel::tests
